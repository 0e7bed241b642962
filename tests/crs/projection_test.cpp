#include <oecore/config/configuration.h>
#include <oecore/core/exception.h>
#include <oecore/crs/projections/identity.h>
#include <oecore/crs/projections/mercator.h>
#include <oecore/crs/projections/transversemercator.h>

#include <gtest/gtest.h>

#include <cstdio>
#include <sstream>

#include "../errortext.h"
#include "../runtimescope.h"
#include "projectiontest.h"
#include "referencetool.h"

namespace {

class Projections : public RuntimeScope {};

// The bounds of the images of many points along the rectangle's edges.
OmbRect denselySampledBounds(const OmbRect& r, const std::function<OmbPoint(OmbPoint)>& map) {
    OmbRect bounds = OmbRect::invalid();
    constexpr int steps = 20000;
    for (int i = 0; i <= steps; ++i) {
        const double t = double(i) / steps;
        const double x = r.xmin + t * (r.xmax - r.xmin), y = r.ymin + t * (r.ymax - r.ymin);
        for (const OmbPoint p : {OmbPoint(x, r.ymin), OmbPoint(x, r.ymax), OmbPoint(r.xmin, y), OmbPoint(r.xmax, y)})
            bounds.include(map(p));
    }
    return bounds;
}

// The rectangle's image bounds cover the images of points inside it and are
// no larger than the densely sampled edges' bounds, beyond 1e-8 of their
// size (what sampling misses between its points).
void expectTightCover(const OmbRect& in, const OmbRect& out, const std::function<OmbPoint(OmbPoint)>& map) {
    for (const OmbPoint& p : randomPoints(7, 5000, in.xmin, in.xmax, in.ymin, in.ymax))
        EXPECT_TRUE(out.inside(map(p))) << p.x << " " << p.y;
    const OmbRect sampled = denselySampledBounds(in, map);
    const double tolerance = 1e-8 * std::max(out.xmax - out.xmin, out.ymax - out.ymin);
    EXPECT_TRUE(out.extendCopy(tolerance, tolerance).covers(sampled));
    EXPECT_TRUE(sampled.extendCopy(tolerance, tolerance).covers(out));
}

// GeographicLib's scale k and meridian convergence gamma for UTM zone 33.
struct ScaleAndConvergence {
    double k, gamma;
};
std::vector<ScaleAndConvergence> exactScales(const std::vector<OmbPoint>& points) {
    std::vector<std::string> lines;
    for (const OmbPoint& p : points) lines.push_back(std::to_string(p.y) + " " + std::to_string(p.x));
    std::vector<ScaleAndConvergence> out;
    for (const std::string& row : runReferenceTool("TransverseMercatorProj -p 9 -k 0.9996 -l 15", lines)) {
        std::istringstream fields(row);
        double x, y;
        ScaleAndConvergence s;
        if (fields >> x >> y >> s.gamma >> s.k) out.push_back(s);
    }
    return out;
}

}  // namespace

TEST_F(Projections, ProjectedRectanglesAreTheTightBoundsOfTheirImages) {
    // Across the equator and the central meridian, where the extremes of a
    // parallel's image lie inside an edge; a cone's parallels bulge, and a
    // polar rectangle's image is a sector.
    const std::pair<OmbRef<OmbProjection>, OmbRect> cases[] = {
        {OmbProjection::utm(33, OmbUTMHemisphere::North), {0, -20, 40, 60}},
        {OmbProjection::mercator1SPEllipsoid(), {0, -20, 40, 60}},
        {OmbProjection::europeConformal2001(), {-20, 30, 40, 70}},
        {OmbProjection::upsNorth(), {-30, 60, 100, 90}},
    };
    for (const auto& [projection, lola] : cases) {
        SCOPED_TRACE(std::string(projection->name()));
        const BoundProjection bound(projection);
        OmbRect projected;
        ASSERT_TRUE(projection->project(lola, bound.cached.get(), projected));
        expectTightCover(lola, projected, [&](OmbPoint p) { return bound.project(p); });
        OmbRect back;
        ASSERT_TRUE(projection->unproject(projected, bound.cached.get(), back));
        if (!projected.strictlyInside(bound.project({0, 90}))) {
            expectTightCover(projected, back, [&](OmbPoint p) { return bound.unproject(p); });
            continue;
        }
        // Around the pole's image every longitude lies inside the rectangle.
        EXPECT_EQ(back.ymax, 90);
        EXPECT_EQ(back.xmin, -180);
        EXPECT_EQ(back.xmax, 180);
        for (const OmbPoint& p : randomPoints(8, 2000, projected.xmin, projected.xmax, projected.ymin, projected.ymax))
            EXPECT_TRUE(back.inside(bound.unproject(p)));
    }
}

TEST_F(Projections, MetresPerUnitAndDirectionsFollowTheScaleAndConvergence) {
    const BoundProjection utm(OmbProjection::utm(33, OmbUTMHemisphere::North));
    const auto points = randomPoints(9, 200, 9, 21, -70, 70);
    const auto exact = exactScales(points);
    ASSERT_EQ(exact.size(), points.size()) << "TransverseMercatorProj (geographiclib-tools) is needed";
    for (std::size_t i = 0; i < points.size(); ++i) {
        const OmbPoint p = utm.project(points[i]);
        double mx, my;
        ASSERT_TRUE(utm.projection->metersXY(p, utm.cached.get(), mx, my));
        EXPECT_NEAR(mx * exact[i].k, 1, 1e-7);
        EXPECT_NEAR(my * exact[i].k, 1, 1e-7);
        // Grid north (90 degrees from the x axis) points gamma east of true
        // north; true north is gamma left of grid north.
        EXPECT_NEAR(utm.projection->azimuth(p, 90, utm.cached.get()), std::fmod(exact[i].gamma + 360, 360), 1e-6);
        EXPECT_NEAR(utm.projection->angle(p, 0, utm.cached.get()), 90 + exact[i].gamma, 1e-6);
    }
    double nx, ny;
    utm.projection->nominalMetersXY(utm.cached.get(), nx, ny);
    EXPECT_DOUBLE_EQ(nx, 1 / 0.9996);
}

TEST_F(Projections, ValidityOfProjectedPoints) {
    const BoundProjection mercator(OmbProjection::mercator1SPWeb());
    EXPECT_TRUE(mercator.projection->isValidProjectedPoint({1e6, 1e6}, mercator.cached.get()));
    // Beyond the image of the pole, and not a number.
    EXPECT_FALSE(mercator.projection->isValidProjectedPoint({0, 1e9}, mercator.cached.get()));
    EXPECT_FALSE(mercator.projection->isValidProjectedPoint({NAN, 0}, mercator.cached.get()));
    double mx, my;
    EXPECT_FALSE(mercator.projection->metersXY({0, 1e9}, mercator.cached.get(), mx, my));
    EXPECT_EQ(mercator.projection->safePointForMetersXY({0, 1e9}, mercator.cached.get()),
              mercator.projection->projectedOrigin(mercator.cached.get()));
    const OmbPointArray perimeter = mercator.projection->worldPerimeter(mercator.cached.get());
    ASSERT_GT(perimeter.size(), 4u);
    EXPECT_EQ(perimeter.front(), perimeter.back());
}

TEST_F(Projections, ArraysProjectLikeTheirPoints) {
    for (const OmbRef<OmbProjection>& projection :
         {OmbProjection::utm(10, OmbUTMHemisphere::South), OmbProjection::miller1SP()}) {
        const BoundProjection bound(projection);
        OmbPointArray points;
        for (const OmbPoint& p : randomPoints(11, 100, -180, 180, -80, 80)) points.push_back({p.x, p.y, 42});
        OmbPointArray projected = points;
        projection->project(projected, bound.cached.get());
        for (std::size_t i = 0; i < points.size(); ++i) {
            EXPECT_EQ(projected[i], bound.project(points[i]));
            EXPECT_EQ(projected[i].z, 42);
        }
        projection->unproject(projected, bound.cached.get());
        for (std::size_t i = 0; i < points.size(); ++i)
            EXPECT_EQ(projected[i], bound.unproject(bound.project(points[i])));
    }
}

TEST_F(Projections, PredefinedProjectionsAndUnits) {
    const auto predefined = [](const char* name) {
        return omb_dynamic_cast<OmbProjection>(OmbRuntime::getPredefinedObject(OmbString(name)));
    };
    const auto stockholm = predefined("Projections.TM2_5gonWStockholm");
    ASSERT_TRUE(stockholm);
    EXPECT_EQ(stockholm->authorityCode(), OmbString("19929"));
    EXPECT_EQ(stockholm->falseEasting(), 1500000);
    EXPECT_EQ(predefined("Projections.mercator1SP_web").get(), OmbProjection::mercator1SPWeb().get());
    EXPECT_EQ(predefined("Projections.TM_2_5gonW_SWEREF99").get(), OmbProjection::tm2_5gonWSweref99().get());
    EXPECT_EQ(predefined("Projections.EuropeConformal2001")->authorityCode(), OmbString("19985"));
    EXPECT_TRUE(predefined("Projections.mercatorMeter"));
    // One degree is 60 nautical miles on the predefined spherical Mercator.
    const BoundProjection meter(OmbProjection::mercator1SP());
    EXPECT_NEAR(meter.project({1, 0}).x, 111120, 1e-6);

    const auto screen = OmbProjection::screenProjection();
    EXPECT_FALSE(screen->georeferenced());
    EXPECT_EQ(screen->authority(), OmbString("ombravel"));
    const auto longLat = OmbProjection::longLat();
    EXPECT_TRUE(omb_dynamic_cast<OmbLoLa>(longLat));
    EXPECT_EQ(errorOf([] { OmbLoLa(); }), "Can not create new LongLatProjection object, use predefined instance");

    EXPECT_EQ(OmbRuntime::getPredefinedObject(OmbString("LengthUnits.Foot")).get(), OmbLengthUnit::foot().get());
    EXPECT_DOUBLE_EQ(OmbAngleUnit::gon()->toRadian(400), 2 * M_PI);
    EXPECT_EQ(OmbRuntime::getPredefinedObject(OmbString("AngleUnits.Degree")).get(), OmbAngleUnit::degree().get());
}

TEST_F(Projections, EveryClassReadsItsConfigurationAndSavesItAgain) {
    const char* text = R"(<?xml version="1.0" encoding="utf-8"?>
<Configuration Namespace="P">
  <TransverseMercatorProjection Name="tm" Public="true" CentralLongitude="9" ScaleFactor="0.9996" FalseEasting="32500000"/>
  <UtmProjection Name="utm" Public="true" Zone="33" Hemisphere="South"/>
  <MercatorProjection Name="merc" Public="true" StandardParallel="41" Shape="Ellipsoid"/>
  <MillerCylindricalProjection Name="mill" Public="true" Compromise="0.7"/>
  <EquidistantCylindricalProjection Name="eqc" Public="true" StandardParallel="30" Shape="Sphere"
      SphereRadiusSource="#equalArea"/>
  <EquidistantCylindricalAngularProjection Name="eqa" Public="true" StandardParallel="30"
      AngleUnit="{ResourceReference Predefined=true, Value=AngleUnits.Gon}"/>
  <LambertConformalConicProjection Name="lcc" Public="true" CentralLatitude="46.5" CentralLongitude="3"
      StandardParallel1="44" StandardParallel2="49" FalseEasting="700000" FalseNorthing="6600000"/>
  <AlbersEqualAreaConicProjection Name="aea" Public="true" StandardParallel1="29.5" StandardParallel2="45.5"/>
  <StereographicProjection Name="stere" Public="true" CentralLatitude="52" CentralLongitude="5" Variant="International"/>
  <PolarStereographicProjection Name="ps" Public="true" NorthPole="false" StandardParallel="-71"/>
  <OrthographicProjection Name="ortho" Public="true" CentralLatitude="40" CentralLongitude="-100"/>
  <AzimuthalEqualAreaProjection Name="laea" Public="true" CentralLatitude="52" CentralLongitude="10" Purpose="Storage"/>
  <AzimuthalEquidistantProjection Name="aeqd" Public="true" CentralLatitude="-20" Shape="Sphere"/>
  <CassiniSoldnerProjection Name="cass" Public="true" CentralLatitude="10.4" CentralLongitude="-61.3"/>
  <HotineObliqueMercatorProjection Name="omerc" Public="true" CentralLatitude="4" CentralLongitude="115"
      Azimuth="53.3" RectifiedGridAngle="53.1" ScaleFactor="0.99984" TrueOrigin="HotineNaturalOriginNearEquator"/>
  <LabordeObliqueMercatorProjection Name="labrd" Public="true" CentralLatitude="-18.9" CentralLongitude="46.4"
      Azimuth="18.9" ScaleFactor="0.9995"/>
  <RosenmundObliqueMercatorProjection Name="rom" Public="true" CentralLatitude="46.95" CentralLongitude="7.44"/>
  <KrovakNorthOrientedProjection Name="krovak" Public="true" FalseEasting="5"/>
  <NewZealandMapGridProjection Name="nzmg" Public="true"/>
  <NonGeoreferencedProjection Name="plane" Public="true" LengthUnit="{ResourceReference Predefined=true, Value=LengthUnits.Foot}"/>
  <DynamicLocalProjection Name="local" Public="true" CentralLatitude="60" CentralLongitude="10" Up="30"/>
  <PolynomialProjection Name="poly" Public="true" GeoreferencedPoints="10 50; 12 50; 10 51; 12 51"
      ImagePoints="0 800; 1000 800; 0 0; 1000 0"/>
  <RotatedProjection Name="rot" Public="true" Up="15" BaseProjection="{ResourceReference Value=tm}"/>
</Configuration>)";
    const auto config = OmbXmlParser::loadString(OmbString(text), {}, OmbDataSetInitialization::Delayed, {});
    const auto names = config->publicNames();
    ASSERT_EQ(names->size(), 23u);
    for (const OmbString& name : *names) {
        SCOPED_TRACE(std::string(name));
        const auto projection = omb_dynamic_cast<OmbProjection>(config->getPublicObject(name));
        ASSERT_TRUE(projection);
        const auto again = OmbXmlParser::loadString(projection->save(), {}, OmbDataSetInitialization::Delayed, {});
        const auto reread = omb_dynamic_cast<OmbProjection>(again->getPublicObject(projection->name()));
        ASSERT_TRUE(reread);
        EXPECT_TRUE(reread->equivalent(*projection));
        EXPECT_EQ(reread->myRuntimeClass(), projection->myRuntimeClass());
        // Every one projects a point of its own area and returns it: near
        // its centre, or where its fixed grid or control points lie.
        const BoundProjection bound(reread);
        const std::string local(projection->name());
        const OmbPoint inArea = local == "nzmg"   ? OmbPoint(174, -41)
                                : local == "poly" ? OmbPoint(11, 50.5)
                                : local == "ps"
                                    ? OmbPoint(0, -80)
                                    : OmbPoint(reread->centralLongitude() + 0.1, reread->centralLatitude() + 0.1);
        EXPECT_TRUE(bound.unproject(bound.project(inArea)).approxEqual(inArea, 1e-9));
    }
}
