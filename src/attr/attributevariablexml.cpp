// Attribute variables in configuration files:
//   <DirectAttributeVariable ValueType="double" Value="2.5"/>
//   <IndirectAttributeVariable ValueType="Color" Key="colour" DefaultValue="#000000FF"/>
//   <KeyedAttributeVariable KeyType="int" ValueType="String" Key="class" DefaultValue="other">
//     <KeyedAttributeVariable.Table>
//       <KeyValueTable><Item Key="1" Value="road"/><Item Key="2" Value="path"/></KeyValueTable>
//     </KeyedAttributeVariable.Table>
//   </KeyedAttributeVariable>
// The plain element names choose the class "DirectAttributeVariable<double>",
// "KeyedAttributeVariable<int,String>", ... by ValueType (default String)
// and KeyType, and hand both down to nested tables as stacked properties.
#include <oecore/attr/attributevariable.h>
#include <oecore/config/boxedvalue.h>
#include <oecore/config/valueparsers.h>
#include <oecore/config/xmlparser.h>

#include <tinyxml.h>

#include <string>

namespace {

OmbString text(OmbXmlParserContext& context, TiXmlElement* element, const char* property) {
    return OmbXmlParser::getStringProperty(context, element, property);
}

[[noreturn]] void conversionFailed(TiXmlElement* element, const OmbString& value, const char* type) {
    OmbXmlParser::fail(element, OmbString("Failed to convert '") + value + OmbString("' to type ") + OmbString(type) +
                                    OmbString(". "));
}

template <class T>
T valueOf(TiXmlElement* element, const OmbString& value) {
    T out{};
    if (!OmbAttributeVariableTraits<T>::fromText(value, out))
        conversionFailed(element, value, OmbAttributeVariableTraits<T>::name());
    return out;
}

template <class T>
std::optional<T> defaultOf(OmbXmlParserContext& context, TiXmlElement* element) {
    const OmbString value = text(context, element, "DefaultValue");
    if (value.empty() && !element->Attribute("DefaultValue")) return std::nullopt;
    return valueOf<T>(element, value);
}

OmbAttributeValue keyOf(TiXmlElement* element, const OmbString& value, OmbAttributeSetType type) {
    switch (type) {
        case OmbAttributeInt64: {
            long long v;
            if (parseInt(value, v)) return OmbAttributeValue(static_cast<std::int64_t>(v));
            break;
        }
        case OmbAttributeDouble: {
            double v;
            if (parseDouble(value, v)) return OmbAttributeValue(v);
            break;
        }
        case OmbAttributeBool: {
            bool v;
            if (parseBool(value, v)) return OmbAttributeValue::fromBool(v);
            break;
        }
        case OmbAttributeAtom: return OmbAttributeValue(static_cast<unsigned long>(OmbAtoms::atom(value)));
        case OmbAttributeString: return OmbAttributeValue(value);
        case OmbAttributeEmpty: break;
    }
    conversionFailed(element, value, Omb_attributeTypeName(type));
}

// A table's items, read for value type T and the given key type.
template <class T>
OmbRef<OmbKeyValueTable<T>> readTable(TiXmlElement* table, OmbAttributeSetType keyType) {
    OmbRef<OmbKeyValueTable<T>> out(new OmbKeyValueTable<T>);
    if (!table) return out;
    for (TiXmlElement* item = table->FirstChildElement(); item; item = item->NextSiblingElement()) {
        if (std::string_view(item->Value()) != "Item")
            OmbXmlParser::fail(item, OmbString("The list item ") + OmbString(item->Value()) +
                                         OmbString(" cannot be inserted into the list KeyValueTable since it is of an "
                                                   "incompatible type."));
        const char* key = item->Attribute("Key");
        const char* value = item->Attribute("Value");
        out->add(keyOf(item, OmbString(key ? key : ""), keyType), valueOf<T>(item, OmbString(value ? value : "")));
    }
    return out;
}

enum class Kind { Direct, Indirect, Keyed };

constexpr const char* kindName(Kind kind) {
    switch (kind) {
        case Kind::Direct: return "DirectAttributeVariable";
        case Kind::Indirect: return "IndirectAttributeVariable";
        case Kind::Keyed: return "KeyedAttributeVariable";
    }
    return "";
}

OmbString className(Kind kind, const OmbString& keyType, const OmbString& valueType) {
    std::string name = std::string(kindName(kind)) + "<";
    if (kind == Kind::Keyed) name += std::string(keyType.view()) + ",";
    return OmbString(name + std::string(valueType.view()) + ">");
}

template <class T, Kind K, OmbAttributeSetType Key = OmbAttributeEmpty>
class VariableMetaData : public ConcreteClassMetaData {
public:
    VariableMetaData()
        : ConcreteClassMetaData(
              className(K, OmbString(Omb_attributeTypeName(Key)), OmbString(OmbAttributeVariableTraits<T>::name()))) {}

    OmbRef<OmbRefCnt> createInstance(OmbXmlParserContext& context, TiXmlElement* element) override {
        if constexpr (K == Kind::Direct) {
            return OmbRef<OmbRefCnt>(
                new OmbDirectAttributeVariable<T>(valueOf<T>(element, text(context, element, "Value"))));
        } else {
            const OmbAtom key = OmbAtoms::atom(text(context, element, "Key"));
            if constexpr (K == Kind::Indirect) {
                return OmbRef<OmbRefCnt>(new OmbIndirectAttributeVariable<T>(key, defaultOf<T>(context, element)));
            } else {
                const std::string tableTag = std::string(element->Value()) + ".Table";
                TiXmlElement* property = element->FirstChildElement(tableTag.c_str());
                TiXmlElement* table = property ? property->FirstChildElement("KeyValueTable") : nullptr;
                return OmbRef<OmbRefCnt>(
                    new OmbKeyedAttributeVariable<T>(key, readTable<T>(table, Key), defaultOf<T>(context, element)));
            }
        }
    }
};

// The plain element: picks the class by ValueType and KeyType.
class VariableChooser : public ConcreteClassMetaData {
public:
    explicit VariableChooser(Kind kind) : ConcreteClassMetaData(OmbString::literal(kindName(kind))), kind_(kind) {}

    OmbRef<OmbRefCnt> createInstance(OmbXmlParserContext& context, TiXmlElement* element) override {
        OmbString valueType = text(context, element, "ValueType");
        if (valueType.empty()) valueType = OmbString::literal("String");
        const OmbString keyType = kind_ == Kind::Keyed ? text(context, element, "KeyType") : OmbString();
        const OmbString name = className(kind_, keyType, valueType);
        ClassMetaData* concrete = context.getClassMetaData(name, false);
        if (!concrete)
            OmbXmlParser::fail(element, OmbString("Cannot create instance of class ") + name +
                                            OmbString(" since the type has not been registered. "));
        StackedProperty valueTypeProperty(context, OmbString::literal("ValueType"),
                                          OmbBoxedValue<OmbString>::box(valueType));
        StackedProperty keyTypeProperty(context, OmbString::literal("KeyType"), OmbBoxedValue<OmbString>::box(keyType));
        return concrete->createInstance(context, element);
    }

private:
    Kind kind_;
};

template <class M>
std::unique_ptr<ClassMetaData> make() {
    return std::make_unique<M>();
}

template <class T>
void registerValueType() {
    OmbXmlParser::registerLibraryClass(make<VariableMetaData<T, Kind::Direct>>);
    OmbXmlParser::registerLibraryClass(make<VariableMetaData<T, Kind::Indirect>>);
    OmbXmlParser::registerLibraryClass(make<VariableMetaData<T, Kind::Keyed, OmbAttributeInt64>>);
    OmbXmlParser::registerLibraryClass(make<VariableMetaData<T, Kind::Keyed, OmbAttributeDouble>>);
    OmbXmlParser::registerLibraryClass(make<VariableMetaData<T, Kind::Keyed, OmbAttributeString>>);
    OmbXmlParser::registerLibraryClass(make<VariableMetaData<T, Kind::Keyed, OmbAttributeAtom>>);
    OmbXmlParser::registerLibraryClass(make<VariableMetaData<T, Kind::Keyed, OmbAttributeBool>>);
}

[[maybe_unused]] const bool registered = [] {
#define OMB_REGISTER_VALUE_TYPE(T) registerValueType<T>();
    OMB_ATTRIBUTE_VARIABLE_TYPES(OMB_REGISTER_VALUE_TYPE)
#undef OMB_REGISTER_VALUE_TYPE
    OmbXmlParser::registerLibraryClass(
        []() -> std::unique_ptr<ClassMetaData> { return std::make_unique<VariableChooser>(Kind::Direct); });
    OmbXmlParser::registerLibraryClass(
        []() -> std::unique_ptr<ClassMetaData> { return std::make_unique<VariableChooser>(Kind::Indirect); });
    OmbXmlParser::registerLibraryClass(
        []() -> std::unique_ptr<ClassMetaData> { return std::make_unique<VariableChooser>(Kind::Keyed); });
    return true;
}();

}  // namespace
