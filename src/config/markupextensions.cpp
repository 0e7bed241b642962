#include "markupextensions.h"

#include <oecore/config/boxedvalue.h>
#include <oecore/config/configuration.h>
#include <oecore/config/xmlparser.h>
#include <oecore/core/exception.h>
#include <oecore/core/runtime.h>
#include <oecore/core/stringutils.h>

#include <tinyxml.h>

#include <filesystem>

#include "registry.h"

namespace oecore::detail {

namespace {

// The text of a String property of the extension's element.
OmbString text(OmbXmlParserContext& context, TiXmlElement* element, const char* property) {
    return OmbXmlParser::getStringProperty(context, element, property);
}

bool flag(OmbXmlParserContext& context, TiXmlElement* element, const char* property) {
    const OmbRef<OmbRefCnt> value = OmbXmlParser::parsePropertyGeneric(context, element, OmbString::literal(property),
                                                                       OmbString::literal("bool"), false);
    const auto* boxed = dynamic_cast<const OmbBoxedValue<bool>*>(value.get());
    return boxed && boxed->value();
}

OmbRef<OmbRefCnt> boxed(const OmbString& text) { return OmbBoxedValue<OmbString>::box(text); }

// A copy of a layer or an operator, so that the referencing configuration
// gets its own instance; the class names decide, as those classes arrive
// with their subsystems.
bool isCopiedWhenReferenced(const OmbEngineObject& object) {
    for (const OmbClass* c = object.myRuntimeClass(); c; c = c->baseClass()) {
        const OmbString name(c->name());
        if (name == OmbString::literal("Layer") || name == OmbString::literal("Operator")) return true;
    }
    return false;
}

class ResourceReference : public MarkupExtension {
public:
    ResourceReference(OmbString value, bool predefined, OmbString file)
        : value_(std::move(value)), predefined_(predefined), file_(std::move(file)) {}

    OmbRef<OmbRefCnt> provideValue(OmbXmlParserContext& context) override {
        OmbRef<OmbRefCnt> found;
        if (predefined_) {
            found = OmbRef<OmbRefCnt>(OmbRuntime::getPredefinedObject(value_));
        } else if (!file_.empty()) {
            found = fromFile(context);
        } else if (value_.find(OmbString::literal(".")) < 0) {
            found = context.findResource(context.currentNamespace() + OmbString::literal(".") + value_);
        } else {
            found = context.findResource(value_);
        }
        if (!found)
            OMB_THROW(XmlParserError,
                      OmbString("Failed to resolve resource reference to '") + value_ + OmbString("'."));
        return found;
    }

private:
    OmbRef<OmbRefCnt> fromFile(OmbXmlParserContext& context) {
        const OmbRef<OmbConfiguration> other = context.loadFile(file_);
        OmbRef<OmbRefCnt> found = other->getAny(value_);
        const OmbRef<OmbEngineObject> object = omb_dynamic_cast<OmbEngineObject>(found);
        if (object && isCopiedWhenReferenced(*object)) found = OmbRef<OmbRefCnt>(object->safeClone());
        return found;
    }

    OmbString value_;
    bool predefined_;
    OmbString file_;
};

class EnvironmentVariable : public MarkupExtension {
public:
    EnvironmentVariable(OmbString key, OmbString ifAbsent) : key_(std::move(key)), ifAbsent_(std::move(ifAbsent)) {}
    OmbRef<OmbRefCnt> provideValue(OmbXmlParserContext&) override {
        const OmbString value = OmbStringUtils::getEnvironmentVariable(key_);
        return boxed(value.empty() ? ifAbsent_ : value);
    }

private:
    OmbString key_;
    OmbString ifAbsent_;
};

class RegistryValue : public MarkupExtension {
public:
    RegistryValue(OmbString key, OmbString value, OmbString ifAbsent)
        : key_(std::move(key)), value_(std::move(value)), ifAbsent_(std::move(ifAbsent)) {}
    OmbRef<OmbRefCnt> provideValue(OmbXmlParserContext&) override {
        const std::ptrdiff_t slash = key_.find(OmbString::literal("\\"));
        const OmbString root = slash < 0 ? key_ : key_.substr(0, static_cast<std::size_t>(slash));
        if (!isRegistryRootKey(root))
            OMB_THROW(XmlParserError, OmbString("RegistryValue - Invalid root key (") + key_ +
                                          OmbString("), must be one of HKEY_CLASSES_ROOT, HKEY_CURRENT_CONFIG, "
                                                    "HKEY_CURRENT_USER, HKEY_LOCAL_MACHINE, HKEY_USERS"));
        OmbString found;
        return boxed(readRegistryValue(key_, value_, found) ? found : ifAbsent_);
    }

private:
    OmbString key_;
    OmbString value_;
    OmbString ifAbsent_;
};

class ConfigurationParameter : public MarkupExtension {
public:
    ConfigurationParameter(OmbString key, OmbString defaultValue)
        : key_(std::move(key)), default_(std::move(defaultValue)) {}
    OmbRef<OmbRefCnt> provideValue(OmbXmlParserContext& context) override {
        OmbString value;
        return boxed(context.getConfigurationParameter(key_, value) ? value : default_);
    }

private:
    OmbString key_;
    OmbString default_;
};

class Path : public MarkupExtension {
public:
    explicit Path(std::vector<OmbString> parts) : parts_(std::move(parts)) {}
    OmbRef<OmbRefCnt> provideValue(OmbXmlParserContext&) override {
        std::filesystem::path path;
        for (const OmbString& part : parts_) path /= std::string(part.view());
        return boxed(OmbString(path.string()));
    }

private:
    std::vector<OmbString> parts_;
};

// The Parts of a Path: a Strings property, as String elements in the
// property element or as one text attribute.
std::vector<OmbString> parts(OmbXmlParserContext& context, TiXmlElement* element) {
    std::vector<OmbString> out;
    if (const char* attribute = element->Attribute("Parts")) {
        out.emplace_back(attribute);
        return out;
    }
    const TiXmlElement* property = element->FirstChildElement("Path.Parts");
    const TiXmlElement* list = property ? property : element;
    if (const TiXmlElement* strings = list->FirstChildElement("Strings")) list = strings;
    for (const TiXmlElement* child = list->FirstChildElement(); child; child = child->NextSiblingElement()) {
        if (OmbXmlParser::isPropertyNode(child)) continue;
        if (OmbString(child->Value()) != OmbString::literal("String"))
            OmbXmlParser::fail(child, OmbString("The list item ") + OmbString(child->Value()) +
                                          OmbString(" cannot be inserted into the list Strings since it is of an "
                                                    "incompatible type."));
        out.emplace_back(child->GetText() ? child->GetText() : "");
    }
    (void)context;
    return out;
}

template <class Create>
class MarkupExtensionMetaData : public ConcreteClassMetaData {
public:
    MarkupExtensionMetaData(const char* name, Create create)
        : ConcreteClassMetaData(OmbString::literal(name)), create_(create) {}
    OmbRef<OmbRefCnt> createInstance(OmbXmlParserContext& context, TiXmlElement* element) override {
        return OmbRef<OmbRefCnt>(create_(context, element));
    }

private:
    Create create_;
};

template <class Create>
std::unique_ptr<ClassMetaData> extension(const char* name, Create create) {
    return std::make_unique<MarkupExtensionMetaData<Create>>(name, create);
}

}  // namespace

std::vector<std::unique_ptr<ClassMetaData>> markupExtensionMetaData() {
    using Context = OmbXmlParserContext;
    std::vector<std::unique_ptr<ClassMetaData>> out;
    out.push_back(extension("ResourceReference", [](Context& c, TiXmlElement* e) -> MarkupExtension* {
        return new ResourceReference(text(c, e, "Value"), flag(c, e, "Predefined"), text(c, e, "File"));
    }));
    out.push_back(extension("EnvironmentVariable", [](Context& c, TiXmlElement* e) -> MarkupExtension* {
        return new EnvironmentVariable(text(c, e, "Key"), text(c, e, "IfAbsent"));
    }));
    out.push_back(extension("RegistryValue", [](Context& c, TiXmlElement* e) -> MarkupExtension* {
        return new RegistryValue(text(c, e, "Key"), text(c, e, "Value"), text(c, e, "IfAbsent"));
    }));
    out.push_back(extension("ConfigurationParameter", [](Context& c, TiXmlElement* e) -> MarkupExtension* {
        return new ConfigurationParameter(text(c, e, "Key"), text(c, e, "DefaultValue"));
    }));
    out.push_back(
        extension("Path", [](Context& c, TiXmlElement* e) -> MarkupExtension* { return new Path(parts(c, e)); }));
    return out;
}

}  // namespace oecore::detail
