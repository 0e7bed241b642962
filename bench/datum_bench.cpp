// Datum changes of a million points, OSGB 36 to WGS 84 by a seven-parameter
// Helmert shift, against PROJ's proj_trans_generic on the same points.
#include <oecore/core/runtime.h>
#include <oecore/crs/geodeticdatum.h>

#include <proj.h>

#include <random>
#include <vector>

#include "ratioreporter.h"

namespace {

constexpr std::size_t pointCount = 1'000'000;

OmbPointArray greatBritain() {
    std::mt19937 random(36);
    std::uniform_real_distribution<double> lon(-6, 2), lat(50, 58), h(0, 500);
    OmbPointArray points;
    points.reserve(pointCount);
    for (std::size_t i = 0; i < pointCount; ++i) points.push_back({lon(random), lat(random), h(random)});
    return points;
}

void BM_OECoreHelmert(benchmark::State& state) {
    OmbHelmertDatumShift::Parameters p;
    p.dx = 446.448, p.dy = -125.157, p.dz = 542.06;
    p.rx = 0.15, p.ry = 0.247, p.rz = 0.842;
    p.scaleDifference = -20.489;
    OmbRef<OmbHelmertDatumShift> shift(new OmbHelmertDatumShift);
    shift->parameters(p);
    const OmbGeodeticDatum osgb36(OmbEllipsoid::airy1830(), OmbPrimeMeridian::greenwich(), shift);
    const OmbPointArray source = greatBritain();
    for (auto _ : state) {
        OmbPointArray points = source;
        osgb36.changeDatumTo(*OmbGeodeticDatum::wgs84(), points);
        benchmark::DoNotOptimize(points.data());
    }
    state.SetItemsProcessed(state.iterations() * static_cast<std::int64_t>(pointCount));
}
BENCHMARK(BM_OECoreHelmert)->Unit(benchmark::kMillisecond);

void BM_ProjHelmert(benchmark::State& state) {
    PJ_CONTEXT* context = proj_context_create();
    PJ* pipeline = proj_create(context,
                               "+proj=pipeline +step +proj=unitconvert +xy_in=deg +xy_out=rad"
                               " +step +proj=cart +ellps=airy"
                               " +step +proj=helmert +x=446.448 +y=-125.157 +z=542.06 +rx=0.15 +ry=0.247 +rz=0.842"
                               " +s=-20.489 +convention=position_vector"
                               " +step +inv +proj=cart +ellps=WGS84"
                               " +step +proj=unitconvert +xy_in=rad +xy_out=deg");
    const OmbPointArray source = greatBritain();
    for (auto _ : state) {
        std::vector<OmbPoint> points(source.begin(), source.end());
        const std::size_t stride = sizeof(OmbPoint);
        proj_trans_generic(pipeline, PJ_FWD, &points[0].x, stride, pointCount, &points[0].y, stride, pointCount,
                           &points[0].z, stride, pointCount, nullptr, 0, 0);
        benchmark::DoNotOptimize(points.data());
    }
    state.SetItemsProcessed(state.iterations() * static_cast<std::int64_t>(pointCount));
    proj_destroy(pipeline);
    proj_context_destroy(context);
}
BENCHMARK(BM_ProjHelmert)->Unit(benchmark::kMillisecond);

}  // namespace

int main(int argc, char** argv) {
    OmbRuntime::init();
    const int result = runWithRatios(argc, argv, {{"BM_OECoreHelmert", "BM_ProjHelmert"}});
    OmbRuntime::shutdown();
    return result;
}
