// The projections defined in the plane: the dynamic local plane, the
// rotated and recentred wrappers, and polynomials fitted to control points.
#include <oecore/core/exception.h>
#include <oecore/crs/projections/dynamiclocal.h>
#include <oecore/crs/projections/polynomial.h>
#include <oecore/crs/projections/transversemercator.h>
#include <oecore/crs/projections/wrappedprojections.h>

#include <gtest/gtest.h>

#include "../errortext.h"
#include "../runtimescope.h"
#include "projectiontest.h"

namespace {

class PlaneProjections : public RuntimeScope {};

}  // namespace

TEST_F(PlaneProjections, DynamicLocalPlaneFollowsItsCentreAndTurns) {
    OmbRef<OmbDynamicLocalProjection> local(new OmbDynamicLocalProjection);
    local->lengthUnit(OmbLengthUnit::nauticalMile());
    const BoundProjection bound(local);
    local->set(10, 60, 0);
    // One nautical mile per arc minute north; half that east at 60 degrees.
    EXPECT_NEAR(bound.project({10, 61}).y, 60, 1e-9);
    EXPECT_NEAR(bound.project({11, 60}).x, 30, 1e-9);
    // Up turned 90 degrees counter-clockwise: north now points left.
    local->set(10, 60, 90);
    const OmbPoint north = bound.project({10, 61});
    EXPECT_NEAR(north.x, -60, 1e-9);
    EXPECT_NEAR(north.y, 0, 1e-9);
    EXPECT_LT(bound.worstRoundTrip(randomPoints(4, 200, 0, 20, 50, 70)), 1e-9);
    // Near the pole x keeps a tenth of its equatorial scale.
    local->set(0, 89.9, 0);
    EXPECT_NEAR(bound.project({1, 89.9}).x, 6, 1e-9);
}

TEST_F(PlaneProjections, RotatedAndRecentredProjectionsMoveTheBasePlane) {
    const OmbRef<OmbProjection> utm = OmbProjection::utm(32, OmbUTMHemisphere::North);
    const BoundProjection base(utm);
    const BoundProjection rotated(OmbRef<OmbProjection>(new OmbRotatedProjection(utm, 90)));
    // About the projected origin (500 km, 0): east becomes north.
    const OmbPoint p = base.project({10, 45}), q = rotated.project({10, 45});
    EXPECT_NEAR(q.x, 500000 - p.y, 1e-6);
    EXPECT_NEAR(q.y, p.x - 500000, 1e-6);
    EXPECT_LT(rotated.worstRoundTrip(randomPoints(5, 200, 5, 13, 0, 80)), 1e-9);

    OmbRef<OmbProjectionWithNewOrigin> recentred(new OmbProjectionWithNewOrigin(utm, {12, 50}));
    EXPECT_EQ(recentred->name(), OmbString("Utm32NRecentered"));
    const BoundProjection moved{OmbRef<OmbProjection>(recentred)};
    const OmbPoint origin = moved.project({12, 50});
    EXPECT_NEAR(origin.x, 0, 1e-9);
    EXPECT_NEAR(origin.y, 0, 1e-9);
    EXPECT_LT(moved.worstRoundTrip(randomPoints(6, 200, 5, 13, 0, 80)), 1e-9);
    EXPECT_TRUE(*recentred == OmbProjectionWithNewOrigin(OmbProjection::utm(32, OmbUTMHemisphere::North), {12, 50}));
    EXPECT_FALSE(*recentred == OmbProjectionWithNewOrigin(utm, {12, 51}));

    OmbRotatedProjection unbased;
    EXPECT_EQ(errorOf([&] { delete unbased.init(*OmbGeodeticDatum::wgs84()); }),
              "Value \"baseProjection\" is null in RotatedProjection.");
}

TEST_F(PlaneProjections, PolynomialsFitTheControlPoints) {
    // An image 1000 x 800 pixels over 10..12 E, 50..51 N, north up, with a
    // slight shear that a first-degree polynomial captures exactly.
    const auto image = [](const OmbPoint& lola) {
        return OmbPoint(500 * (lola.x - 10) + 20 * (lola.y - 50), 800 * (51 - lola.y));
    };
    OmbPointArray geo, pixels;
    for (const OmbPoint& p : randomPoints(7, 8, 10, 12, 50, 51)) geo.push_back(p), pixels.push_back(image(p));
    const BoundProjection affine(OmbRef<OmbProjection>(new OmbPolynomialProjection(geo, pixels, 1)));
    for (const OmbPoint& p : randomPoints(8, 50, 10, 12, 50, 51)) {
        EXPECT_TRUE(affine.project(p).approxEqual(image(p), 1e-9));
        EXPECT_TRUE(affine.unproject(image(p)).approxEqual(p, 1e-12));
    }
    EXPECT_LT(
        static_cast<const OmbPolynomialProjection&>(*affine.projection).getErrorEstimate(OmbErrorMeasure::MaxError),
        1e-9);

    // Curved data: the cubic fits better than the plane, and the largest
    // residual is at least the mean.
    OmbPointArray curved;
    for (const OmbPoint& p : geo) curved.push_back(image(p) + OmbPoint(3 * (p.x - 11) * (p.x - 11), 0));
    OmbPolynomialProjection plane(geo, curved, 1);
    const BoundProjection cubic(OmbRef<OmbProjection>(new OmbPolynomialProjection(geo, curved, 2)));
    const auto& fitted = static_cast<const OmbPolynomialProjection&>(*cubic.projection);
    EXPECT_GT(plane.getErrorEstimate(OmbErrorMeasure::MeanError), 0.1);
    EXPECT_LT(fitted.getErrorEstimate(OmbErrorMeasure::MaxError), 1e-9);
    EXPECT_GE(plane.getErrorEstimate(OmbErrorMeasure::MaxError), plane.getErrorEstimate(OmbErrorMeasure::MeanError));
    EXPECT_LT(cubic.worstRoundTrip(randomPoints(9, 100, 10, 12, 50, 51)), 1e-9);
}

TEST_F(PlaneProjections, PolynomialErrorsSayWhatIsWrong) {
    const OmbPointArray three{{0, 0}, {1, 0}, {0, 1}};
    const auto initOf = [](OmbPolynomialProjection projection) { delete projection.init(*OmbGeodeticDatum::wgs84()); };
    EXPECT_EQ(errorOf([&] {
                  initOf(OmbPolynomialProjection(three, {{0, 0}}, 1));
              }),
              "Length of geoPoints and imagePoints lists does not match. Failed to construct \t\t\t  projection "
              "PolynomialProjection.");
    EXPECT_EQ(errorOf([&] { initOf(OmbPolynomialProjection(three, three, 2)); }),
              "There are not enough control points to establish a polynomial of degree 2");
    EXPECT_EQ(errorOf([&] { initOf(OmbPolynomialProjection(three, three, 4)); }),
              "Polynom of degree 4 is not implemented");
    EXPECT_EQ(OmbPolynomialProjection::parsePoints(OmbString(" 1 2; 3.5 -4 ;")), (OmbPointArray{{1, 2}, {3.5, -4}}));
    EXPECT_EQ(errorOf([] { OmbPolynomialProjection::parsePoints(OmbString("1 2 3")); }),
              "Invalid argument in the point list \"1 2 3\" (\"x y\" pairs separated by semicolons).");
}
