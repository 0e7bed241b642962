// Attribute values and sets in configuration files:
//   <AttributeSet>
//     <Attribute Key="depth"><Attribute.Value><AttributeValue Value="12.5"
//     Type="double"/></Attribute.Value></Attribute>
//   </AttributeSet>
#include <oecore/attr/attributeset.h>
#include <oecore/config/boxedvalue.h>
#include <oecore/config/valueparsers.h>
#include <oecore/config/xmlparser.h>
#include <oecore/config/xmlserializer.h>
#include <oecore/core/exception.h>
#include <oecore/core/stringbuilder.h>

#include <tinyxml.h>

namespace {

OmbString attributeText(TiXmlElement* element, const char* name) {
    const char* text = element->Attribute(name);
    return text ? OmbString(text) : OmbString();
}

// An attribute value from its text and configuration type name; false when
// the text does not read as the type.
bool parseAttributeValue(const OmbString& text, OmbAttributeSetType type, OmbAttributeValue& out) {
    switch (type) {
        case OmbAttributeInt64: {
            long long v;
            if (!parseInt(text, v)) return false;
            out = OmbAttributeValue(static_cast<std::int64_t>(v));
            return true;
        }
        case OmbAttributeDouble: {
            double v;
            if (!parseDouble(text, v)) return false;
            out = OmbAttributeValue(v);
            return true;
        }
        case OmbAttributeBool: {
            bool v;
            if (!parseBool(text, v)) return false;
            out = OmbAttributeValue::fromBool(v);
            return true;
        }
        case OmbAttributeAtom: out = OmbAttributeValue(static_cast<unsigned long>(OmbAtoms::atom(text))); return true;
        case OmbAttributeString: out = OmbAttributeValue(text); return true;
        case OmbAttributeEmpty: return false;
    }
    return false;
}

OmbString valueText(const OmbAttributeValue& value) {
    OmbStringBuilder text;
    switch (value.type()) {
        case OmbAttributeInt64: text << static_cast<long long>(value.asInt64()); break;
        case OmbAttributeDouble: text << OmbFormat::real(value.asDouble()); break;
        case OmbAttributeBool: text << (value.asBool() ? "true" : "false"); break;
        case OmbAttributeAtom: text << OmbAtoms::name(value.asAtom()); break;
        case OmbAttributeString: text << value.asString(); break;
        case OmbAttributeEmpty: break;
    }
    return text.str();
}

class AttributeValueMetaData : public ConcreteClassMetaData {
public:
    AttributeValueMetaData() : ConcreteClassMetaData(OmbString::literal("AttributeValue"), true) {}
    OmbRef<OmbRefCnt> createInstance(OmbXmlParserContext&, TiXmlElement* element) override {
        OmbAttributeValue value;
        const OmbString typeName = attributeText(element, "Type");
        const OmbString text = attributeText(element, "Value");
        OmbAttributeSetType type = OmbAttributeEmpty;
        if (!typeName.empty() &&
            (!Omb_attributeTypeFromName(typeName, type) || !parseAttributeValue(text, type, value)))
            OmbXmlParser::fail(element, OmbString("Failed to convert '") + text + OmbString("' to type ") + typeName +
                                            OmbString(". "));
        return OmbBoxedValue<OmbAttributeValue>::box(value);
    }
};

class AttributeSetMetaData : public ConcreteClassMetaData {
public:
    AttributeSetMetaData() : ConcreteClassMetaData(OmbString::literal("AttributeSet"), true) {}
    OmbRef<OmbRefCnt> createInstance(OmbXmlParserContext& context, TiXmlElement* element) override {
        OmbRef<OmbAttributeSet> set(new OmbAttributeSet);
        for (TiXmlElement* attribute = element->FirstChildElement(); attribute;
             attribute = attribute->NextSiblingElement()) {
            if (OmbString(attribute->Value()) != OmbString::literal("Attribute"))
                OmbXmlParser::fail(attribute, OmbString("The list item ") + OmbString(attribute->Value()) +
                                                  OmbString(" cannot be inserted into the list AttributeSet since "
                                                            "it is of an incompatible type."));
            const OmbRef<OmbRefCnt> value = OmbXmlParser::parsePropertyGeneric(
                context, attribute, OmbString::literal("Value"), OmbString::literal("AttributeValue"), false);
            const auto* boxed = dynamic_cast<const OmbBoxedValue<OmbAttributeValue>*>(value.get());
            if (!boxed) continue;
            set->setGeneric(OmbAtoms::atom(attributeText(attribute, "Key")), boxed->value());
        }
        return OmbRef<OmbRefCnt>(set);
    }
};

[[maybe_unused]] const bool registered = [] {
    OmbXmlParser::registerLibraryClass(
        []() -> std::unique_ptr<ClassMetaData> { return std::make_unique<AttributeValueMetaData>(); });
    OmbXmlParser::registerLibraryClass(
        []() -> std::unique_ptr<ClassMetaData> { return std::make_unique<AttributeSetMetaData>(); });
    OmbXmlParser::registerLibraryTypeConverter("Atom", [](const OmbString& text, OmbXmlParserContext&) {
        return OmbBoxedValue<OmbAtom>::box(OmbAtoms::atom(text));
    });
    return true;
}();

}  // namespace

// Value type: written inline, in the referring element's property element.
void OmbAttributeSet::toXml(OmbXmlSerializer&, TiXmlElement* topLevel, TiXmlElement* parent, const char* propertyName,
                            const char*, bool isPublic) const {
    auto* element = new TiXmlElement("AttributeSet");
    if (isPublic) element->SetAttribute("Public", "true");
    const OmbAtom geoType = geoTypeKey;
    forEach([&](OmbAtom key, const OmbAttributeValue& value) {
        if (key == geoType) return;
        auto* attribute = element->LinkEndChild(new TiXmlElement("Attribute"))->ToElement();
        attribute->SetAttribute("Key", OmbAtoms::name(key).dataUtf8());
        if (value.is_singular()) return;
        TiXmlElement* valueElement = OmbXmlSerializer::propertyElement(attribute, "Value");
        auto* v = valueElement->LinkEndChild(new TiXmlElement("AttributeValue"))->ToElement();
        v->SetAttribute("Value", valueText(value).dataUtf8());
        v->SetAttribute("Type", Omb_attributeTypeName(value.type()));
    });
    TiXmlElement* container = parent ? parent : topLevel;
    if (parent && propertyName && *propertyName) container = OmbXmlSerializer::propertyElement(parent, propertyName);
    container->LinkEndChild(element);
}
