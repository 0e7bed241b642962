#include <oecore/config/boxedvalue.h>
#include <oecore/config/classmetadata.h>
#include <oecore/config/valueparsers.h>
#include <oecore/core/exception.h>
#include <oecore/core/stringbuilder.h>

#include <tinyxml.h>

namespace {

OmbString elementText(TiXmlElement* element) {
    const char* text = element ? element->GetText() : nullptr;
    return text ? OmbString(text) : OmbString();
}

[[noreturn]] void conversionFailed(const OmbString& text, const ClassMetaData& type, TiXmlElement* element) {
    OmbStringBuilder message;
    message << "Failed to convert '" << text << "' to type " << type.name() << ".";
    if (element && element->Row() > 0) message << " (row " << element->Row() << ", column " << element->Column() << ")";
    OMB_THROW(XmlParserError, message.str());
}

template <class T, class Parse>
OmbRef<OmbRefCnt> parseBoxed(const ClassMetaData& type, TiXmlElement* element, Parse parse) {
    const OmbString text = elementText(element);
    T value{};
    if (!parse(text, value)) conversionFailed(text, type, element);
    return OmbBoxedValue<T>::box(value);
}

}  // namespace

OmbRef<OmbRefCnt> AbstractClassMetaData::createInstance(OmbXmlParserContext&, TiXmlElement*) {
    OMB_THROW(XmlAbstractClass, name());
}

OmbRef<OmbRefCnt> IntMetaData::createInstance(OmbXmlParserContext&, TiXmlElement* element) {
    return parseBoxed<long long>(*this, element, [](const OmbString& t, long long& v) { return parseInt(t, v); });
}

OmbRef<OmbRefCnt> DoubleMetaData::createInstance(OmbXmlParserContext&, TiXmlElement* element) {
    return parseBoxed<double>(*this, element, [](const OmbString& t, double& v) { return parseDouble(t, v); });
}

OmbRef<OmbRefCnt> BoolMetaData::createInstance(OmbXmlParserContext&, TiXmlElement* element) {
    return parseBoxed<bool>(*this, element, [](const OmbString& t, bool& v) { return parseBool(t, v); });
}

OmbRef<OmbRefCnt> StringMetaData::createInstance(OmbXmlParserContext&, TiXmlElement* element) {
    return OmbBoxedValue<OmbString>::box(elementText(element));
}

OmbRef<OmbRefCnt> CommentMetaData::createInstance(OmbXmlParserContext&, TiXmlElement*) { return OmbRef<OmbRefCnt>(); }
