#include <oecore/config/configuration.h>
#include <oecore/config/xmlparser.h>
#include <oecore/core/exception.h>
#include <oecore/core/log.h>
#include <oecore/core/runtime.h>

#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <string>

#include "../core/tempdir.h"
#include "../errortext.h"
#include "../runtimescope.h"
#include "testclasses.h"

namespace {

std::string document(const std::string& body, const std::string& attributes = "") {
    return "<?xml version=\"1.0\"?>\n<Configuration Namespace=\"Demo\"" + attributes + ">\n" + body +
           "\n</Configuration>\n";
}

OmbRef<OmbConfiguration> load(const std::string& body,
                              OmbRef<OmbConfigurationParameters> params = OmbRef<OmbConfigurationParameters>()) {
    return OmbXmlParser::loadString(OmbString(document(body)), params, OmbDataSetInitialization::Immediate,
                                    OmbRef<OmbResourceResolver>());
}

template <class T>
OmbRef<T> publicObject(const OmbRef<OmbConfiguration>& c, const char* name) {
    return omb_dynamic_cast<T>(c->getPublicObject(OmbString(name)));
}

std::string loadError(const std::string& body) {
    return errorOf([&] { load(body); });
}

}  // namespace

TEST(XmlParser, ReadsAttributesPropertyElementsAndReferences) {
    const auto c = load(R"(
  <TestUnit Name="Foot" InMeters="0.3048"/>
  <TestShape Name="Quay" Public="true" Width="12.5" Count="-3" Visible="false" Mode="AllLevels">
    <TestShape.Label>Harbour quay</TestShape.Label>
    <TestShape.Unit><ResourceReference Value="Foot"/></TestShape.Unit>
  </TestShape>
  <TestShape Name="Hidden" Width="1"/>)");
    EXPECT_EQ(c->defaultNamespace(), OmbString("Demo"));
    const auto names = c->publicNames();
    EXPECT_EQ(std::vector<OmbString>(names->begin(), names->end()), std::vector<OmbString>{"Demo.Quay"});
    const OmbRef<TestShape> quay = publicObject<TestShape>(c, "Quay");
    ASSERT_TRUE(quay);
    EXPECT_EQ(publicObject<TestShape>(c, "Demo.Quay").get(), quay.get());
    EXPECT_FALSE(c->getPublicObject(OmbString("Other.Quay")));
    EXPECT_FALSE(c->getPublicObject(OmbString("Hidden")));
    EXPECT_EQ(quay->name(), OmbString("Quay"));
    EXPECT_DOUBLE_EQ(quay->width, 12.5);
    EXPECT_EQ(quay->count, -3);
    EXPECT_FALSE(quay->visible);
    EXPECT_EQ(quay->mode, OmbChildObjectMode::AllLevels);
    EXPECT_EQ(quay->label, OmbString("Harbour quay"));
    ASSERT_TRUE(quay->unit);
    EXPECT_DOUBLE_EQ(quay->unit->inMeters(), 0.3048);
}

TEST(XmlParser, AttributeRules) {
    // An empty String attribute is a value; an empty attribute of another
    // type is absent; an attribute wins over a property element.
    const auto c = load(R"(
  <TestShape Name="A" Public="true" Width="2" Label="" Count="">
    <TestShape.Width>99</TestShape.Width>
  </TestShape>)");
    const auto a = publicObject<TestShape>(c, "A");
    EXPECT_TRUE(a->label.empty());
    EXPECT_EQ(a->count, 0);
    EXPECT_DOUBLE_EQ(a->width, 2);
    // Enumeration names are case-sensitive.
    EXPECT_NE(loadError(R"(<TestShape Width="1" Mode="allLevels"/>)")
                  .find("Unknown value 'allLevels' for enumeration type ChildObjectMode."),
              std::string::npos);
}

TEST(XmlParser, CollectionsWithAndWithoutTheirElement) {
    const auto c = load(R"(
  <TestShape Name="Implicit" Public="true" Width="1">
    <TestShape Width="2"/>
    <!-- a comment is not an item -->
    <TestShape.Label>between the items</TestShape.Label>
    <TestShape Width="3"/>
  </TestShape>
  <TestShape Name="Explicit" Public="true" Width="1">
    <TestShape.Parts><TestShapeCollection><TestShape Width="4"/></TestShapeCollection></TestShape.Parts>
  </TestShape>)");
    const auto implicit = publicObject<TestShape>(c, "Implicit");
    ASSERT_TRUE(implicit->parts);
    ASSERT_EQ(implicit->parts->size(), 2u);
    EXPECT_DOUBLE_EQ(implicit->parts->get(0)->width, 2);
    EXPECT_DOUBLE_EQ(implicit->parts->get(1)->width, 3);
    EXPECT_EQ(implicit->getChildObjects(OmbChildObjectMode::TopLevel)->size(), 2u);
    const auto explicitParts = publicObject<TestShape>(c, "Explicit")->parts;
    ASSERT_EQ(explicitParts->size(), 1u);
    EXPECT_DOUBLE_EQ(explicitParts->get(0)->width, 4);
}

TEST(XmlParser, MarkupExtensionsInBraces) {
    ::setenv("OECORE_TEST_LABEL", "from the environment", 1);
    ::unsetenv("OECORE_TEST_MISSING");
    OmbRef<OmbConfigurationParameters> params(new OmbConfigurationParameters);
    params->add(OmbString("width"), 7.25);
    const auto c = load(R"(
  <TestUnit Name="Yard" InMeters="0.9144"/>
  <TestShape Name="A" Public="true" Width="{ConfigurationParameter Key=width}"
      Label="{EnvironmentVariable Key=OECORE_TEST_LABEL}" Unit="{ResourceReference Value = Yard }"/>
  <TestShape Name="B" Public="true" Width="{ConfigurationParameter Key=missing, DefaultValue=3}"
      Label="{EnvironmentVariable Key=OECORE_TEST_MISSING, IfAbsent=fallback}"/>
  <TestShape Name="C" Public="true" Width="1" Label="{" />
  <TestShape Name="D" Public="true" Width="1" Label="{Path Parts=maps}"/>)",
                        params);
    ::unsetenv("OECORE_TEST_LABEL");
    const auto a = publicObject<TestShape>(c, "A");
    EXPECT_DOUBLE_EQ(a->width, 7.25);
    EXPECT_EQ(a->label, OmbString("from the environment"));
    EXPECT_DOUBLE_EQ(a->unit->inMeters(), 0.9144);
    const auto b = publicObject<TestShape>(c, "B");
    EXPECT_DOUBLE_EQ(b->width, 3);
    EXPECT_EQ(b->label, OmbString("fallback"));
    EXPECT_EQ(publicObject<TestShape>(c, "C")->label, OmbString("{"));
    EXPECT_EQ(publicObject<TestShape>(c, "D")->label, OmbString("maps"));
    // An argument without "=" ends the list: the default is never read.
    EXPECT_EQ(loadError(R"(<TestShape Width="{ConfigurationParameter Key=w, broken, DefaultValue=3}"/>)"),
              "Failed to convert '' to type double. Row 3, Column 1.");
    // A pair without a name is passed over.
    EXPECT_EQ(loadError(R"(<TestShape Width="{ConfigurationParameter =w, Key=k, DefaultValue=5}" Label="{X =y}"/>)"),
              "Cannot create instance of class X since the type has not been registered. Row 3, Column 1.");
    // Three characters, a letter in braces: an extension without arguments.
    EXPECT_NE(loadError(R"(<TestShape Width="1" Label="{X}"/>)")
                  .find("Cannot create instance of class X since the type has not been registered."),
              std::string::npos);
}

TEST(XmlParser, PathJoinsItsParts) {
    const auto c = load(R"(
  <TestShape Name="P" Public="true" Width="1">
    <TestShape.Label>
      <Path><Path.Parts><String>data</String><String>harbour</String><String>quay.shp</String></Path.Parts></Path>
    </TestShape.Label>
  </TestShape>)");
    EXPECT_EQ(publicObject<TestShape>(c, "P")->label, OmbString("data/harbour/quay.shp"));
}

TEST(XmlParser, RegistryValuesComeFromTheRegistryFile) {
    TempDir dir;
    const std::string registry = dir.write("registry.ini",
                                           "[HKEY_CURRENT_USER\\Software\\Demo]\r\n"
                                           "DataFolder=/srv/maps\r\n");
    ::setenv("OMBRAVEL_ENGINE_REGISTRY_FILE", registry.c_str(), 1);
    const auto c = load(R"(
  <TestShape Name="R" Public="true" Width="1">
    <TestShape.Label><RegistryValue Key="HKEY_CURRENT_USER\Software\Demo" Value="DataFolder"/></TestShape.Label>
  </TestShape>
  <TestShape Name="S" Public="true" Width="1">
    <TestShape.Label><RegistryValue Key="HKEY_CURRENT_USER\Software\Demo" Value="Nope" IfAbsent="none"/></TestShape.Label>
  </TestShape>)");
    EXPECT_EQ(publicObject<TestShape>(c, "R")->label, OmbString("/srv/maps"));
    EXPECT_EQ(publicObject<TestShape>(c, "S")->label, OmbString("none"));
    EXPECT_EQ(
        loadError(
            R"(<TestShape Width="1"><TestShape.Label><RegistryValue Key="HKEY_NOWHERE\X" Value="V"/></TestShape.Label></TestShape>)"),
        "RegistryValue - Invalid root key (HKEY_NOWHERE\\X), must be one of HKEY_CLASSES_ROOT, "
        "HKEY_CURRENT_CONFIG, HKEY_CURRENT_USER, HKEY_LOCAL_MACHINE, HKEY_USERS");
    ::unsetenv("OMBRAVEL_ENGINE_REGISTRY_FILE");
}

TEST(XmlParser, EveryErrorSaysWhatAndWhere) {
    EXPECT_EQ(loadError("<Nonsense/>"),
              "Cannot create instance of class Nonsense since the type has not been registered. Row 3, Column 1.");
    EXPECT_EQ(loadError("\n  <TestShape Name=\"S\"/>"),
              "S: The required property Width of type double for class TestShape is missing. Row 4, Column 3.");
    EXPECT_EQ(loadError(R"(<TestShape Width="wide"/>)"), "Failed to convert 'wide' to type double. Row 3, Column 1.");
    EXPECT_EQ(loadError(R"(<TestUnit Name="U"/><TestShape><TestShape.Width><TestUnit/></TestShape.Width></TestShape>)"),
              "Property Width of type double for class TestShape is of an incompatible type. Row 3, Column 21.");
    EXPECT_EQ(loadError(R"(<TestShape Width="1"><TestShape.Unit/></TestShape>)"),
              "Missing property value for property Unit of type TestUnit. Row 3, Column 22.");
    EXPECT_EQ(loadError(R"(<TestShape Width="1"><TestUnit/></TestShape>)"),
              "The list item TestUnit cannot be inserted into the list TestShapeCollection since it is of an "
              "incompatible type. Row 3, Column 22.");
    EXPECT_EQ(loadError(R"(<TestShape Width="1" Unit="{ResourceReference Value=Nowhere}"/>)"),
              "Failed to resolve resource reference to 'Nowhere'.");
    EXPECT_EQ(loadError("<ResourceObject/>"), "Cannot create instance of abstract class ResourceObject");
    EXPECT_EQ(errorOf([] {
                  OmbXmlParser::loadString(OmbString("<Configuration/>"), {}, OmbDataSetInitialization::Delayed, {});
              }),
              "Namespace attribute missing on Configuration element.");
    EXPECT_EQ(errorOf([] {
                  OmbXmlParser::loadString(OmbString("<Configuration Namespace='x'><TestShape></Configuration>"), {},
                                           OmbDataSetInitialization::Delayed, {});
              }),
              "(1, 41): Not a valid Xml string.");
    EXPECT_EQ(errorOf([] { load("<OmbravelStudioBlob/>"); }),
              "File is a temporary Ombravel Studio file, and does not contain a complete configuration. It can only "
              "be opened by Ombravel Studio.");
}

TEST(XmlParser, MalformedTextNeverReachesTheXmlParser) {
    const auto error = [](const std::string& text) {
        return errorOf([&] {
            OmbXmlParser::loadString(OmbString(std::string_view(text)), {}, OmbDataSetInitialization::Delayed, {});
        });
    };
    EXPECT_EQ(error("<Configuration Namespace='x'>\n<TestShape Mode=\"\xE5\"/></Configuration>"),
              "(2, 18): Not a valid Xml string.");
    EXPECT_EQ(error(std::string("<Configuration Namespace='x'/>\0<x/>", 35)), "(1, 31): Not a valid Xml string.");
    EXPECT_EQ(error(""), "(0, 0): Not a valid Xml string.");
}

TEST(XmlParser, LaterVersionsOnlyWarn) {
    static std::vector<std::string> warnings;
    warnings.clear();
    OmbLog::messageWrittenEvent.slots[0] = [](OmbEngineObject*, const OmbLogEventArgs& a) {
        if (a.logLevel == OmbLogWarning) warnings.emplace_back(a.message.view());
    };
    OmbLog::enableEvents(true);
    OmbLog::logLevel(OmbLogWarning);
    for (const char* version : {"5.4.0.3", "5.4", "5.4.1", "6", "5.4.0.4"})
        OmbXmlParser::loadString(OmbString(document("", std::string(" Version=\"") + version + "\"")), {},
                                 OmbDataSetInitialization::Delayed, {});
    OmbLog::shutdown();
    OmbLog::messageWrittenEvent.slots[0] = nullptr;
    ASSERT_EQ(warnings.size(), 3u);
    EXPECT_NE(warnings[0].find("File version is 5.4.1, this Ombravel Engine version is 5.4.0.3."), std::string::npos);
}

TEST(XmlParser, DeepNestingIsRefusedCleanly) {
    std::string deep;
    for (int i = 0; i < 300; ++i) deep += "<TestShape Width=\"1\">";
    for (int i = 0; i < 300; ++i) deep += "</TestShape>";
    EXPECT_NE(loadError(deep).find("Elements are nested more than 200 levels deep."), std::string::npos);
    std::string abyss(200000, ' ');
    for (int i = 0; i < 100000; ++i) abyss[2 * i] = '<', abyss[2 * i + 1] = 'a';
    EXPECT_NE(loadError(abyss).find("Not a valid Xml string."), std::string::npos);
}

TEST(XmlParser, FilesResolveRelativeToTheirFolderAndRestoreTheCurrentDirectory) {
    TempDir dir;
    std::filesystem::create_directories(dir / "styles");
    dir.write("styles/units.px", document(R"(<TestUnit Name="Fathom" Public="true" InMeters="1.8288"/>)", ""));
    dir.write(
        "styles/shapes.px",
        document(
            R"(<TestShape Name="S" Public="true" Width="1" Unit="{ResourceReference File=units.px, Value=Demo.Fathom}"/>)"));
    dir.write("main.px", document(R"(<TestShape Name="M" Public="true" Width="2">
  <TestShape.Unit><ResourceReference File="styles/shapes.px" Value="Demo.S"/></TestShape.Unit></TestShape>)"));
    dir.write("self.px",
              document(R"(<TestShape Name="M" Width="2" Unit="{ResourceReference File=self.px, Value=Demo.M}"/>)"));
    dir.write("broken.px", document(R"(<TestShape Name="M"/>)"));
    const auto before = std::filesystem::current_path();

    // A shape is no unit: the reference resolves across two files, then the
    // type check reports it.
    EXPECT_NE(errorOf([&] {
                  OmbXmlParser::loadFile(OmbString((dir / "main.px").string()), {}, OmbDataSetInitialization::Delayed,
                                         {});
              }).find("Property Unit of type TestUnit for class TestShape is of an incompatible type."),
              std::string::npos);
    const auto shapes = OmbXmlParser::loadFile(OmbString((dir / "styles/shapes.px").string()), {},
                                               OmbDataSetInitialization::Delayed, {});
    EXPECT_DOUBLE_EQ(publicObject<TestShape>(shapes, "S")->unit->inMeters(), 1.8288);
    EXPECT_EQ(std::filesystem::current_path(), before);

    const std::string self = (dir / "self.px").string();
    EXPECT_EQ(errorOf([&] { OmbXmlParser::loadFile(OmbString(self), {}, OmbDataSetInitialization::Delayed, {}); }),
              "Circular references detected while loading file " + self);
    EXPECT_NE(errorOf([&] {
                  OmbXmlParser::loadFile(OmbString((dir / "broken.px").string()), {}, OmbDataSetInitialization::Delayed,
                                         {});
              }).find("M: The required property Width"),
              std::string::npos);
    EXPECT_EQ(std::filesystem::current_path(), before);
    EXPECT_EQ(errorOf([&] {
                  OmbXmlParser::loadFile(OmbString((dir / "none.px").string()), {}, OmbDataSetInitialization::Delayed,
                                         {});
              }),
              "Failed to open file: " + (dir / "none.px").string());
    EXPECT_EQ(
        errorOf([&] { OmbXmlParser::loadFile(OmbString("/dev/zero"), {}, OmbDataSetInitialization::Delayed, {}); }),
        "Failed to open file: /dev/zero");
    dir.write("bad.px", "<Configuration Namespace='x'>");
    EXPECT_EQ(errorOf([&] {
                  OmbXmlParser::loadFile(OmbString((dir / "bad.px").string()), {}, OmbDataSetInitialization::Delayed,
                                         {});
              }),
              (dir / "bad.px").string() + "(0, 0): Not a valid Xml file.");
}

TEST_F(RuntimeScope, PredefinedAndSharedConfigurations) {
    OmbRuntime::registerPredefined(OmbString("Meter"), OmbRef<OmbEngineObject>(new TestUnit));
    TempDir dir;
    dir.write("shared.px", document(R"(<TestUnit Name="U" Public="true"/>)", " Shared=\"true\""));
    const OmbString shared((dir / "shared.px").string());
    const OmbRef<OmbConfiguration> first(new OmbConfiguration(shared, OmbDataSetInitialization::Delayed));
    const OmbRef<OmbConfiguration> second(new OmbConfiguration(shared, OmbDataSetInitialization::Delayed));
    EXPECT_EQ(first->getPublicObject(OmbString("U")).get(), second->getPublicObject(OmbString("U")).get());

    const auto c = OmbConfiguration::fromString(OmbString(document(
        R"(<TestShape Name="A" Public="true" Width="1" Unit="{ResourceReference Predefined=true, Value=Meter}"/>)")));
    EXPECT_EQ(publicObject<TestShape>(c, "A")->unit.get(), OmbRuntime::getPredefinedObject(OmbString("Meter")).get());
    EXPECT_EQ(errorOf([] { OmbConfiguration(OmbString("map.mpx"), OmbDataSetInitialization::Delayed); }),
              "Could not find LoadConfigurationFromMapPackage entry point.");
}

TEST(Configuration, NeedsTheRuntimeAndRefusesToBeSaved) {
    EXPECT_THROW(OmbConfiguration::fromString(OmbString(document(""))), OmbXOmbravelEngineNotInitialized);
    OmbRef<OmbConfiguration> c(new OmbConfiguration);
    EXPECT_EQ(errorOf([&] { OmbConfiguration::save(OmbRef<OmbEngineObject>(c)); }),
              "Can't save a Configuration instance to a new Configuration; try saving the objects inside the "
              "configuration instead.");
}
