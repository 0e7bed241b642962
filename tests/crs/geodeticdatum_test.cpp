#include <oecore/config/configuration.h>
#include <oecore/core/exception.h>
#include <oecore/core/runtime.h>
#include <oecore/crs/geodeticdatum.h>

#include <gtest/gtest.h>

#include <cmath>
#include <cstdio>
#include <random>
#include <string>
#include <vector>

#include "../errortext.h"
#include "../runtimescope.h"
#include "referencetool.h"
#include "testdatums.h"

namespace {

class Datums : public RuntimeScope {};

std::vector<OmbPoint> britishPoints() {
    std::mt19937 random(1314);
    std::uniform_real_distribution<double> lon(-8, 2), lat(49.5, 61), h(0, 1000);
    std::vector<OmbPoint> points;
    for (int i = 0; i < 500; ++i) points.emplace_back(lon(random), lat(random), h(random));
    return points;
}

}  // namespace

TEST_F(Datums, HelmertAgreesWithProjInBothConventionsAndReturnsExactly) {
    const auto points = britishPoints();
    const auto expected = cs2cs("+proj=longlat +ellps=airy +towgs84=446.448,-125.157,542.06,0.15,0.247,0.842,-20.489",
                                "+proj=longlat +datum=WGS84", points);
    ASSERT_EQ(expected.size(), points.size()) << "cs2cs (proj-bin) is needed";
    const auto pv = helmertDatum(OmbEllipsoid::airy1830(), osgb36Parameters());
    OmbHelmertDatumShift::Parameters cf = osgb36Parameters();
    cf.rx = -cf.rx, cf.ry = -cf.ry, cf.rz = -cf.rz;
    cf.convention = OmbRotationSignConvention::CoordinateFrameRotation;
    const auto frame = helmertDatum(OmbEllipsoid::airy1830(), cf);
    const OmbGeodeticDatum& wgs84 = *OmbGeodeticDatum::wgs84();
    double worst = 0, roundTrip = 0;
    for (std::size_t i = 0; i < points.size(); ++i) {
        OmbPoint p = points[i];
        OmbPoint q = points[i];
        pv->changeDatumTo(wgs84, p);
        frame->changeDatumTo(wgs84, q);
        worst = std::max({worst, std::fabs(p.x - expected[i].x), std::fabs(p.y - expected[i].y)});
        ASSERT_TRUE(p.approxEqual(q, 1e-9));
        wgs84.changeDatumTo(*pv, p);
        roundTrip = std::max({roundTrip, std::fabs(p.x - points[i].x), std::fabs(p.y - points[i].y)});
    }
    EXPECT_LT(worst, 1e-8) << "degrees (about 1 mm)";
    EXPECT_LT(roundTrip, 1e-9) << "degrees";
}

TEST_F(Datums, TwoHelmertShiftsToOneDatumComposeIntoOneStep) {
    OmbHelmertDatumShift::Parameters ed50;
    ed50.dx = -87, ed50.dy = -98, ed50.dz = -121;
    const auto a = helmertDatum(OmbEllipsoid::international1924(), ed50, "ED50");
    const auto b = helmertDatum(OmbEllipsoid::airy1830(), osgb36Parameters(), "OSGB36");
    OmbPoint direct(-1.5, 52.5, 10);
    a->changeDatumTo(*b, direct);
    OmbPoint viaPivot(-1.5, 52.5, 10);
    a->changeDatumTo(*OmbGeodeticDatum::wgs84(), viaPivot);
    OmbGeodeticDatum::wgs84()->changeDatumTo(*b, viaPivot);
    EXPECT_TRUE(direct.approxEqual(viaPivot, 1e-9)) << direct.x - viaPivot.x << " " << direct.y - viaPivot.y;
}

TEST_F(Datums, OtherShiftsAndTheWalk) {
    // Long/lat offsets wrap once.
    OmbRef<OmbLoLaOffsetsDatumShift> offsets(new OmbLoLaOffsetsDatumShift);
    offsets->longitudeOffset = 1;
    offsets->latitudeOffset = -0.5;
    const OmbRef<OmbGeodeticDatum> shifted(
        new OmbGeodeticDatum(OmbEllipsoid::wgs84(), OmbPrimeMeridian::greenwich(), offsets));
    OmbPoint p(179.5, 10);
    shifted->changeDatumTo(*OmbGeodeticDatum::wgs84(), p);
    EXPECT_EQ(p, OmbPoint(-179.5, 9.5));

    // Longitudes counted from Paris.
    const OmbRef<OmbGeodeticDatum> paris(
        new OmbGeodeticDatum(OmbEllipsoid::clarke1880Ign(), OmbPrimeMeridian::paris(),
                             OmbRef<OmbDatumShift>(new OmbChangedPrimeMeridianDatumShift)));
    OmbPoint q(0, 48);
    paris->changeDatumTo(*OmbGeodeticDatum::wgs84(), q);
    EXPECT_DOUBLE_EQ(q.x, 2.33722917);

    // A datum with no shift other than WGS 84 is a pivot of its own.
    const OmbRef<OmbGeodeticDatum> island(
        new OmbGeodeticDatum(OmbEllipsoid::bessel1841(), OmbPrimeMeridian::greenwich(), OmbRef<OmbDatumShift>()));
    island->name(OmbString("Island"));
    EXPECT_EQ(
        errorOf([&] { island->changeDatumTo(*OmbGeodeticDatum::wgs84(), q); }),
        "Can't transform coordinates from GeodeticDatum Island to GeodeticDatum Wgs84, since there is no chain of "
        "DatumShifts connecting them.");

    // One shift, one datum.
    EXPECT_THROW(OmbGeodeticDatum(OmbEllipsoid::wgs84(), OmbPrimeMeridian::greenwich(), offsets), OmbXSharingViolation);

    // WGS 84 equivalence.
    EXPECT_TRUE(OmbGeodeticDatum(OmbEllipsoid::grs1980(), OmbPrimeMeridian::greenwich(),
                                 OmbRef<OmbDatumShift>(new OmbIdentityDatumShift))
                    .isWgs84Equivalent());
    EXPECT_FALSE(shifted->isWgs84Equivalent());
}

TEST_F(Datums, ArraysConvertLikeTheirPoints) {
    const auto osgb36 = helmertDatum(OmbEllipsoid::airy1830(), osgb36Parameters(), "OSGB36");
    OmbRef<OmbLoLaOffsetsDatumShift> offsets(new OmbLoLaOffsetsDatumShift);
    offsets->longitudeOffset = 0.5;
    OmbGeodeticDatum shifted(OmbEllipsoid::airy1830(), OmbPrimeMeridian::greenwich(), offsets);
    for (const OmbGeodeticDatum* target : {OmbGeodeticDatum::wgs84().get(), &shifted}) {
        OmbPointArray points{{-2, 53, 100}, {1, 51, 0}, {-5, 58, -20}};
        const OmbPointArray original = points;
        osgb36->changeDatumTo(*target, points);
        for (std::size_t i = 0; i < points.size(); ++i) {
            OmbPoint p = original[i];
            osgb36->changeDatumTo(*target, p);
            EXPECT_EQ(points[i], p);
        }
    }
}

TEST_F(Datums, RectanglesCoverEveryConvertedPoint) {
    const auto osgb36 = helmertDatum(OmbEllipsoid::airy1830(), osgb36Parameters());
    const OmbRect in(-6, 50, 2, 58);
    OmbRect out;
    ASSERT_TRUE(osgb36->changeDatumTo(*OmbGeodeticDatum::wgs84(), in, out));
    for (double x = in.xmin; x <= in.xmax; x += 0.5)
        for (double y = in.ymin; y <= in.ymax; y += 0.5) {
            OmbPoint p(x, y);
            osgb36->changeDatumTo(*OmbGeodeticDatum::wgs84(), p);
            EXPECT_TRUE(out.inside(p)) << x << " " << y;
        }
    // Unconnected datums fail without touching the result.
    const OmbRect before = out;
    EXPECT_FALSE(OmbGeodeticDatum().changeDatumTo(*OmbGeodeticDatum::wgs84(), in, out));
    EXPECT_EQ(out, before);
}

TEST_F(Datums, FallbackShiftsCheckTheirAlternatives) {
    OmbRef<OmbFallbackDatumShift> fallback(new OmbFallbackDatumShift);
    fallback->name(OmbString("F"));
    OmbRef<OmbFallbackDatumShift::Alternatives> list(new OmbFallbackDatumShift::Alternatives);
    EXPECT_EQ(errorOf([&] { fallback->alternatives(list); }),
              "No alternatives given for FallbackedDatumShift F; needs at least two.");
    list->add(OmbRef<OmbDatumShift>(new OmbIdentityDatumShift));
    EXPECT_EQ(errorOf([&] { fallback->alternatives(list); }),
              "Only one alternative given for FallbackedDatumShift F; needs at least two.");
    OmbRef<OmbIdentityDatumShift> elsewhere(new OmbIdentityDatumShift);
    elsewhere->knownDatum(OmbRef<OmbGeodeticDatum>(new OmbGeodeticDatum));
    list->add(elsewhere);
    EXPECT_NE(errorOf([&] { fallback->alternatives(list); }).find("do not use the same knownDatum"), std::string::npos);
}

TEST_F(Datums, DatumsReadFromConfigurations) {
    const auto c = OmbXmlParser::loadString(
        OmbString("<Configuration Namespace='D'>"
                  "<GeodeticDatum Name='OSGB36' Public='true' Authority='epsg' AuthorityCode='6277'"
                  " Ellipsoid='{ResourceReference Predefined=true, Value=Ellipsoids.Airy1830}'>"
                  "<GeodeticDatum.DatumShift><HelmertDatumShift DX='446.448' DY='-125.157' DZ='542.06'"
                  " RotationX='0.15' RotationY='0.247' RotationZ='0.842' ScaleDifference='-20.489'>"
                  "<HelmertDatumShift.Info><DatumShiftInfo Name='OSGB36 to WGS 84 (6)' Authority='epsg'"
                  " AuthorityCode='1314' HorizontalAccuracy='2' AreaOfUseWest='-8.82' AreaOfUseSouth='49.79'"
                  " AreaOfUseEast='1.92' AreaOfUseNorth='60.94'/></HelmertDatumShift.Info>"
                  "</HelmertDatumShift></GeodeticDatum.DatumShift>"
                  "<GeodeticDatum.AlternativeDatumShifts><DatumShiftInfoCollection>"
                  "<DatumShiftInfo Name='OSTN15' AuthorityCode='7953' AreaOfUseWest='-9' AreaOfUseSouth='49'"
                  " AreaOfUseEast='2' AreaOfUseNorth='61'/>"
                  "<DatumShiftInfo Name='Channel Islands' AreaOfUseWest='-3' AreaOfUseSouth='49'"
                  " AreaOfUseEast='-2' AreaOfUseNorth='50'/>"
                  "<DatumShiftInfo Name='Unbounded' DatumShiftChoice='Lenient'/>"
                  "</DatumShiftInfoCollection></GeodeticDatum.AlternativeDatumShifts>"
                  "</GeodeticDatum></Configuration>"),
        {}, OmbDataSetInitialization::Delayed, {});
    const auto read = omb_dynamic_cast<OmbGeodeticDatum>(c->getPublicObject(OmbString("OSGB36")));
    ASSERT_TRUE(read);
    const auto made = helmertDatum(OmbEllipsoid::airy1830(), osgb36Parameters());
    OmbPoint a(-2, 53, 100), b(-2, 53, 100);
    read->changeDatumTo(*OmbGeodeticDatum::wgs84(), a);
    made->changeDatumTo(*OmbGeodeticDatum::wgs84(), b);
    EXPECT_EQ(a, b);
    // Saved and read again, the datum refers to the predefined ellipsoid and WGS 84.
    const OmbString saved = read->save();
    EXPECT_NE(saved.find(OmbString("Value=\"Ellipsoids.Airy1830\" Predefined=\"true\"")), -1) << saved;
    const auto again = OmbXmlParser::loadString(saved, {}, OmbDataSetInitialization::Delayed, {});
    const auto reread = omb_dynamic_cast<OmbGeodeticDatum>(again->getPublicObject(OmbString("OSGB36")));
    ASSERT_TRUE(reread);
    // The shift's description and the alternatives, chosen by area.
    for (const auto& datum : {read, reread}) {
        const auto& info = datum->datumShift()->info();
        ASSERT_TRUE(info);
        EXPECT_EQ(info->authorityCode, OmbString("1314"));
        EXPECT_EQ(info->horizontalAccuracy, 2);
        EXPECT_EQ(info->areaOfUse, OmbRect(-8.82, 49.79, 1.92, 60.94));
        ASSERT_EQ(datum->alternativeDatumShifts()->size(), 3u);
        EXPECT_EQ(datum->alternativeDatumShifts()->get(2)->datumShiftChoice, OmbDatumShiftChoice::Lenient);
        const auto inLondon = datum->alternativeDatumShiftsForArea({-0.2, 51.4, 0, 51.6});
        ASSERT_EQ(inLondon->size(), 2u);
        EXPECT_EQ(inLondon->get(0)->name(), OmbString("OSTN15"));
        EXPECT_EQ(inLondon->get(1)->name(), OmbString("Unbounded"));
    }
}

TEST_F(Datums, ShiftsAreBuiltFromTheEpsgCatalogue) {
    const auto fromCode = [](const char* authority, const char* code) {
        OmbRef<OmbDatumShiftInfo> info(new OmbDatumShiftInfo);
        info->authority = OmbString(authority);
        info->authorityCode = OmbString(code);
        return OmbDatumShift::fromInfo(info);
    };
    const auto helmert = [](const OmbRef<OmbDatumShift>& shift) {
        const auto h = omb_dynamic_cast<OmbHelmertDatumShift>(shift);
        EXPECT_TRUE(h);
        return h ? h->parameters() : OmbHelmertDatumShift::Parameters();
    };
    const auto osgbShift = fromCode("EPSG", "1314");
    EXPECT_EQ(helmert(osgbShift), osgb36Parameters());
    EXPECT_EQ(osgbShift->authorityCode(), OmbString("1314"));
    EXPECT_EQ(osgbShift->info()->authorityCode, OmbString("1314"));
    const auto belgian = helmert(fromCode("epsg", "15929"));
    EXPECT_EQ(belgian.convention, OmbRotationSignConvention::CoordinateFrameRotation);
    EXPECT_NEAR(belgian.rz, -1.8422, 1e-12);
    EXPECT_NEAR(belgian.scaleDifference, -1.2747, 1e-12);
    const auto nad27 = helmert(fromCode("epsg", "1173"));
    EXPECT_EQ(nad27.dy, 160);
    EXPECT_EQ(nad27.rx, 0);
    EXPECT_EQ(errorOf([&] { fromCode("epsg", "1241"); }),
              "The datum shift code epsg:1241 (not a Helmert transformation) is not supported.");
    EXPECT_EQ(errorOf([&] { fromCode("esri", "108001"); }),
              "The datum shift code esri:108001 (not an EPSG code) is not supported.");
    EXPECT_EQ(errorOf([&] { fromCode("epsg", "99999999"); }),
              "The datum shift code epsg:99999999 (not in the catalogue) is not supported.");
}
