#include "describedmetadata.h"

#include <oecore/config/xmlparser.h>

#include <tinyxml.h>

#include "markupextensions.h"

namespace oecore::detail {

namespace {

// A value that arrived as text (from a markup extension such as
// EnvironmentVariable) is converted to the property's type.
OmbRef<OmbRefCnt> asPropertyType(OmbXmlParserContext& context, TiXmlElement* element, OmbRef<OmbRefCnt> value,
                                 const OmbPropertyDescription& property) {
    if (property.accepts(*value)) return value;
    const auto* text = dynamic_cast<const OmbBoxedValue<OmbString>*>(value.get());
    if (text) return OmbXmlParser::stringToType(context, element, text->value(), property.typeName());
    return value;
}

}  // namespace

DescribedClassMetaData::DescribedClassMetaData(const OmbClassDescription& description)
    : ClassMetaData(description.elementName(), description.factory() == nullptr, false, false),
      description_(description) {}

OmbRef<OmbRefCnt> DescribedClassMetaData::createInstance(OmbXmlParserContext& context, TiXmlElement* element) {
    const OmbString className = name();
    if (isAbstract()) OMB_THROW(XmlAbstractClass, className);
    if (OmbString(element->Value()) != className)
        OmbXmlParser::fail(element, OmbString("Class element '") + OmbString(element->Value()) +
                                        OmbString("' does not match meta data class name ") + className +
                                        OmbString("."));
    const std::vector<const OmbPropertyDescription*>& properties = description_.properties();
    std::vector<OmbRef<OmbRefCnt>> record(properties.size());
    for (std::size_t i = 0; i < properties.size(); ++i) {
        const OmbPropertyDescription& p = *properties[i];
        const OmbString propertyName = OmbString::literal(p.name());
        OmbRef<OmbRefCnt> value =
            OmbXmlParser::parsePropertyGeneric(context, element, propertyName, p.typeName(), p.content());
        if (!value) {
            if (p.required())
                OmbXmlParser::fail(element, OmbString("The required property ") + propertyName +
                                                OmbString(" of type ") + p.typeName() + OmbString(" for class ") +
                                                className + OmbString(" is missing. "));
            continue;
        }
        value = asPropertyType(context, element, value, p);
        if (!p.accepts(*value))
            OmbXmlParser::fail(element, OmbString("Property ") + propertyName + OmbString(" of type ") + p.typeName() +
                                            OmbString(" for class ") + className +
                                            OmbString(" is of an incompatible type. "));
        record[i] = value;
    }
    // A constructor or setter that refuses a value says so at the element.
    try {
        OmbRef<OmbEngineObject> object(description_.factory()());
        for (std::size_t i = 0; i < properties.size(); ++i)
            if (record[i]) properties[i]->set(*object, *record[i]);
        if (description_.afterRead()) description_.afterRead()(*object);
        return OmbRef<OmbRefCnt>(object);
    } catch (const OmbXXmlParserError&) {
        throw;
    } catch (const OmbException& e) {
        OmbXmlParser::fail(element, e.asString());
    }
}

DescribedCollectionMetaData::DescribedCollectionMetaData(const OmbClassDescription::CollectionType& type)
    : CollectionClassMetaData(type.typeName, type.itemTypeName), type_(type) {}

OmbRef<OmbRefCnt> DescribedCollectionMetaData::createInstance(OmbXmlParserContext& context, TiXmlElement* element) {
    OmbRef<OmbEngineObject> collection(type_.create());
    for (TiXmlElement* child = element->FirstChildElement(); child; child = child->NextSiblingElement()) {
        const OmbRef<OmbRefCnt> item = context.createInstance(child);
        if (!item) continue;
        if (!type_.accepts(*item))
            OmbXmlParser::fail(child, OmbString("The list item ") + OmbString(child->Value()) +
                                          OmbString(" cannot be inserted into the list ") + name() +
                                          OmbString(" since it is of an incompatible type."));
        type_.add(*collection, *item);
    }
    return OmbRef<OmbRefCnt>(collection);
}

}  // namespace oecore::detail

std::unique_ptr<ClassMetaData> OmbClassDescription::metaData() const {
    return std::make_unique<oecore::detail::DescribedClassMetaData>(*this);
}

namespace oecore::detail {

std::vector<std::unique_ptr<ClassMetaData>> coreMetaData() {
    std::vector<std::unique_ptr<ClassMetaData>> out;
    for (const OmbClassDescription* description : OmbClassDescription::all())
        if (description->runtimeClass()->plugin() == 0) out.push_back(description->metaData());
    for (const OmbClassDescription::CollectionType& type : OmbClassDescription::collectionTypes())
        out.push_back(std::make_unique<DescribedCollectionMetaData>(type));
    for (auto& extension : markupExtensionMetaData()) out.push_back(std::move(extension));
    for (const auto create : libraryClasses()) out.push_back(create());
    return out;
}

}  // namespace oecore::detail
