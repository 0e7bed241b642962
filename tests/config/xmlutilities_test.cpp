#include <oecore/config/xmlutilities.h>

#include <gtest/gtest.h>
#include <tinyxml.h>

TEST(XmlUtilities, NamespaceStackFollowsTheDeclarationsInScope) {
    TiXmlDocument document;
    OmbString error;
    ASSERT_TRUE(OmbXmlUtilities::loadXmlFromString(
        OmbString("<a xmlns='urn:default' xmlns:gml='urn:gml'><b xmlns:gml='urn:inner'/></a>"), document, error))
        << error;
    OmbXmlUtilities::NamespaceStack stack;
    const TiXmlElement* a = document.RootElement();
    stack.enter(a);
    EXPECT_EQ(stack.namespaceOf(OmbString("gml:Point")), OmbString("urn:gml"));
    EXPECT_EQ(stack.namespaceOf(OmbString("Point")), OmbString("urn:default"));
    stack.enter(a->FirstChildElement());
    EXPECT_EQ(stack.namespaceOf(OmbString("gml:Point")), OmbString("urn:inner"));
    stack.leave();
    EXPECT_EQ(stack.namespaceOf(OmbString("gml:Point")), OmbString("urn:gml"));
    EXPECT_TRUE(stack.namespaceOf(OmbString("xs:x")).empty());
    EXPECT_EQ(OmbXmlUtilities::NamespaceStack::localName(OmbString("gml:Point")), OmbString("Point"));
    EXPECT_EQ(OmbXmlUtilities::createXmlStringFromBuffer("\xEF\xBB\xBF<a/>", 7), OmbString("<a/>"));
}
