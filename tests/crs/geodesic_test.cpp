#include <oecore/crs/geodesic.h>

#include <gtest/gtest.h>

#include <cmath>
#include <cstdio>
#include <random>
#include <sstream>
#include <string>
#include <tuple>
#include <vector>

#include "../errortext.h"
#include "referencetool.h"

namespace {

// GeographicLib's GeodSolve (exact) over the lines; its output lines.
std::vector<std::vector<double>> geodSolve(const std::string& options, const std::vector<std::string>& lines) {
    std::vector<std::vector<double>> rows;
    for (const std::string& line : runReferenceTool("GeodSolve -p 9 " + options, lines)) {
        std::istringstream fields(line);
        double a, b, c;
        if (fields >> a >> b >> c) rows.push_back({a, b, c});
    }
    return rows;
}

double angleDifference(double a, double b) {
    const double d = std::fmod(std::fabs(a - b), 360.0);
    return std::min(d, 360 - d);
}

}  // namespace

TEST(Geodesic, InverseAndDirectAgreeWithGeographicLib) {
    const OmbEllipsoid wgs84;
    std::mt19937 random(1975);
    std::uniform_real_distribution<double> lon(-180, 180), lat(-89, 89);
    std::vector<std::pair<OmbPoint, OmbPoint>> pairs;
    std::vector<std::string> lines;
    char line[160];
    for (int i = 0; i < 1000; ++i) {
        const OmbPoint a(lon(random), lat(random)), b(lon(random), lat(random) * 0.5);
        pairs.emplace_back(a, b);
        std::snprintf(line, sizeof line, "%.12f %.12f %.12f %.12f", a.y, a.x, b.y, b.x);
        lines.push_back(line);
    }
    const auto exact = geodSolve("-i", lines);
    ASSERT_EQ(exact.size(), pairs.size()) << "GeodSolve (geographiclib-tools) is needed";
    double distance = 0, azimuth = 0, exactDistance = 0;
    int unsettled = 0;
    std::vector<std::string> directLines;
    std::vector<OmbPoint> directEnds;  // ours, for the rows of directLines
    for (std::size_t i = 0; i < pairs.size(); ++i) {
        // The root finder serves ordinary pairs as well.
        const OmbGeodesicInverse e = Omb_distanceAndAzimuthsExact(wgs84, pairs[i].first, pairs[i].second);
        exactDistance = std::max(exactDistance, std::fabs(e.distance - exact[i][2]));
        const OmbGeodesicInverse g = Omb_distanceAndAzimuthsVincenty(wgs84, pairs[i].first, pairs[i].second);
        if (!g.converged) {
            ++unsettled;
            continue;
        }
        distance = std::max(distance, std::fabs(g.distance - exact[i][2]));
        azimuth = std::max(
            {azimuth, angleDifference(g.azimuth, exact[i][0]), angleDifference(g.backAzimuth, exact[i][1] + 180)});
        std::snprintf(line, sizeof line, "%.12f %.12f %.12f %.6f", pairs[i].first.y, pairs[i].first.x, g.azimuth,
                      g.distance);
        directLines.push_back(line);
        directEnds.push_back(Omb_pointPlusDirectedDistance(wgs84, pairs[i].first, g.azimuth, g.distance));
    }
    EXPECT_LT(distance, 1e-3) << "metres";
    EXPECT_LT(exactDistance, 1e-3) << "metres";
    EXPECT_LT(azimuth, 1e-7) << "degrees";
    EXPECT_LT(unsettled, 10) << "nearly antipodal pairs";

    // The direct problem from the same starts, azimuths and distances.
    const auto ends = geodSolve("", directLines);
    ASSERT_EQ(ends.size(), directLines.size());
    double position = 0;
    for (std::size_t row = 0; row < ends.size(); ++row)
        position = std::max(
            {position, std::fabs(directEnds[row].y - ends[row][0]), angleDifference(directEnds[row].x, ends[row][1])});
    EXPECT_LT(position, 1e-8) << "degrees";
}

TEST(Geodesic, NearlyAntipodalPointsAreSolvedExactly) {
    const OmbEllipsoid wgs84;
    std::mt19937 random(1975);
    std::uniform_real_distribution<double> lon(-180, 180), lat(-60, 60), near(-0.6, 0.6);
    std::vector<std::pair<OmbPoint, OmbPoint>> pairs;
    std::vector<std::string> lines;
    char line[160];
    for (int i = 0; i < 300; ++i) {
        // Every third pair starts near the equator, where several lines reach the target.
        const OmbPoint a(lon(random), i % 3 ? lat(random) : near(random) / 10);
        const OmbPoint b(std::remainder(a.x + 180 + near(random), 360.0), -a.y + near(random) / (i % 3 ? 1 : 10));
        pairs.emplace_back(a, b);
        std::snprintf(line, sizeof line, "%.12f %.12f %.12f %.12f", a.y, a.x, b.y, b.x);
        lines.push_back(line);
    }
    const auto exact = geodSolve("-i", lines);
    ASSERT_EQ(exact.size(), pairs.size()) << "GeodSolve (geographiclib-tools) is needed";
    double distance = 0, azimuth = 0;
    int unsettled = 0;
    for (std::size_t i = 0; i < pairs.size(); ++i) {
        unsettled += !Omb_distanceAndAzimuthsVincenty(wgs84, pairs[i].first, pairs[i].second).converged;
        const OmbGeodesicInverse g = Omb_distanceAndAzimuthsExact(wgs84, pairs[i].first, pairs[i].second);
        distance = std::max(distance, std::fabs(g.distance - exact[i][2]));
        azimuth = std::max(
            {azimuth, angleDifference(g.azimuth, exact[i][0]), angleDifference(g.backAzimuth, exact[i][1] + 180)});
    }
    EXPECT_GT(unsettled, 30) << "the sample should reach where Vincenty's iteration fails";
    EXPECT_LT(distance, 1e-3) << "metres";
    EXPECT_LT(azimuth, 1e-6) << "degrees";
}

TEST(Geodesic, EdgeCases) {
    const OmbEllipsoid wgs84;
    const OmbGeodesicInverse same = Omb_distanceAndAzimuthsVincenty(wgs84, OmbPoint(10, 20), OmbPoint(10, 20));
    EXPECT_EQ(same.distance, 0);
    EXPECT_EQ(same.azimuth, 0);
    EXPECT_EQ(same.backAzimuth, 180);
    // Along the equator the formulas divide by nothing.
    const OmbGeodesicInverse equator = Omb_distanceAndAzimuthsVincenty(wgs84, OmbPoint(0, 0), OmbPoint(1, 0));
    EXPECT_TRUE(equator.converged);
    EXPECT_NEAR(equator.distance, 111319.49079327357, 1e-6);
    EXPECT_NEAR(equator.azimuth, 90, 1e-12);
    EXPECT_NEAR(equator.backAzimuth, 270, 1e-12);
    // Meridian arcs, and exact antipodes, where the shortest way runs over a pole.
    const OmbGeodesicInverse meridian = Omb_distanceAndAzimuthsExact(wgs84, OmbPoint(10, 20), OmbPoint(10, -30));
    EXPECT_NEAR(meridian.distance, Omb_distanceAndAzimuthsVincenty(wgs84, OmbPoint(10, 20), OmbPoint(10, -30)).distance,
                1e-9);
    EXPECT_EQ(meridian.azimuth, 180);
    const OmbGeodesicInverse antipodes = Omb_distanceAndAzimuthsExact(wgs84, OmbPoint(0, 0), OmbPoint(180, 0));
    EXPECT_FALSE(Omb_distanceAndAzimuthsVincenty(wgs84, OmbPoint(0, 0), OmbPoint(180, 0)).converged);
    EXPECT_NEAR(antipodes.distance, 20003931.4586, 1e-3);
    // A pole is approached, not reached: latitudes are clamped.
    EXPECT_TRUE(std::isfinite(Omb_distanceAndAzimuthsVincenty(wgs84, OmbPoint(0, 90), OmbPoint(0, -90)).distance));
}

// Every node lies on the line: its distances from both ends add up to the
// whole, and the first grows in equal steps.
TEST(Geodesic, RoutesFollowTheLineInEqualSteps) {
    const OmbEllipsoid wgs84;
    const OmbPoint newYork(-74.0, 40.7, 0), tokyo(139.7, 35.7, 1000);
    const OmbPointArray geodesic = Omb_geodesicRoute(wgs84, newYork, tokyo, 500000);
    const OmbPointArray greatCircle = Omb_greatCircleRoute(newYork, tokyo, 5);
    // GeodSolve on the unit sphere gives arcs for the great circle.
    for (const auto& [route, options, step] : {std::tuple(&geodesic, std::string("-i"), 500000.0),
                                               std::tuple(&greatCircle, std::string("-i -e 1 0"), 5 * M_PI / 180)}) {
        std::vector<std::string> lines;
        char line[160];
        for (const OmbPoint& p : *route) {
            std::snprintf(line, sizeof line, "%.12f %.12f %.12f %.12f", newYork.y, newYork.x, p.y, p.x);
            lines.push_back(line);
            std::snprintf(line, sizeof line, "%.12f %.12f %.12f %.12f", p.y, p.x, tokyo.y, tokyo.x);
            lines.push_back(line);
        }
        const auto distances = geodSolve(options, lines);
        ASSERT_EQ(distances.size(), lines.size()) << "GeodSolve (geographiclib-tools) is needed";
        const double whole = distances[1][2];
        const std::size_t segments = route->size() - 1;
        EXPECT_EQ(segments, std::size_t(std::ceil(whole / step)));
        const double tolerance = std::max(whole * 1e-10, 2e-9);  // GeodSolve prints nine decimals
        for (std::size_t k = 0; k <= segments; ++k) {
            EXPECT_NEAR(distances[2 * k][2] + distances[2 * k + 1][2], whole, tolerance) << k;
            EXPECT_NEAR(distances[2 * k][2], whole * double(k) / double(segments), tolerance) << k;
        }
        EXPECT_EQ(route->back(), tokyo);
        EXPECT_NEAR((*route)[segments / 2].z, 500, 500.0 / double(segments) + 1e-9);
    }
    EXPECT_EQ(errorOf([&] { Omb_geodesicRoute(wgs84, newYork, tokyo, 0); }),
              "Invalid argument in geodesicRoute (maxSegmentLength must be positive).");
    EXPECT_EQ(errorOf([] {
                  Omb_greatCircleRoute({10, 20}, {-170, -20}, 1);
              }),
              "Invalid argument in greatCircleRoute (antipodal points lie on many great circles).");
    EXPECT_EQ(Omb_greatCircleRoute({10, 20}, {10, 20}, 1).size(), 2u);
}
