#include <oecore/config/boxedvalue.h>
#include <oecore/config/configuration.h>
#include <oecore/config/xmlparser.h>
#include <oecore/core/exception.h>
#include <oecore/core/stringbuilder.h>
#include <oecore/core/stringutils.h>

#include <tinyxml.h>

#include <cctype>
#include <cstring>

namespace {

const char* tagOf(const TiXmlElement* element) { return element->Value(); }

// The position copies report: the node they were made from.
const TiXmlNode* sourceOf(const TiXmlNode* node) {
    const auto* source = static_cast<const TiXmlNode*>(node->GetUserData());
    return source ? source : node;
}

OmbString propertyElementTag(const TiXmlElement* element, const OmbString& propertyName) {
    return OmbString(tagOf(element)) + OmbString::literal(".") + propertyName;
}

TiXmlElement* findPropertyElement(TiXmlElement* element, const OmbString& tag) {
    for (TiXmlElement* child = element->FirstChildElement(); child; child = child->NextSiblingElement())
        if (tag == OmbString(child->Value())) return child;
    return nullptr;
}

bool isNotPropertyNode(const TiXmlNode* node) {
    return node->Type() != TiXmlNode::TINYXML_COMMENT && !OmbXmlParser::isPropertyNode(node);
}

}  // namespace

void OmbXmlParser::getSourceInfo(const TiXmlNode* node, int& row, int& column) {
    const TiXmlNode* source = sourceOf(node);
    row = source->Row();
    column = source->Column();
}

void OmbXmlParser::setSourceInfo(const TiXmlNode* source, TiXmlNode* copy, bool recursive) {
    copy->SetUserData(const_cast<TiXmlNode*>(sourceOf(source)));
    if (!recursive) return;
    const TiXmlNode* s = source->FirstChild();
    for (TiXmlNode* c = copy->FirstChild(); s && c; s = s->NextSibling(), c = c->NextSibling())
        setSourceInfo(s, c, true);
}

void OmbXmlParser::fail(const TiXmlNode* node, const OmbString& text) {
    OmbStringBuilder message;
    if (const TiXmlElement* element = node ? node->ToElement() : nullptr) {
        if (const char* name = element->Attribute("Name"); name && *name) message << name << ": ";
    }
    message << text;
    if (node) {
        int row = 0;
        int column = 0;
        getSourceInfo(node, row, column);
        if (!text.endsWith(OmbString::literal(" "))) message << ' ';
        message << "Row " << row << ", Column " << column << ".";
    }
    OMB_THROW(XmlParserError, message.str());
}

bool OmbXmlParser::isPropertyNode(const TiXmlNode* node) {
    return node->Type() == TiXmlNode::TINYXML_ELEMENT && std::strchr(node->Value(), '.') != nullptr;
}

bool OmbXmlParser::isMarkupExtensionAttribute(const OmbString& text) {
    return text.size() >= 2 && text.startsWith(OmbString::literal("{")) && text.endsWith(OmbString::literal("}"));
}

OmbString OmbXmlParser::getInstanceName(OmbXmlParserContext& context, TiXmlElement* element) {
    return getStringProperty(context, element, "Name");
}

OmbString OmbXmlParser::getStringProperty(OmbXmlParserContext& context, TiXmlElement* element,
                                          const char* propertyName) {
    const OmbRef<OmbRefCnt> value =
        parsePropertyGeneric(context, element, OmbString::literal(propertyName), OmbString::literal("String"), false);
    const auto* text = dynamic_cast<const OmbBoxedValue<OmbString>*>(value.get());
    return text ? text->value() : OmbString();
}

OmbRef<OmbRefCnt> OmbXmlParser::stringToType(OmbXmlParserContext& context, TiXmlElement* element, const OmbString& text,
                                             const OmbString& typeName) {
    return context.convertToType(text, typeName, element);
}

OmbRef<OmbRefCnt> OmbXmlParser::parsePropertyGeneric(OmbXmlParserContext& context, TiXmlElement* element,
                                                     const OmbString& propertyName, const OmbString& typeName,
                                                     bool isContent) {
    const bool isString = typeName == OmbString::literal("String");
    if (const char* attribute = element->Attribute(propertyName.dataUtf8()); attribute && (*attribute || isString)) {
        const OmbString text(attribute);
        if (isMarkupExtensionAttribute(text)) return parseMarkupExtension(context, text, element);
        return stringToType(context, element, text, typeName);
    }
    ClassMetaData* type = context.getClassMetaData(typeName, false);
    const bool isCollection = type && type->isCollection();
    if (TiXmlElement* property = findPropertyElement(element, propertyElementTag(element, propertyName))) {
        if (const char* text = property->GetText()) return stringToType(context, property, OmbString(text), typeName);
        if (isCollection) return parseCollection(context, property, typeName, isNotPropertyNode);
        if (TiXmlElement* child = property->FirstChildElement()) return context.createInstance(child);
        fail(property, OmbString("Missing property value for property ") + propertyName + OmbString(" of type ") +
                           typeName + OmbString(". "));
    }
    if (isContent) {
        if (isCollection) return parseCollection(context, element, typeName, isNotPropertyNode);
        for (TiXmlElement* child = element->FirstChildElement(); child; child = child->NextSiblingElement())
            if (!isPropertyNode(child)) return context.createInstance(child);
        for (TiXmlNode* child = element->FirstChild(); child; child = child->NextSibling())
            if (const TiXmlText* text = child->ToText())
                return stringToType(context, element, OmbString(text->Value()), typeName);
    }
    return context.getPropertyValue(propertyName);
}

OmbRef<OmbRefCnt> OmbXmlParser::parseCollection(OmbXmlParserContext& context, TiXmlElement* element,
                                                const OmbString& typeName,
                                                const std::function<bool(const TiXmlNode*)>& filter) {
    if (TiXmlElement* explicitElement = element->FirstChildElement(typeName.dataUtf8()))
        return context.createInstance(explicitElement);
    TiXmlElement list(typeName.dataUtf8());
    setSourceInfo(element, &list, false);
    for (const TiXmlNode* child = element->FirstChild(); child; child = child->NextSibling()) {
        if (!filter(child)) continue;
        TiXmlNode* copy = list.InsertEndChild(*child);
        setSourceInfo(child, copy, true);
    }
    return context.createInstance(&list);
}

OmbRef<OmbRefCnt> OmbXmlParser::parseMarkupExtension(OmbXmlParserContext& context, const OmbString& text,
                                                     const TiXmlNode* source) {
    std::string_view body = text.view().substr(1, text.size() - 2);
    while (!body.empty() && std::isspace(static_cast<unsigned char>(body.front()))) body.remove_prefix(1);
    std::size_t nameEnd = 0;
    while (nameEnd < body.size() && !std::isspace(static_cast<unsigned char>(body[nameEnd]))) ++nameEnd;
    TiXmlElement extension(std::string(body.substr(0, nameEnd)));
    setSourceInfo(source, &extension, false);
    std::vector<OmbString> pairs;
    OmbStringUtils::split(OmbString(body.substr(nameEnd)), ',', pairs);
    for (const OmbString& pair : pairs) {
        const std::ptrdiff_t equals = pair.find(OmbString::literal("="));
        if (equals < 0) break;  // the argument list ends here
        const OmbString name = OmbStringUtils::strip(pair.substr(0, static_cast<std::size_t>(equals)), ' ');
        const OmbString value = OmbStringUtils::strip(pair.substr(static_cast<std::size_t>(equals) + 1), ' ');
        if (name.empty()) continue;  // "=value" names nothing
        extension.SetAttribute(name.dataUtf8(), value.dataUtf8());
    }
    return context.createInstance(&extension);
}

namespace {

// Loads through a new context and keeps the document's comment.
template <class Load>
OmbRef<OmbConfiguration> loadWithContext(const OmbRef<OmbConfigurationParameters>& params,
                                         OmbDataSetInitialization datasetInitialization,
                                         const OmbRef<OmbResourceResolver>& resolver, Load load) {
    OmbXmlParserContext context(params, datasetInitialization, resolver);
    OmbRef<OmbConfiguration> configuration = load(context);
    configuration->storeComment(context.comment());
    return configuration;
}

}  // namespace

OmbRef<OmbConfiguration> OmbXmlParser::loadFile(const OmbString& fileName,
                                                const OmbRef<OmbConfigurationParameters>& params,
                                                OmbDataSetInitialization datasetInitialization,
                                                const OmbRef<OmbResourceResolver>& resolver) {
    return loadWithContext(params, datasetInitialization, resolver,
                           [&](OmbXmlParserContext& context) { return context.loadFile(fileName); });
}

OmbRef<OmbConfiguration> OmbXmlParser::loadString(const OmbString& text,
                                                  const OmbRef<OmbConfigurationParameters>& params,
                                                  OmbDataSetInitialization datasetInitialization,
                                                  const OmbRef<OmbResourceResolver>& resolver) {
    return loadWithContext(params, datasetInitialization, resolver,
                           [&](OmbXmlParserContext& context) { return context.loadString(text); });
}

void (*OmbXmlParser::initializeDataSet)(OmbRefCnt&) = nullptr;
