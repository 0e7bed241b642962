#include <oecore/config/configuration.h>
#include <oecore/config/xmlserializer.h>
#include <oecore/core/exception.h>
#include <oecore/core/runtime.h>

#include <gtest/gtest.h>

#include <filesystem>
#include <string>

#include "../core/tempdir.h"
#include "testclasses.h"

namespace {

OmbRef<TestUnit> unit(double inMeters, const char* name = "") {
    OmbRef<TestUnit> u(new TestUnit);
    u->inMeters(inMeters);
    u->name(OmbString(name));
    return u;
}

OmbRef<TestShape> shape(double width, const OmbRef<TestUnit>& u = OmbRef<TestUnit>(), const char* name = "") {
    OmbRef<TestShape> s(new TestShape);
    s->width = width;
    s->unit = u;
    s->name(OmbString(name));
    return s;
}

std::string saved(const OmbEngineObject& object) { return std::string(object.save().view()); }

OmbRef<OmbConfiguration> reload(const std::string& text) {
    return OmbXmlParser::loadString(OmbString(text), {}, OmbDataSetInitialization::Delayed, {});
}

std::size_t count(const std::string& text, const std::string& what) {
    std::size_t n = 0;
    for (std::size_t at = text.find(what); at != std::string::npos; at = text.find(what, at + 1)) ++n;
    return n;
}

}  // namespace

TEST(XmlSerializer, SharedReferencesAreWrittenOnceAndTheSavedObjectIsNamed) {
    const OmbRef<TestUnit> shared = unit(0.3048);
    OmbRef<TestShape> root = shape(10, shared);
    root->parts = OmbRef<TestShapeVec>(new TestShapeVec);
    root->parts->add(shape(1, shared));
    root->parts->add(shape(2));
    const std::string text = saved(*root);
    EXPECT_EQ(count(text, "<TestUnit "), 1u) << text;
    EXPECT_EQ(count(text, "Value=\"TestUnit0\""), 2u) << text;
    // The saved object had no name: it gets one, so that it is found again.
    EXPECT_NE(text.find("<TestShape Name=\"TestShape2\" Width=\"10\" Public=\"true\">"), std::string::npos) << text;

    const OmbRef<OmbConfiguration> loaded = reload(text);
    const OmbRef<TestShape> again = omb_dynamic_cast<TestShape>(loaded->getPublicObject(OmbString("TestShape2")));
    ASSERT_TRUE(again);
    ASSERT_EQ(again->parts->size(), 2u);
    EXPECT_EQ(again->parts->get(0)->unit.get(), again->unit.get());
    EXPECT_DOUBLE_EQ(again->unit->inMeters(), 0.3048);
    EXPECT_DOUBLE_EQ(again->parts->get(1)->width, 2);
    // Load, save, load, save: the two saves are identical.
    EXPECT_EQ(saved(*again), text);
}

TEST(XmlSerializer, ValuesAtTheirDefaultAreNotWrittenAndDoublesRoundTrip) {
    const std::string text = saved(*shape(0.1, unit(1.0)));
    EXPECT_NE(text.find("Width=\"0.10000000000000001\""), std::string::npos) << text;
    EXPECT_EQ(text.find("InMeters"), std::string::npos) << text;
    EXPECT_EQ(text.find("Visible"), std::string::npos) << text;
    EXPECT_EQ(text.find("Mode"), std::string::npos) << text;
    OmbRef<TestShape> s = shape(1e-300);
    s->mode = OmbChildObjectMode::AllLevels;
    s->label = OmbString(
        "K\xC3\xB8"
        "benhavn & <quay>");
    s->count = -9000000000LL;
    const auto again = omb_dynamic_cast<TestShape>(reload(saved(*s))->getPublicObject(OmbString("TestShape0")));
    EXPECT_EQ(again->width, 1e-300);
    EXPECT_EQ(again->mode, OmbChildObjectMode::AllLevels);
    EXPECT_EQ(again->label, s->label);
    EXPECT_EQ(again->count, s->count);
}

TEST(XmlSerializer, CollidingNamesAreRenamedWhenReferenced) {
    OmbRef<TestShape> root = shape(1, unit(2, "Same"), "Same");
    const std::string text = saved(*root);
    // The unit is written first and keeps its name; the shape, saved last
    // with the same name, gets a new one.
    EXPECT_NE(text.find("<TestUnit Name=\"Same\""), std::string::npos) << text;
    EXPECT_NE(text.find("Name=\"TestShape0\""), std::string::npos) << text;
    const auto loaded = reload(text);
    const auto again = omb_dynamic_cast<TestShape>(loaded->getPublicObject(OmbString("TestShape0")));
    ASSERT_TRUE(again);
    EXPECT_DOUBLE_EQ(again->unit->inMeters(), 2);
}

TEST(XmlSerializer, PredefinedObjectsStayReferences) {
    OmbRuntime::init();
    const OmbRef<TestUnit> meter = unit(1.0);
    OmbRuntime::registerPredefined(OmbString("Meter"), OmbRef<OmbEngineObject>(meter));
    const std::string text = saved(*shape(3, meter));
    EXPECT_NE(text.find("<ResourceReference Value=\"Meter\" Predefined=\"true\" />"), std::string::npos) << text;
    const auto again = omb_dynamic_cast<TestShape>(reload(text)->getPublicObject(OmbString("TestShape0")));
    EXPECT_EQ(again->unit.get(), meter.get());
    // A predefined object saved by itself gives an empty configuration.
    EXPECT_EQ(count(saved(*meter), "<TestUnit"), 0u);
    OmbRuntime::shutdown();
}

TEST(XmlSerializer, FilesTakeTheirNamespaceFromTheirNameAndFailuresLeaveNothing) {
    TempDir dir;
    const OmbRef<TestShape> s = shape(4, OmbRef<TestUnit>(), "Quay");
    s->save(OmbString((dir / "harbour.px").string()));
    const std::string text = readFile(dir / "harbour.px");
    EXPECT_NE(text.find("Namespace=\"harbour\""), std::string::npos) << text;
    EXPECT_NE(text.find("Version=\"5.4.0.3\""), std::string::npos) << text;
    const auto loaded =
        OmbXmlParser::loadFile(OmbString((dir / "harbour.px").string()), {}, OmbDataSetInitialization::Delayed, {});
    EXPECT_TRUE(loaded->getPublicObject(OmbString("harbour.Quay")));

    const std::string missing = (dir / "no/such/folder/x.px").string();
    try {
        s->save(OmbString(missing));
        FAIL() << "saved into a missing folder";
    } catch (const OmbXGenericException& e) {
        EXPECT_EQ(std::string(e.asString().view()), "Failed to open file " + missing + " for writing");
    }
    EXPECT_EQ(std::distance(std::filesystem::directory_iterator(dir.path()), {}), 1);
}

TEST(XmlSerializer, TheDocumentCommentTravelsWithTheConfiguration) {
    TempDir dir;
    const auto loaded = reload(
        "<!-- Harbour map, survey 2026 -->\n<Configuration Namespace='Demo'>"
        "<TestUnit Name='U' Public='true'/></Configuration>");
    EXPECT_EQ(loaded->comment(), OmbString(" Harbour map, survey 2026 "));
    loaded->savePublicObjects(OmbString((dir / "copy.px").string()));
    const std::string text = readFile(dir / "copy.px");
    EXPECT_EQ(text.rfind("<!-- Harbour map, survey 2026 -->", 0), 0u) << text;
    EXPECT_EQ(OmbXmlParser::loadFile(OmbString((dir / "copy.px").string()), {}, OmbDataSetInitialization::Delayed, {})
                  ->comment(),
              loaded->comment());
}
