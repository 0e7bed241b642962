// Every projection method against PROJ's cs2cs on random points of its
// domain, and back.
#include <oecore/config/configuration.h>
#include <oecore/core/exception.h>
#include <oecore/crs/projections/azimuthal.h>
#include <oecore/crs/projections/equidistantcylindrical.h>
#include <oecore/crs/projections/krovak.h>
#include <oecore/crs/projections/lambertconformalconic.h>
#include <oecore/crs/projections/orthographic.h>
#include <oecore/crs/projections/projlibprojections.h>
#include <oecore/crs/projections/rosenmund.h>

#include <gtest/gtest.h>

#include "../errortext.h"
#include "../runtimescope.h"
#include "projectiontest.h"
#include "referencetool.h"

namespace {

class ProjectionMethods : public RuntimeScope {};

// One method: its configuration element, PROJ's definition of the same
// projection (on the ellipsoid below unless it names one), the long/lat
// domain of the random points, and the tolerance in metres (the geodesics
// of the azimuthal equidistant projection differ by up to 1.3 mm near the
// antipode).
struct Method {
    const char* element;
    std::string proj;
    OmbRect domain;
    double tolerance = 1e-5;
    const char* ellipsoid = "WGS84";
};

OmbRef<OmbGeodeticDatum> datumOn(const std::string& ellipsoid) {
    if (ellipsoid == "WGS84") return OmbGeodeticDatum::wgs84();
    const OmbRef<OmbEllipsoid>& e = ellipsoid == "bessel" ? OmbEllipsoid::bessel1841() : OmbEllipsoid::grs1980();
    return OmbRef<OmbGeodeticDatum>(new OmbGeodeticDatum(e, OmbPrimeMeridian::greenwich(), OmbRef<OmbDatumShift>()));
}

// The projection an element describes, read as the public object "p".
OmbRef<OmbProjection> read(const std::string& element) {
    const std::size_t tagEnd = element.find_first_of(" /");
    const std::string text = "<Configuration Namespace='M'>" + element.substr(0, tagEnd) + " Name='p' Public='true'" +
                             element.substr(tagEnd) + "</Configuration>";
    const auto c = OmbXmlParser::loadString(OmbString(text), {}, OmbDataSetInitialization::Delayed, {});
    return omb_dynamic_cast<OmbProjection>(c->getPublicObject(OmbString("p")));
}

// clang-format off
const Method methods[] = {
    {"<LambertConformalConicProjection CentralLongitude='10' CentralLatitude='52' StandardParallel1='35' "
     "StandardParallel2='65' FalseEasting='4e6' FalseNorthing='2.8e6'/>",
     "+proj=lcc +lat_0=52 +lon_0=10 +lat_1=35 +lat_2=65 +x_0=4000000 +y_0=2800000", {-30, 20, 50, 80}},
    {"<LambertConformalConicProjection CentralLongitude='-60' CentralLatitude='-30' StandardParallel1='-20' "
     "StandardParallel2='-45' ScaleFactor='0.999'/>",
     "+proj=lcc +lat_0=-30 +lon_0=-60 +lat_1=-20 +lat_2=-45 +k_0=0.999", {-120, -85, 0, 10}},
    {"<ResourceReference Predefined='true' Value='Projections.UPS_North'/>", "+proj=ups", {-180, 60, 180, 90}},
    {"<ResourceReference Predefined='true' Value='Projections.UPS_South'/>", "+proj=ups +south", {-180, -90, 180, -60}},
    {"<PolarStereographicProjection NorthPole='false' StandardParallel='-71' CentralLongitude='20'/>",
     "+proj=stere +lat_0=-90 +lat_ts=-71 +lon_0=20", {-180, -90, 180, -50}},
    {"<StereographicProjection CentralLongitude='-100' CentralLatitude='40' ScaleFactor='0.9999' "
     "FalseEasting='1e5' FalseNorthing='2e5'/>",
     "+proj=stere +lat_0=40 +lon_0=-100 +k_0=0.9999 +x_0=100000 +y_0=200000", {-160, -20, -40, 89}},
    {"<StereographicProjection CentralLongitude='5.38763888888889' CentralLatitude='52.15616055555555' "
     "ScaleFactor='0.9999079' FalseEasting='155000' FalseNorthing='463000' Variant='International'/>",
     "+proj=sterea +lat_0=52.15616055555555 +lon_0=5.38763888888889 +k=0.9999079 +x_0=155000 +y_0=463000",
     {-60, -20, 70, 89}, 1e-5, "bessel"},
    {"<OrthographicProjection CentralLongitude='-100' CentralLatitude='40' FalseEasting='1000' FalseNorthing='2000'/>",
     "+proj=ortho +lat_0=40 +lon_0=-100 +x_0=1000 +y_0=2000", {-150, 0, -50, 80}},
    {"<AzimuthalEquidistantProjection CentralLongitude='-100' CentralLatitude='40'/>",
     "+proj=aeqd +lat_0=40 +lon_0=-100", {-180, -80, 180, 89}, 1.5e-3},
    {"<AzimuthalEquidistantProjection CentralLongitude='30' CentralLatitude='-20' Shape='Sphere' "
     "SphereRadiusSource='#radiusFromArgument' SphereRadius='6371000'/>",
     "+proj=aeqd +lat_0=-20 +lon_0=30 +R=6371000", {-180, -89, 180, 89}},
    {"<EquidistantCylindricalProjection Shape='Sphere' StandardParallel='30' CentralLongitude='10' "
     "CentralLatitude='5'/>",
     "+proj=eqc +lat_ts=30 +lat_0=5 +lon_0=10 +R=6378137", {-170, -89, 190, 89}},
    {"<KrovakNorthOrientedProjection/>",
     "+proj=krovak +lat_0=49.5 +lon_0=24.83333333333333 +alpha=30.28813975277778 +k=0.9999", {12, 47.5, 23, 51.5},
     1e-5, "bessel"},
    {"<RosenmundObliqueMercatorProjection CentralLatitude='46.95240555555556' CentralLongitude='7.439583333333333' "
     "FalseEasting='600000' FalseNorthing='200000'/>",
     "+proj=somerc +lat_0=46.95240555555556 +lon_0=7.439583333333333 +x_0=600000 +y_0=200000", {0, 40, 15, 55},
     1e-5, "bessel"},
    {"<AlbersEqualAreaConicProjection CentralLongitude='-96' CentralLatitude='23' StandardParallel1='29.5' "
     "StandardParallel2='45.5' FalseEasting='1000' FalseNorthing='-500'/>",
     "+proj=aea +lat_0=23 +lon_0=-96 +lat_1=29.5 +lat_2=45.5 +x_0=1000 +y_0=-500", {-130, 20, -60, 55}, 1e-5,
     "GRS80"},
    {"<AzimuthalEqualAreaProjection CentralLongitude='10' CentralLatitude='52' FalseEasting='4321000' "
     "FalseNorthing='3210000'/>",
     "+proj=laea +lat_0=52 +lon_0=10 +x_0=4321000 +y_0=3210000", {-40, 20, 60, 85}, 1e-5, "GRS80"},
    {"<CassiniSoldnerProjection CentralLongitude='-61.3333' CentralLatitude='10.4416' FalseEasting='430000' "
     "FalseNorthing='325000'/>",
     "+proj=cass +lat_0=10.4416 +lon_0=-61.3333 +x_0=430000 +y_0=325000", {-62, 10, -60.5, 11}},
    {"<HotineObliqueMercatorProjection CentralLatitude='4' CentralLongitude='115' Azimuth='53.31582047222222' "
     "RectifiedGridAngle='53.13010236111111' ScaleFactor='0.99984' TrueOrigin='HotineNaturalOriginNearEquator'/>",
     "+proj=omerc +no_uoff +lat_0=4 +lonc=115 +alpha=53.31582047222222 +gamma=53.13010236111111 +k=0.99984",
     {110, 1, 120, 8}},
    {"<HotineObliqueMercatorProjection CentralLatitude='46' CentralLongitude='16' Azimuth='30' ScaleFactor='0.9999'/>",
     "+proj=omerc +lat_0=46 +lonc=16 +alpha=30 +gamma=0 +k=0.9999", {10, 40, 22, 52}},
    {"<LabordeObliqueMercatorProjection CentralLatitude='-18.9' CentralLongitude='46.43722916666667' Azimuth='18.9' "
     "ScaleFactor='0.9995'/>",
     "+proj=labrd +lat_0=-18.9 +lon_0=46.43722916666667 +azi=18.9 +k_0=0.9995", {43, -25, 50, -12}},
    {"<NewZealandMapGridProjection/>", "+proj=nzmg +ellps=intl", {166, -47, 179, -34}},
};
// clang-format on

}  // namespace

TEST_F(ProjectionMethods, AgreeWithProjAndReturnEveryPoint) {
    unsigned seed = 1;
    for (const Method& m : methods) {
        SCOPED_TRACE(m.element);
        const OmbRef<OmbProjection> projection = read(m.element);
        ASSERT_TRUE(projection);
        const BoundProjection bound(projection, datumOn(m.ellipsoid));
        const auto points = randomPoints(seed++, 2000, m.domain.xmin, m.domain.xmax, m.domain.ymin, m.domain.ymax);
        const std::string target =
            m.proj.find("+ellps") == std::string::npos ? m.proj + " +ellps=" + m.ellipsoid : m.proj;
        const auto expected = cs2cs(std::string("+proj=longlat +ellps=") + m.ellipsoid, target, points);
        ASSERT_EQ(expected.size(), points.size()) << "cs2cs (proj-bin) is needed";
        double worst = 0;
        for (std::size_t i = 0; i < points.size(); ++i)
            worst = std::max(worst, bound.project(points[i]).distanceTo(expected[i]));
        EXPECT_LT(worst, m.tolerance);
        EXPECT_LT(bound.worstRoundTrip(points), 1e-9);
    }
}

TEST_F(ProjectionMethods, ParameterErrorsNameTheParameterAndTheRange) {
    const auto initOn = [](OmbProjection* projection) {
        const OmbRef<OmbProjection> keep(projection);
        delete projection->init(*OmbGeodeticDatum::wgs84());
    };
    EXPECT_EQ(errorOf([] { OmbLambertConformalConic2SP(0, 0, 89.9995, 89.9995); }),
              "Value \"the single standard parallel\" is out of range in LambertConformalConicProjection, should be "
              "between -89.999 and -0.001 or between +0.001 and +89.999; did you want a PolarStereographic or a "
              "Stereographic projection?.");
    EXPECT_EQ(errorOf([] { OmbLambertConformalConic2SP(0, 0, 30, -30); }),
              "Value \"average of standardParallel1 and standardParallel2\" is out of range in "
              "LambertConformalConicProjection, should be between -89.999 and -0.001 or between +0.001 and +89.999; "
              "did you want a Mercator projection?.");
    auto* both = new OmbPolarStereographic(true);
    both->name(OmbString("ps"));
    both->scaleFactor(0.994);
    both->standardParallel(71);
    EXPECT_EQ(errorOf([&] { initOn(both); }),
              "in ps, at least one of scaleFactor and standardParallel must have its default value or be unspecified.");
    auto* wrongSide = new OmbPolarStereographic(false);
    wrongSide->standardParallel(71);
    EXPECT_EQ(errorOf([&] { initOn(wrongSide); }),
              "Value \"standardParallel\" is out of range in PolarStereographicProjection, should be same hemisphere "
              "as central pole.");
    EXPECT_EQ(errorOf([] { OmbAzimuthalEquidistant().set(200, 0); }),
              "centralLongitude must be in the interval [-180,180] and centralLatitude must be in the interval "
              "[-90,90].");

    const BoundProjection orthographic(OmbRef<OmbProjection>(new OmbOrthographic(0, 0)));
    EXPECT_EQ(
        errorOf([&] {
            orthographic.project({120, 0});
        }),
        "Projection error in OrthographicProjection, point (120, 0): the point lies on the far side of the earth");
    EXPECT_EQ(errorOf([&] {
                  orthographic.unproject({7e6, 0});
              }),
              "Projection error in OrthographicProjection, point (7000000, 0): the point lies outside the projected "
              "earth");
    EXPECT_FALSE(orthographic.projection->isValid({120, 0}, orthographic.cached.get()));
    EXPECT_TRUE(orthographic.projection->isValid({80, 0}, orthographic.cached.get()));
}

TEST_F(ProjectionMethods, EllipsoidalEquidistantCylindricalMeasuresAlongTheMeridian) {
    auto* eqc = new OmbEquidistantCylindrical;
    eqc->centralLatitude(10);
    eqc->standardParallel(45);
    const BoundProjection bound{OmbRef<OmbProjection>(eqc)};
    std::vector<std::string> lines;
    const std::vector<double> latitudes{-80, -35.5, 0, 10, 44.4, 89};
    for (double lat : latitudes) lines.push_back("10 0 " + std::to_string(lat) + " 0");
    const auto distances = runReferenceTool("GeodSolve -i -p 6", lines);
    ASSERT_EQ(distances.size(), latitudes.size()) << "GeodSolve (geographiclib-tools) is needed";
    for (std::size_t i = 0; i < latitudes.size(); ++i) {
        const double metres = std::stod(distances[i].substr(distances[i].rfind(' ')));
        EXPECT_NEAR(std::fabs(bound.project({0, latitudes[i]}).y), metres, 1e-4) << latitudes[i];
    }
    // Along the standard parallel x is the parallel's own length.
    const double parallel = OmbEllipsoid::wgs84()->equatorialRadius() * std::cos(45 * M_PI / 180) /
                            std::sqrt(1 - OmbEllipsoid::wgs84()->e2() * 0.5);
    EXPECT_NEAR(bound.project({1, 0}).x, parallel * M_PI / 180, 1e-6);
    EXPECT_LT(bound.worstRoundTrip(randomPoints(3, 1000, -180, 180, -90, 90)), 1e-9);
}
