#include <oecore/config/configuration.h>
#include <oecore/core/runtime.h>
#include <oecore/crs/ellipsoid.h>
#include <oecore/crs/primemeridian.h>

#include <gtest/gtest.h>

#include <cmath>
#include <cstdio>
#include <random>
#include <sstream>
#include <string>
#include <vector>

#include "../runtimescope.h"
#include "referencetool.h"

namespace {

class PredefinedObjects : public RuntimeScope {};

struct Point {
    double lon, lat, h;
};

// Runs GeographicLib's CartConvert (exact conversions on WGS 84) over the
// lines and returns its output lines.
std::vector<std::string> cartConvert(const std::vector<std::string>& lines, bool reverse) {
    return runReferenceTool(reverse ? "CartConvert -p 9 -r" : "CartConvert -p 9", lines);
}

std::vector<Point> randomPoints(int count) {
    std::mt19937 random(5301);
    std::uniform_real_distribution<double> lon(-180, 180), lat(-89.9, 89.9), h(-500, 9000);
    std::vector<Point> points;
    for (int i = 0; i < count; ++i) points.push_back({lon(random), lat(random), h(random)});
    return points;
}

}  // namespace

TEST_F(PredefinedObjects, EllipsoidsAndMeridiansAreRegisteredByName) {
    const OmbRef<OmbEllipsoid>& wgs84 = OmbEllipsoid::wgs84();
    ASSERT_TRUE(wgs84);
    EXPECT_EQ(OmbRuntime::getPredefinedObject(OmbString("Ellipsoids.Wgs84")).get(), wgs84.get());
    EXPECT_EQ(wgs84->authorityCode(), OmbString("7030"));
    EXPECT_EQ(wgs84->authority(), OmbString("epsg"));
    EXPECT_DOUBLE_EQ(wgs84->polarRadius(), 6356752.314245179);
    EXPECT_DOUBLE_EQ(wgs84->e2(), 0.0066943799901413165);
    EXPECT_EQ(OmbEllipsoid::besselNamibia()->authorityCode(), OmbString("7004"));
    EXPECT_EQ(OmbEllipsoid::pz90()->equatorialRadius(), 6378136.0);
    EXPECT_EQ(OmbRuntime::getPredefinedObject(OmbString("PrimeMeridians.Olso")).get(), OmbPrimeMeridian::oslo().get());
    EXPECT_FALSE(OmbRuntime::getPredefinedObject(OmbString("PrimeMeridians.Oslo")));
    EXPECT_DOUBLE_EQ(OmbPrimeMeridian::paris()->longitudeFromGreenwich(), 2.33722917);
    std::size_t ellipsoids = 0, meridians = 0;
    const auto names = OmbRuntime::predefinedObjects();
    for (const OmbString& name : *names) {
        ellipsoids += name.startsWith(OmbString("Ellipsoids."));
        meridians += name.startsWith(OmbString("PrimeMeridians."));
    }
    EXPECT_EQ(ellipsoids, 33u);
    EXPECT_EQ(meridians, 14u);
}

TEST_F(PredefinedObjects, EquivalenceAllowsAMillimetreAndTinyFlatteningDifferences) {
    EXPECT_TRUE(OmbEllipsoid::grs1980()->equivalent(*OmbEllipsoid::wgs84()));
    EXPECT_FALSE(OmbEllipsoid::international1924()->equivalent(*OmbEllipsoid::wgs84()));
    EXPECT_TRUE(OmbEllipsoid(6378137.0009, 298.257223563).equivalent(*OmbEllipsoid::wgs84()));
    EXPECT_FALSE(OmbEllipsoid(6378137.002, 298.257223563).equivalent(*OmbEllipsoid::wgs84()));
    EXPECT_TRUE(OmbEllipsoid(6371000, 0).equivalent(OmbEllipsoid(6371000, 0)));
    EXPECT_FALSE(OmbEllipsoid(6371000, 0).equivalent(OmbEllipsoid(6371000, 300)));
}

TEST(Ellipsoid, GeocentricConversionsAgreeWithGeographicLib) {
    const OmbEllipsoid wgs84;  // the default is WGS 84
    const std::vector<Point> points = randomPoints(2000);
    std::vector<std::string> lines;
    for (const Point& p : points) {
        char line[128];
        std::snprintf(line, sizeof line, "%.12f %.12f %.6f", p.lat, p.lon, p.h);
        lines.push_back(line);
    }
    const std::vector<std::string> exact = cartConvert(lines, false);
    ASSERT_EQ(exact.size(), points.size()) << "CartConvert (geographiclib-tools) is needed";
    double forward = 0, backward = 0, height = 0;
    for (std::size_t i = 0; i < points.size(); ++i) {
        double x = points[i].lon, y = points[i].lat, z = points[i].h;
        wgs84.geodeticToGeocentricXYZ(x, y, z);
        double ex, ey, ez;
        std::istringstream(exact[i]) >> ex >> ey >> ez;
        forward = std::max({forward, std::fabs(x - ex), std::fabs(y - ey), std::fabs(z - ez)});
        wgs84.geocentricXYZToGeodetic(x, y, z);
        backward = std::max({backward, std::fabs(x - points[i].lon), std::fabs(y - points[i].lat)});
        height = std::max(height, std::fabs(z - points[i].h));
    }
    EXPECT_LT(forward, 1e-6) << "metres";
    EXPECT_LT(backward, 1e-9) << "degrees, one Bowring step";
    EXPECT_LT(height, 1e-4) << "metres, one Bowring step";
}

TEST_F(PredefinedObjects, EllipsoidsReadAndWriteInConfigurations) {
    const auto c = OmbXmlParser::loadString(
        OmbString("<Configuration Namespace='D'>"
                  "<Ellipsoid Name='Local' Public='true' Authority='test' EquatorialRadius='6378000' "
                  "InverseFlattening='300'/>"
                  "<PrimeMeridian Name='M' Public='true' LongitudeFromGreenwich='-0.5'/>"
                  "<ResourceReference Name='W' Public='true' Predefined='true' Value='Ellipsoids.Wgs84'/>"
                  "</Configuration>"),
        {}, OmbDataSetInitialization::Delayed, {});
    const auto local = omb_dynamic_cast<OmbEllipsoid>(c->getPublicObject(OmbString("Local")));
    ASSERT_TRUE(local);
    EXPECT_DOUBLE_EQ(local->polarRadius(), 6378000.0 * (1 - 1 / 300.0));
    EXPECT_EQ(omb_dynamic_cast<OmbPrimeMeridian>(c->getPublicObject(OmbString("M")))->longitudeFromGreenwich(), -0.5);
    EXPECT_EQ(c->getPublicObject(OmbString("W")).get(), OmbEllipsoid::wgs84().get());

    const auto again = OmbXmlParser::loadString(local->save(), {}, OmbDataSetInitialization::Delayed, {});
    const auto reread = omb_dynamic_cast<OmbEllipsoid>(again->getPublicObject(OmbString("Local")));
    ASSERT_TRUE(reread);
    EXPECT_TRUE(reread->equivalent(*local));
    EXPECT_EQ(reread->authority(), OmbString("test"));
    EXPECT_EQ(OmbEllipsoid::wgs84()->save().find(OmbString("<Ellipsoid")), -1);
}
