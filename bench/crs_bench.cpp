// A million points through datum shifts and projections, each against
// PROJ's proj_trans_generic on the same points: OSGB 36 to WGS 84 by a
// seven-parameter Helmert shift; WGS 84 to UTM zone 33 north; WGS 84 to web
// Mercator; and WGS 84 to the British National Grid (a Helmert shift to
// OSGB 36 followed by Transverse Mercator).
#include <oecore/core/runtime.h>
#include <oecore/crs/crs.h>
#include <oecore/crs/projections/transversemercator.h>

#include <proj.h>

#include <algorithm>
#include <functional>
#include <memory>
#include <random>
#include <string>
#include <vector>

#include "ratioreporter.h"

namespace {

constexpr std::size_t pointCount = 1'000'000;

OmbPointArray randomPoints(unsigned seed, double lon0, double lon1, double lat0, double lat1) {
    std::mt19937 random(seed);
    std::uniform_real_distribution<double> lon(lon0, lon1), lat(lat0, lat1), h(0, 500);
    OmbPointArray points;
    points.reserve(pointCount);
    for (std::size_t i = 0; i < pointCount; ++i) points.push_back({lon(random), lat(random), h(random)});
    return points;
}

const OmbPointArray& greatBritain() {
    static const OmbPointArray points = randomPoints(36, -6, 2, 50, 58);
    return points;
}

// Zone 33 from 80 south to 84 north.
const OmbPointArray& zone33() {
    static const OmbPointArray points = randomPoints(33, 12, 18, -80, 84);
    return points;
}

const OmbPointArray& world() {
    static const OmbPointArray points = randomPoints(3857, -180, 180, -85, 85);
    return points;
}

// OSGB 36 with its shift to WGS 84 (EPSG 1314, position vector).
OmbRef<OmbGeodeticDatum> osgb36() {
    OmbHelmertDatumShift::Parameters p;
    p.dx = 446.448, p.dy = -125.157, p.dz = 542.06;
    p.rx = 0.15, p.ry = 0.247, p.rz = 0.842;
    p.scaleDifference = -20.489;
    OmbRef<OmbHelmertDatumShift> shift(new OmbHelmertDatumShift);
    shift->parameters(p);
    return OmbRef<OmbGeodeticDatum>(
        new OmbGeodeticDatum(OmbEllipsoid::airy1830(), OmbPrimeMeridian::greenwich(), shift));
}

constexpr const char* osgbHelmert =
    "+proj=helmert +x=446.448 +y=-125.157 +z=542.06 +rx=0.15 +ry=0.247 +rz=0.842 +s=-20.489"
    " +convention=position_vector";

OmbRef<OmbProjection> britishNationalGrid() {
    return OmbRef<OmbProjection>(new OmbTransverseMercator(-2, 49, 400000, -100000, 0.9996012717));
}

// One comparison: OECore's conversion of the points, and PROJ's pipeline
// from degrees doing the same.
struct Case {
    const char* name;
    const OmbPointArray& source;
    std::function<void(OmbPointArray&)> convert;
    std::string pipeline;
    bool degreesIn = true;  // the pipeline starts by converting degrees
};

std::function<void(OmbPointArray&)> projecting(const OmbRef<OmbProjection>& projection,
                                               const OmbRef<OmbGeodeticDatum>& datum) {
    std::shared_ptr<OmbProjCachedNumbers> cached(projection->init(*datum));
    return [projection, cached](OmbPointArray& points) { projection->project(points, cached.get()); };
}

// British National Grid coordinates of the same points.
const OmbPointArray& nationalGrid() {
    static const OmbPointArray points = [] {
        OmbPointArray p = greatBritain();
        const std::unique_ptr<OmbProjCachedNumbers> cached(britishNationalGrid()->init(*osgb36()));
        britishNationalGrid()->project(p, cached.get());
        return p;
    }();
    return points;
}

std::vector<Case> cases() {
    const auto osgb = osgb36();
    const auto wgs84 = OmbGeodeticDatum::wgs84();
    const auto toGrid = projecting(britishNationalGrid(), osgb);
    const std::string cartesianHelmert = std::string("+step +proj=cart +ellps=airy +step ") + osgbHelmert;
    return {
        {"Helmert", greatBritain(), [=](OmbPointArray& points) { osgb->changeDatumTo(*wgs84, points); },
         cartesianHelmert + " +step +inv +proj=cart +ellps=WGS84 +step +proj=unitconvert +xy_in=rad +xy_out=deg"},
        {"Utm33", zone33(), projecting(OmbProjection::utm(33, OmbUTMHemisphere::North), wgs84),
         "+step +proj=utm +zone=33 +ellps=WGS84"},
        {"WebMercator", world(), projecting(OmbProjection::mercator1SPWeb(), wgs84),
         "+step +proj=webmerc +ellps=WGS84"},
        {"HelmertAndTM", greatBritain(),
         [=](OmbPointArray& points) {
             wgs84->changeDatumTo(*osgb, points);
             toGrid(points);
         },
         std::string("+step +proj=cart +ellps=WGS84 +step +inv ") + osgbHelmert +
             " +step +inv +proj=cart +ellps=airy"
             " +step +proj=tmerc +lat_0=49 +lon_0=-2 +k_0=0.9996012717 +x_0=400000 +y_0=-100000 +ellps=airy"},
        // Between two catalogue systems on different datums: EPSG 27700 to
        // UTM 30 north, through the catalogue's Helmert shift (EPSG 1314).
        {"CrsToCrs", nationalGrid(),
         [source = OmbCrs::fromAuthorityAndCode(OmbString("epsg"), OmbString("27700")),
          target = OmbCrs::wgs84Utm(30, OmbUTMHemisphere::North)](OmbPointArray& points) {
             source->projectTo(*target, points);
         },
         "+step +inv +proj=tmerc +lat_0=49 +lon_0=-2 +k_0=0.9996012717 +x_0=400000 +y_0=-100000 +ellps=airy "
         "+step +proj=cart +ellps=airy +step " +
             std::string(osgbHelmert) + " +step +inv +proj=cart +ellps=WGS84 +step +proj=utm +zone=30 +ellps=WGS84",
         false},
    };
}

PJ* createPipeline(PJ_CONTEXT* context, const Case& c) {
    const std::string units = c.degreesIn ? "+step +proj=unitconvert +xy_in=deg +xy_out=rad " : "";
    return proj_create(context, ("+proj=pipeline " + units + c.pipeline).c_str());
}

void transformWithProj(PJ* pj, std::vector<OmbPoint>& points) {
    const std::size_t stride = sizeof(OmbPoint), n = points.size();
    proj_trans_generic(pj, PJ_FWD, &points[0].x, stride, n, &points[0].y, stride, n, &points[0].z, stride, n, nullptr,
                       0, 0);
}

// Each iteration works on a fresh copy of the points, as PROJ's do.
void runOECore(benchmark::State& state, const Case& c) {
    for (auto _ : state) {
        OmbPointArray points = c.source;
        c.convert(points);
        benchmark::DoNotOptimize(points.data());
    }
    state.SetItemsProcessed(state.iterations() * static_cast<std::int64_t>(pointCount));
}

void runProj(benchmark::State& state, const Case& c) {
    PJ_CONTEXT* context = proj_context_create();
    PJ* pj = createPipeline(context, c);
    for (auto _ : state) {
        std::vector<OmbPoint> points(c.source.begin(), c.source.end());
        transformWithProj(pj, points);
        benchmark::DoNotOptimize(points.data());
    }
    state.SetItemsProcessed(state.iterations() * static_cast<std::int64_t>(pointCount));
    proj_destroy(pj);
    proj_context_destroy(context);
}

// The largest horizontal difference between the two results, over all
// points, so that the times compare equal work.
double worstDifference(const Case& c) {
    OmbPointArray ours = c.source;
    c.convert(ours);
    std::vector<OmbPoint> theirs(c.source.begin(), c.source.end());
    PJ_CONTEXT* context = proj_context_create();
    PJ* pj = createPipeline(context, c);
    transformWithProj(pj, theirs);
    proj_destroy(pj);
    proj_context_destroy(context);
    double worst = 0;
    for (std::size_t i = 0; i < theirs.size(); ++i) worst = std::max(worst, ours[i].distanceTo(theirs[i]));
    return worst;
}

}  // namespace

int main(int argc, char** argv) {
    OmbRuntime::init();
    BenchmarkPairs pairs;
    {
        const std::vector<Case> all = cases();
        for (const Case& c : all) {
            const std::string ours = std::string("OECore") + c.name, theirs = std::string("Proj") + c.name;
            benchmark::RegisterBenchmark(ours.c_str(), runOECore, c)->Unit(benchmark::kMillisecond);
            benchmark::RegisterBenchmark(theirs.c_str(), runProj, c)->Unit(benchmark::kMillisecond);
            pairs.emplace_back(ours, theirs);
        }
        const int result = runWithRatios(argc, argv, pairs);
        std::printf("\nlargest difference from PROJ (metres, or degrees for Helmert):\n");
        for (const Case& c : all) std::printf("  %-14s %.3g\n", c.name, worstDifference(c));
        if (result != 0) return result;
    }
    OmbRuntime::shutdown();
    return 0;
}
