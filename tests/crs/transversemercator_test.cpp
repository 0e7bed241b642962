#include <oecore/config/configuration.h>
#include <oecore/core/exception.h>
#include <oecore/crs/projections/transversemercator.h>

#include <gtest/gtest.h>

#include <cstdio>
#include <sstream>

#include "../errortext.h"
#include "../runtimescope.h"
#include "projectiontest.h"
#include "referencetool.h"

namespace {

class TransverseMercator : public RuntimeScope {};

// GeographicLib's exact Transverse Mercator: x, y from the central meridian
// and the equator.
std::vector<OmbPoint> exactTM(double centralLongitude, double k0, const OmbProjCachedNumbers& ellipsoid,
                              const std::vector<OmbPoint>& points) {
    std::vector<std::string> lines;
    char line[96];
    for (const OmbPoint& p : points) {
        std::snprintf(line, sizeof line, "%.12f %.12f", p.y, p.x);
        lines.push_back(line);
    }
    char command[128];
    std::snprintf(command, sizeof command, "TransverseMercatorProj -p 6 -k %.12g -l %.12g -e %.17g %.17g", k0,
                  centralLongitude, ellipsoid.a, ellipsoid.f);
    std::vector<OmbPoint> out;
    for (const std::string& row : runReferenceTool(command, lines)) {
        std::istringstream fields(row);
        OmbPoint p;
        if (fields >> p.x >> p.y) out.push_back(p);
    }
    EXPECT_EQ(out.size(), points.size()) << "TransverseMercatorProj (geographiclib-tools) is needed";
    return out;
}

// The largest distance in metres from the exact method, whose origin is
// moved to the projection's false origin at its central latitude.
double worstAgainstExact(const BoundProjection& tm, std::vector<OmbPoint> points) {
    const OmbProjection& p = *tm.projection;
    points.emplace_back(p.centralLongitude(), p.centralLatitude());
    auto expected = exactTM(p.centralLongitude(), p.scaleFactor(), *tm.cached, points);
    if (expected.size() != points.size()) return HUGE_VAL;
    const OmbPoint origin = expected.back();
    const double unit = p.metersPerProjUnit();
    double worst = 0;
    for (std::size_t i = 0; i + 1 < points.size(); ++i) {
        const OmbPoint q = tm.project(points[i]);
        worst = std::max(worst, std::hypot((q.x - p.falseEasting()) * unit - (expected[i].x - origin.x),
                                           (q.y - p.falseNorthing()) * unit - (expected[i].y - origin.y)));
    }
    return worst;
}

// Points outside the classic series' zone whose angular distance from the
// central meridian's great circle lies in [from, to) degrees.
std::vector<OmbPoint> pointsAtDistance(double centralLongitude, double from, double to) {
    std::vector<OmbPoint> points;
    for (const OmbPoint& p : randomPoints(35, 40000, centralLongitude - 89, centralLongitude + 89, -89, 89)) {
        const double distance = std::asin(std::cos(p.y * M_PI / 180) * std::sin((p.x - centralLongitude) * M_PI / 180));
        const double degrees = std::fabs(distance) * 180 / M_PI;
        const bool classic = std::fabs(p.x - centralLongitude) <= 6.18 + 1.69e-5 * std::fabs(p.y * p.y * p.y);
        if (!classic && degrees >= from && degrees < to) points.push_back(p);
    }
    return points;
}

}  // namespace

TEST_F(TransverseMercator, WithinSixDegreesOfTheCentralMeridianItIsWithinAMillimetreOfTheExactMethod) {
    BoundProjection utm(OmbProjection::utm(33, OmbUTMHemisphere::North));
    EXPECT_LT(worstAgainstExact(utm, randomPoints(33, 3000, 9, 21, -80, 84)), 0.001);
    // A central latitude and false origin in feet, on another ellipsoid:
    // both series must place the origin alike.
    OmbRef<OmbGeodeticDatum> airy(
        new OmbGeodeticDatum(OmbEllipsoid::airy1830(), OmbPrimeMeridian::greenwich(), OmbRef<OmbDatumShift>()));
    BoundProjection national(OmbRef<OmbProjection>(new OmbTransverseMercator(-2, 49, 400000 / 0.3048, -100000 / 0.3048,
                                                                             0.9996012717, OmbLengthUnit::foot())),
                             airy);
    EXPECT_LT(worstAgainstExact(national, randomPoints(27700, 2000, -8, 4, 40, 62)), 0.001);
    EXPECT_LT(worstAgainstExact(national, randomPoints(27701, 2000, 10, 30, 40, 62)), 0.001);
}

TEST_F(TransverseMercator, FartherOutTheExtendedSeriesKeepsItsAccuracyUntilTheCorrectionFades) {
    // Measured worst differences from the exact method by angular distance
    // from the central meridian: 9 micrometres up to 30 degrees, 0.06 mm to
    // 40, 0.6 mm to 50, 11 mm to 60; beyond 65 degrees the correction fades.
    BoundProjection utm(OmbProjection::utm(33, OmbUTMHemisphere::North));
    EXPECT_LT(worstAgainstExact(utm, pointsAtDistance(15, 6, 30)), 2e-5);
    EXPECT_LT(worstAgainstExact(utm, pointsAtDistance(15, 30, 50)), 1e-3);
    EXPECT_LT(worstAgainstExact(utm, pointsAtDistance(15, 50, 60)), 0.02);
}

TEST_F(TransverseMercator, ProjectThenUnprojectReturnsEveryPointOfTheWorld) {
    BoundProjection utm(OmbProjection::utm(33, OmbUTMHemisphere::South));
    EXPECT_LT(utm.worstRoundTrip(randomPoints(1, 20000, -180, 180, -89.999, 89.999)), 1e-9);
    // The classic series' zone reaches past 6 degrees at high latitudes.
    EXPECT_LT(utm.worstRoundTrip(randomPoints(2, 5000, 0, 30, 55, 85)), 1e-9);
    // Opposite the central meridian and on the singular points of the
    // equator the compression keeps the results finite.
    for (const OmbPoint p :
         {OmbPoint(-165, 0), OmbPoint(105, 0), OmbPoint(-75, 0), OmbPoint(15, 90), OmbPoint(-165, -90)}) {
        const OmbPoint q = utm.project(p);
        EXPECT_TRUE(std::isfinite(q.x) && std::isfinite(q.y)) << p.x << " " << p.y;
        const OmbPoint back = utm.unproject(q);
        EXPECT_NEAR(back.y, p.y, 1e-6) << p.x;
    }
}

TEST_F(TransverseMercator, TheSeriesMeetWithoutAStepWhereOneHandsOverToTheOther) {
    // 6.18 degrees from the central meridian at the equator, where the
    // classic series gives way to the extended one, they differ by the
    // classic series' error; with a central latitude the false northing
    // must be applied alike by both.
    OmbRef<OmbProjection> tm(new OmbTransverseMercator(10, 52, 0, 0, 1.0));
    BoundProjection bound(tm);
    for (double lat : {0.0, 30.0, 52.0, -60.0}) {
        const double edge = 6.18 + 1.69e-5 * std::fabs(lat * lat * lat);
        const OmbPoint inside = bound.project({10 + edge - 1e-9, lat});
        const OmbPoint outside = bound.project({10 + edge + 1e-9, lat});
        EXPECT_LT(inside.distanceTo(outside), 0.002) << lat;
    }
}

TEST_F(TransverseMercator, UtmZonesAndTheirErrors) {
    const OmbRef<OmbProjection> south = OmbProjection::utm(33, OmbUTMHemisphere::South);
    EXPECT_EQ(south->name(), OmbString("Utm33S"));
    EXPECT_EQ(south->centralLongitude(), 15);
    EXPECT_EQ(south->falseNorthing(), 10000000);
    EXPECT_EQ(south->scaleFactor(), 0.9996);
    EXPECT_EQ(south.get(), OmbProjection::utm(33, OmbUTMHemisphere::South).get());
    EXPECT_TRUE(*south == OmbUTM(33, OmbUTMHemisphere::South));
    EXPECT_FALSE(*south == *OmbProjection::utm(33, OmbUTMHemisphere::North));
    BoundProjection bound(south);
    const OmbPoint equator = bound.project({15, 0});
    EXPECT_NEAR(equator.x, 500000, 1e-6);
    EXPECT_NEAR(equator.y, 10000000, 1e-6);
    EXPECT_EQ(errorOf([] { OmbProjection::utm(61, OmbUTMHemisphere::North); }),
              "Value \"zone\" is out of range in utm( zone, hemisphere), should be 1, 2, 3, ..., or 60.");
    EXPECT_EQ(errorOf([] { OmbUTM(0); }),
              "Value \"zone\" is out of range in utm( zone, hemisphere), should be 1, 2, 3, ..., or 60.");
    // Read from a configuration, the error names the element's place.
    EXPECT_EQ(errorOf([] {
                  OmbXmlParser::loadString(OmbString("<Configuration Namespace='U'>\n  <UtmProjection Zone='61'/>"
                                                     "</Configuration>"),
                                           {}, OmbDataSetInitialization::Delayed, {});
              }),
              "Value \"zone\" is out of range in utm( zone, hemisphere), should be 1, 2, 3, ..., or 60. Row 2, "
              "Column 3.");
}
