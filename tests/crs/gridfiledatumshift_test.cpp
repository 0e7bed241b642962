#include <oecore/config/configuration.h>
#include <oecore/core/runtime.h>
#include <oecore/crs/geodeticdatum.h>

#include <gtest/gtest.h>

#include <functional>
#include <string>

#include "../core/tempdir.h"
#include "../errortext.h"
#include "../runtimescope.h"
#include "gridfiles.h"

namespace {

class GridShifts : public RuntimeScope {
protected:
    void expectInterpolatesAndInverts(OmbGridFileDatumShift& shift) const;

    OmbRef<OmbGridFileDatumShift> shift(const std::string& pattern = "*.ct2") const {
        OmbRef<OmbGridFileDatumShift> s(new OmbGridFileDatumShift);
        s->name(OmbString("G"));
        s->path = OmbString(dir.path().string());
        s->fileName = OmbString(pattern);
        return s;
    }

    TempDir dir;
    // The shifts here do not look at the datum that owns them.
    const OmbGeodeticDatum& datum() const { return *OmbGeodeticDatum::wgs84(); }
};

TEST_F(GridShifts, BothFormatsInterpolateAndInvert) {
    // A constant latitude shift and a longitude shift growing linearly to
    // the east, which bilinear interpolation reproduces exactly.
    const NodeShift field = [](int lon, int) { return std::pair(1.0 * (lon - 10), 2.0); };
    dir.write("a.gsb", ntv2(field));
    dir.write("a.ct2", ctable2(field));
    for (const char* format : {"*.gsb", "*.ct2"}) {
        SCOPED_TRACE(format);
        expectInterpolatesAndInverts(*shift(format));
    }
}

void GridShifts::expectInterpolatesAndInverts(OmbGridFileDatumShift& s) const {
    OmbPoint p(10.5, 51.25, 7);
    ASSERT_EQ(s.changeDatumToKnownDatum(datum(), p), 0);
    EXPECT_NEAR(p.x, 10.5 - 0.5 * arcSecond, 1e-9);
    EXPECT_NEAR(p.y, 51.25 + 2 * arcSecond, 1e-9);
    EXPECT_EQ(p.z, 7);
    ASSERT_EQ(s.changeDatumFromKnownDatum(datum(), p), 0);
    EXPECT_NEAR(p.x, 10.5, 1e-9);
    EXPECT_NEAR(p.y, 51.25, 1e-9);

    // Stored the other way round, the same grid applies inversely.
    s.direction = OmbDatumShiftDirection::FromKnownDatum;
    ASSERT_EQ(s.changeDatumFromKnownDatum(datum(), p), 0);
    EXPECT_NEAR(p.x, 10.5 - 0.5 * arcSecond, 1e-9);
    EXPECT_NEAR(p.y, 51.25 + 2 * arcSecond, 1e-9);
}

TEST_F(GridShifts, PointsOutsideTheGridsAreReportedAndKept) {
    dir.write("a.ct2", ctable2([](int, int) { return std::pair(1.0, 2.0); }));
    const auto s = shift();
    OmbPoint p(20, 51, 0);
    EXPECT_EQ(s->changeDatumToKnownDatumNoExceptions(datum(), p), 1);
    EXPECT_EQ(p, OmbPoint(20, 51, 0));
    EXPECT_EQ(errorOf([&] { s->changeDatumFromKnownDatum(datum(), p); }),
              "Can't transform Lon = 20, Lat = 51 using GridFileDatumShift G, because the point is not covered by "
              "the grid files.");

    // Inside a grid that shifts by nothing the point is covered.
    dir.write("zero.ct2", ctable2([](int, int) { return std::pair(0.0, 0.0); }));
    OmbPoint unmoved(11, 51);
    EXPECT_EQ(shift("zero.ct2")->changeDatumToKnownDatumNoExceptions(datum(), unmoved), 0);
    EXPECT_EQ(unmoved, OmbPoint(11, 51));
}

TEST_F(GridShifts, AFallbackUsesTheNextAlternativeOutsideTheGrid) {
    dir.write("a.ct2", ctable2([](int, int) { return std::pair(1.0, 2.0); }));
    OmbRef<OmbLoLaOffsetsDatumShift> offsets(new OmbLoLaOffsetsDatumShift);
    offsets->latitudeOffset = 1;
    OmbRef<OmbFallbackDatumShift::Alternatives> list(new OmbFallbackDatumShift::Alternatives);
    list->add(shift());
    list->add(offsets);
    OmbRef<OmbFallbackDatumShift> fallback(new OmbFallbackDatumShift);
    fallback->alternatives(list);

    OmbPoint inside(11, 51), outside(30, 51);
    fallback->changeDatumToKnownDatum(datum(), inside);
    fallback->changeDatumToKnownDatum(datum(), outside);
    EXPECT_NEAR(inside.y, 51 + 2 * arcSecond, 1e-9);
    EXPECT_EQ(outside, OmbPoint(30, 52));
}

TEST_F(GridShifts, AlaskanGridsReachAcrossTheAntimeridian) {
    // Alaskan grids are laid out west of -180 degrees.
    dir.write("alaska.ct2", ctable2([](int, int) { return std::pair(3.0, 2.0); }, -200));
    OmbPoint p(161, 51);
    ASSERT_EQ(shift()->changeDatumToKnownDatum(datum(), p), 0);
    EXPECT_NEAR(p.x, 161 - 3 * arcSecond, 1e-9);
    EXPECT_NEAR(p.y, 51 + 2 * arcSecond, 1e-9);
}

TEST_F(GridShifts, GridFilesAreFoundByPattern) {
    const auto grid = ctable2([](int, int) { return std::pair(1.0, 2.0); });
    std::filesystem::create_directories(dir / "a");
    std::filesystem::create_directories(dir / "b");
    dir.write("a/PENR2009.gsb", grid);
    dir.write("b/BALR2009.gsb", grid);
    dir.write("notes.txt", "not a grid");

    EXPECT_EQ(
        errorOf([&] { shift("*.gsb")->construct(); }),
        "In GridFileDatumShift G, no files in the folder " + dir.path().string() + " matched the given fileName *.gsb");
    const auto s = shift("*.gsb");
    s->searchSubdirectories = true;
    // The Balearic grid goes before the peninsular one that overlaps it.
    EXPECT_EQ(std::string(s->gridList()), (dir / "b/BALR2009.gsb").string() + "," + (dir / "a/PENR2009.gsb").string());

    const auto broken = shift("notes.txt");
    EXPECT_NE(errorOf([&] { broken->construct(); }).find("cannot read the grid files"), std::string::npos);

    const std::string deep = std::string(130, 'd');
    std::filesystem::create_directories(dir / deep);
    dir.write(deep + "/x.ct2", grid);
    const auto far = shift();
    far->searchSubdirectories = true;
    EXPECT_NE(errorOf([&] { far->construct(); }).find("was longer than 126 characters, namely "), std::string::npos);
}

TEST_F(GridShifts, GridShiftsAreReadFromConfigurations) {
    dir.write("with space.ct2", ctable2([](int, int) { return std::pair(1.0, 2.0); }));
    const auto c =
        OmbXmlParser::loadString(OmbString("<Configuration Namespace='D'>"
                                           "<GeodeticDatum Name='Local' Public='true'"
                                           " Ellipsoid='{ResourceReference Predefined=true, Value=Ellipsoids.Wgs84}'>"
                                           "<GeodeticDatum.DatumShift><GridFileDatumShift Path='" +
                                           dir.path().string() +
                                           "' FileName='*.ct2' Direction='FromKnownDatum'/>"
                                           "</GeodeticDatum.DatumShift></GeodeticDatum></Configuration>"),
                                 {}, OmbDataSetInitialization::Delayed, {});
    const auto local = omb_dynamic_cast<OmbGeodeticDatum>(c->getPublicObject(OmbString("Local")));
    ASSERT_TRUE(local);
    OmbPoint p(11, 51);
    local->changeDatumTo(datum(), p);
    EXPECT_NEAR(p.x, 11 + arcSecond, 1e-9);
    EXPECT_NEAR(p.y, 51 - 2 * arcSecond, 1e-9);
}

}  // namespace
