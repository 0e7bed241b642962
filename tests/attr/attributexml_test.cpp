#include <oecore/attr/attributeset.h>
#include <oecore/attr/attributevariable.h>
#include <oecore/config/classdescription.h>
#include <oecore/config/configuration.h>
#include <oecore/core/resourceobject.h>

#include <gtest/gtest.h>

#include "../errortext.h"

namespace {

// A style whose properties are attribute variables and an attribute set.
class TestStyle : public OmbResourceObject {
    OMB_ENGINE_CLASS_INLINE(OmbResourceObject, "TestStyle", 0)
    OMB_DESCRIBED_MEMBERS()

public:
    TestStyle* clone() const override { return new TestStyle(*this); }
    OmbRef<OmbAttributeVariable<double>> width;
    OmbRef<OmbAttributeVariable<OmbColor>> color;
    OmbRef<OmbAttributeVariable<OmbString>> label;
    OmbRef<OmbAttributeVariable<OmbAlignX>> align;
    OmbRef<OmbAttributeSet> properties;
};

}  // namespace

OMB_DEFINE_DESCRIBED_MEMBERS(TestStyle)
OMB_DESCRIBE_CLASS(TestStyle) {
    using Width = OmbAttributeVariable<double>;
    using Color = OmbAttributeVariable<OmbColor>;
    using Label = OmbAttributeVariable<OmbString>;
    using Align = OmbAttributeVariable<OmbAlignX>;
    d.object<Width>("Width", &TestStyle::width, [](TestStyle& s, const OmbRef<Width>& v) { s.width = v; });
    d.object<Color>("Color", &TestStyle::color, [](TestStyle& s, const OmbRef<Color>& v) { s.color = v; });
    d.object<Label>("Label", &TestStyle::label, [](TestStyle& s, const OmbRef<Label>& v) { s.label = v; });
    d.object<Align>("Align", &TestStyle::align, [](TestStyle& s, const OmbRef<Align>& v) { s.align = v; });
    d.object<OmbAttributeSet>("Properties", &TestStyle::properties,
                              [](TestStyle& s, const OmbRef<OmbAttributeSet>& v) { s.properties = v; });
}

namespace {

const char* const document = R"(<Configuration Namespace="Demo">
  <TestStyle Name="Style" Public="true">
    <TestStyle.Width><IndirectAttributeVariable ValueType="double" Key="width" DefaultValue="0.5"/></TestStyle.Width>
    <TestStyle.Color><DirectAttributeVariable ValueType="Color" Value="navy"/></TestStyle.Color>
    <TestStyle.Label>
      <KeyedAttributeVariable KeyType="int" Key="class" DefaultValue="other">
        <KeyedAttributeVariable.Table>
          <KeyValueTable><Item Key="1" Value="road"/><Item Key="4" Value="path"/></KeyValueTable>
        </KeyedAttributeVariable.Table>
      </KeyedAttributeVariable>
    </TestStyle.Label>
    <TestStyle.Align><DirectAttributeVariable ValueType="AlignX" Value="Middle"/></TestStyle.Align>
    <TestStyle.Properties>
      <AttributeSet>
        <Attribute Key="owner"><Attribute.Value><AttributeValue Value="harbour board" Type="String"/></Attribute.Value></Attribute>
        <Attribute Key="depth"><Attribute.Value><AttributeValue Value="12.5" Type="double"/></Attribute.Value></Attribute>
        <Attribute Key="kind"><Attribute.Value><AttributeValue Value="quay" Type="Atom"/></Attribute.Value></Attribute>
      </AttributeSet>
    </TestStyle.Properties>
  </TestStyle>
</Configuration>)";

OmbRef<TestStyle> load(const std::string& text) {
    const auto c = OmbXmlParser::loadString(OmbString(text), {}, OmbDataSetInitialization::Delayed, {});
    return omb_dynamic_cast<TestStyle>(c->getPublicObject(OmbString("Style")));
}

}  // namespace

TEST(AttributeXml, VariablesAndSetsLoadAndSaveInARoundTrip) {
    const OmbRef<TestStyle> style = load(document);
    ASSERT_TRUE(style);
    OmbRef<OmbAttributeSet> feature(new OmbAttributeSet);
    feature->set(OmbAtoms::atom(OmbString("class")), std::int64_t{5});
    const OmbReadOnlyAttributes attributes(feature);
    double width = 0;
    ASSERT_TRUE(style->width->eval(attributes, width));
    EXPECT_EQ(width, 0.5);
    OmbColor color;
    ASSERT_TRUE(style->color->eval(attributes, color));
    EXPECT_EQ(color, OmbColor(0, 0, 128));
    OmbString label;
    ASSERT_TRUE(style->label->eval(attributes, label));
    EXPECT_EQ(label, OmbString("path"));
    EXPECT_EQ(style->align->lookup(0), OmbAlignX::Middle);
    EXPECT_EQ(style->properties->size(), 3u);
    unsigned long kind = 0;
    EXPECT_TRUE(style->properties->get(OmbAtoms::atom(OmbString("kind")), kind));
    EXPECT_EQ(OmbAtoms::name(static_cast<OmbAtom>(kind)), OmbString("quay"));

    const OmbString saved = style->save();
    const OmbRef<TestStyle> again = load(std::string(saved.view()));
    ASSERT_TRUE(again) << saved;
    EXPECT_EQ(again->save(), saved);
    EXPECT_TRUE(OmbAttributeSet::compare(*again->properties, *style->properties));
}

TEST(AttributeXml, ErrorsNameTheClassAndTheValue) {
    EXPECT_NE(errorOf([] {
                  load(R"(<Configuration Namespace="Demo"><TestStyle><TestStyle.Width>
                  <KeyedAttributeVariable KeyType="colour" ValueType="double" Key="k"/></TestStyle.Width></TestStyle></Configuration>)");
              })
                  .find("Cannot create instance of class KeyedAttributeVariable<colour,double> since the type has not "
                        "been registered."),
              std::string::npos);
    EXPECT_NE(errorOf([] {
                  load(R"(<Configuration Namespace="Demo"><TestStyle><TestStyle.Color>
                  <DirectAttributeVariable ValueType="Color" Value="blurple"/></TestStyle.Color></TestStyle></Configuration>)");
              }).find("Failed to convert 'blurple' to type Color."),
              std::string::npos);
    // A keyed variable with an empty table has no key type to write.
    OmbRef<TestStyle> style(new TestStyle);
    style->label = OmbRef<OmbAttributeVariable<OmbString>>(new OmbKeyedAttributeVariable<OmbString>(
        OmbAtoms::atom(OmbString("k")), OmbRef<OmbKeyValueTable<OmbString>>(new OmbKeyValueTable<OmbString>)));
    EXPECT_EQ(errorOf([&] { style->save(); }),
              "Invalid key type found during serialization of a keyed attribute variable (0)");
}
