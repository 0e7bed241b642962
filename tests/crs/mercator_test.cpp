#include <oecore/config/configuration.h>
#include <oecore/core/exception.h>
#include <oecore/crs/projections/mercator.h>

#include <gtest/gtest.h>

#include "../errortext.h"
#include "../runtimescope.h"
#include "projectiontest.h"
#include "referencetool.h"

namespace {

class Mercator : public RuntimeScope {};

// The largest difference in projected units from cs2cs's result.
double worstAgainstProj(const BoundProjection& bound, const std::string& definition,
                        const std::vector<OmbPoint>& points) {
    const auto expected = cs2cs("+proj=longlat +datum=WGS84", definition, points);
    EXPECT_EQ(expected.size(), points.size()) << "cs2cs (proj-bin) is needed";
    double worst = expected.size() == points.size() ? 0 : HUGE_VAL;
    for (std::size_t i = 0; i < expected.size(); ++i) {
        const OmbPoint p = bound.project(points[i]);
        worst = std::max(worst, std::hypot(p.x - expected[i].x, p.y - expected[i].y));
    }
    return worst;
}

OmbRef<OmbMercator> mercator(OmbEarthShape shape, double centralLongitude, double standardParallel) {
    OmbRef<OmbMercator> m(new OmbMercator);
    m->shape(shape);
    m->centralLongitude(centralLongitude);
    m->standardParallel(standardParallel);
    m->falseEasting(100000);
    m->falseNorthing(-200000);
    return m;
}

}  // namespace

TEST_F(Mercator, AgreesWithProjAndReturnsEveryPoint) {
    const auto world = randomPoints(3857, 3000, -180, 180, -85, 85);
    const BoundProjection web(OmbProjection::mercator1SPWeb());
    EXPECT_LT(worstAgainstProj(web, "+proj=webmerc +datum=WGS84", world), 1e-6);
    const BoundProjection ellipsoidal(mercator(OmbEarthShape::Ellipsoid, 20, 30));
    EXPECT_LT(
        worstAgainstProj(ellipsoidal, "+proj=merc +ellps=WGS84 +lon_0=20 +lat_ts=30 +x_0=100000 +y_0=-200000", world),
        1e-6);
    const BoundProjection sphere(mercator(OmbEarthShape::Sphere, -30, 0));
    EXPECT_LT(worstAgainstProj(sphere, "+proj=merc +R=6378137 +lon_0=-30 +x_0=100000 +y_0=-200000", world), 1e-6);
    const BoundProjection miller(OmbProjection::miller1SP());
    EXPECT_LT(worstAgainstProj(miller, "+proj=mill +R=6366707.019493707", world), 1e-6);

    const auto everywhere = randomPoints(3858, 5000, -180, 180, -89.98, 89.98);
    for (const BoundProjection* b : {&web, &ellipsoidal, &sphere, &miller})
        EXPECT_LT(b->worstRoundTrip(everywhere), 1e-9) << b->projection->name();
}

TEST_F(Mercator, ThePolesAreCompressedToStayFinite) {
    const BoundProjection ellipsoidal(OmbProjection::mercator1SPEllipsoid());
    const OmbPoint pole = ellipsoidal.project({10, 90});
    const OmbPoint nearPole = ellipsoidal.project({10, 89.99});
    EXPECT_TRUE(std::isfinite(pole.y));
    EXPECT_GT(pole.y, nearPole.y);
    EXPECT_EQ(ellipsoidal.unproject(pole).y, 90);
    EXPECT_NEAR(ellipsoidal.unproject(ellipsoidal.project({10, -89.995})).y, -89.995, 1e-9);
    // The compression starts at 89.98: the pole lands where 89.99 would
    // without it.
    const auto expected = cs2cs("+proj=longlat +datum=WGS84", "+proj=merc +ellps=WGS84", {{10, 89.99}});
    ASSERT_EQ(expected.size(), 1u);
    EXPECT_NEAR(pole.y, expected[0].y, 0.05);
}

TEST_F(Mercator, LongitudesWrapAroundTheCylinder) {
    const BoundProjection m(mercator(OmbEarthShape::Sphere, 170, 0));
    EXPECT_TRUE(m.projection->cyclicX());
    EXPECT_NEAR(m.project({-170, 0}).x, m.project({190, 0}).x, 1e-6);
    EXPECT_NEAR(m.unproject(m.project({-175, 10})).x, -175, 1e-9);
    // A rectangle moved by whole worlds comes back to the one that starts
    // in the world.
    const double world = 4 * (m.project({170, 0}).x - m.project({80, 0}).x);
    OmbRect r(m.project({-10, 0}).x + 3 * world, 0, m.project({0, 0}).x + 3 * world, 1000);
    m.projection->adjustRect(r, m.cached.get());
    EXPECT_NEAR(r.xmin, m.project({-10, 0}).x, 1e-6);
}

TEST_F(Mercator, StandardParallelOutOfRangeIsRefused) {
    EXPECT_EQ(errorOf([] { OmbMercator().standardParallel(89.5); }),
              "Value \"standardParallel\" is out of range in MercatorProjection, should be in [-89, 89].");
}
