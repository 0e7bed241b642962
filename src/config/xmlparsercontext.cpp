#include <oecore/config/boxedvalue.h>
#include <oecore/config/configuration.h>
#include <oecore/config/resourceresolver.h>
#include <oecore/config/valueparsers.h>
#include <oecore/config/xmlparser.h>
#include <oecore/config/xmlutilities.h>
#include <oecore/core/exception.h>
#include <oecore/core/log.h>
#include <oecore/core/runtime.h>
#include <oecore/core/stringutils.h>

#include <tinyxml.h>

#include <filesystem>
#include <fstream>
#include <sstream>

#include "describedmetadata.h"
#include "pluginloader.h"

namespace fs = std::filesystem;

struct OmbXmlParserContext::Plugin {
    OmbString name;
    std::unique_ptr<OmbPluginInstance> instance;
};

namespace oecore::detail {

std::vector<std::unique_ptr<ClassMetaData> (*)()>& libraryClasses() {
    static std::vector<std::unique_ptr<ClassMetaData> (*)()> classes;
    return classes;
}

std::vector<std::pair<OmbString, OmbTypeConverter>>& libraryTypeConverters() {
    static std::vector<std::pair<OmbString, OmbTypeConverter>> converters;
    return converters;
}

}  // namespace oecore::detail

void OmbXmlParser::registerLibraryClass(std::unique_ptr<ClassMetaData> (*create)()) {
    oecore::detail::libraryClasses().push_back(create);
}

void OmbXmlParser::registerLibraryTypeConverter(const char* typeName, OmbTypeConverter converter) {
    oecore::detail::libraryTypeConverters().emplace_back(OmbString::literal(typeName), std::move(converter));
}

namespace {

constexpr std::uint32_t engineVersion = 0x05040003;

template <class T, class Parse>
OmbTypeConverter converter(Parse parse) {
    return [parse](const OmbString& text, OmbXmlParserContext&) {
        T value{};
        return parse(text, value) ? OmbBoxedValue<T>::box(value) : OmbRef<OmbRefCnt>();
    };
}

OmbTypeConverter enumConverter(const OmbEnumDescription& e) {
    return [&e](const OmbString& text, OmbXmlParserContext&) -> OmbRef<OmbRefCnt> {
        int value;
        if (!e.fromName(text, value))
            OMB_THROW(XmlParserError, OmbString("Unknown value '") + text + OmbString("' for enumeration type ") +
                                          e.typeName() + OmbString("."));
        return OmbBoxedValue<int>::box(value);
    };
}

// "5.4.0.3" packed into one number; missing parts count as 0.
std::uint32_t packVersion(const OmbString& text) {
    std::vector<OmbString> parts;
    OmbStringUtils::split(text, '.', parts);
    std::uint32_t version = 0;
    for (std::size_t i = 0; i < 4; ++i) {
        const std::int64_t part = i < parts.size() ? OmbStringUtils::atoi64(parts[i]) : 0;
        version |= static_cast<std::uint32_t>(part & 0xFF) << (24 - 8 * i);
    }
    return version;
}

// Changes the current directory for a file load and restores it, also when
// the load fails.
class CurrentDirectory {
public:
    explicit CurrentDirectory(const fs::path& directory) {
        std::error_code error;
        saved_ = fs::current_path(error);
        fs::current_path(directory, error);
    }
    ~CurrentDirectory() {
        std::error_code error;
        if (!saved_.empty()) fs::current_path(saved_, error);
    }
    CurrentDirectory(const CurrentDirectory&) = delete;
    CurrentDirectory& operator=(const CurrentDirectory&) = delete;

private:
    fs::path saved_;
};

// Pushes a value on a stack for the guard's lifetime.
template <class Stack, class Value>
class Pushed {
public:
    Pushed(Stack& stack, Value value) : stack_(stack) { stack_.push_back(std::move(value)); }
    ~Pushed() { stack_.pop_back(); }
    Pushed(const Pushed&) = delete;
    Pushed& operator=(const Pushed&) = delete;

private:
    Stack& stack_;
};

}  // namespace

OmbXmlParserContext::OmbXmlParserContext(OmbRef<OmbConfigurationParameters> params,
                                         OmbDataSetInitialization datasetInitialization,
                                         OmbRef<OmbResourceResolver> resolver)
    : params_(std::move(params)),
      datasetInitialization_(datasetInitialization),
      resolver_(resolver ? std::move(resolver) : OmbRuntime::defaultResourceResolver()) {
    for (ClassMetaData* builtIn : std::initializer_list<ClassMetaData*>{
             &IntMetaData::instance(), &DoubleMetaData::instance(), &BoolMetaData::instance(),
             &StringMetaData::instance(), &CommentMetaData::instance()})
        registerClass(builtIn);
    registerTypeConverter(OmbString::literal("int"), converter<long long>(parseInt));
    registerTypeConverter(OmbString::literal("bool"), converter<bool>(parseBool));
    registerTypeConverter(OmbString::literal("float"), converter<float>(parseFloat));
    registerTypeConverter(OmbString::literal("double"), converter<double>(parseDouble));
    loadPluginByName(OmbString());
}

OmbXmlParserContext::~OmbXmlParserContext() {
    for (auto it = plugins_.rbegin(); it != plugins_.rend(); ++it)
        if ((*it)->instance) (*it)->instance->unregisterClasses(*this);
}

const OmbString& OmbXmlParserContext::currentFile() const {
    static const OmbString none;
    return files_.empty() ? none : files_.back();
}

void OmbXmlParserContext::setConfigNamespace(const OmbString& ns) {
    if (!configurations_.empty()) configurations_.back()->setDefaultNamespace(ns);
}

void OmbXmlParserContext::registerClass(ClassMetaData* metaData) { classes_[metaData->name()] = metaData; }

void OmbXmlParserContext::unregisterClass(ClassMetaData* metaData) {
    const auto it = classes_.find(metaData->name());
    if (it != classes_.end() && it->second == metaData) classes_.erase(it);
}

ClassMetaData* OmbXmlParserContext::getClassMetaData(const OmbString& name, bool throwIfMissing) {
    const auto it = classes_.find(name);
    if (it != classes_.end()) return it->second;
    if (throwIfMissing) OMB_THROW(XmlParserError, OmbString("Failed to locate meta data for type ") + name);
    return nullptr;
}

void OmbXmlParserContext::registerTypeConverter(const OmbString& name, OmbTypeConverter converter) {
    converters_[name] = std::move(converter);
}

void OmbXmlParserContext::unregisterTypeConverter(const OmbString& name) { converters_.erase(name); }

OmbRef<OmbRefCnt> OmbXmlParserContext::convertToType(const OmbString& text, const OmbString& typeName,
                                                     const TiXmlNode* node) {
    if (typeName == OmbString::literal("String")) return OmbBoxedValue<OmbString>::box(text);
    const auto it = converters_.find(typeName);
    if (it == converters_.end())
        OMB_THROW(XmlParserError, OmbString("Cannot convert ") + text + OmbString(" of type ") + typeName +
                                      OmbString(" since no type converter has been registered."));
    OmbRef<OmbRefCnt> value = it->second(text, *this);
    if (!value)
        OmbXmlParser::fail(
            node, OmbString("Failed to convert '") + text + OmbString("' to type ") + typeName + OmbString(". "));
    return value;
}

OmbRef<OmbRefCnt> OmbXmlParserContext::findResource(const OmbString& qualifiedName) {
    if (scopes_.empty()) return OmbRef<OmbRefCnt>();
    const auto it = scopes_.back().find(qualifiedName);
    return it == scopes_.back().end() ? OmbRef<OmbRefCnt>() : it->second;
}

OmbRef<OmbRefCnt> OmbXmlParserContext::getPropertyValue(const OmbString& name) {
    const auto it = stacked_.find(name);
    return it == stacked_.end() || it->second.empty() ? OmbRef<OmbRefCnt>() : it->second.back();
}

void OmbXmlParserContext::pushProperty(const OmbString& name, const OmbRef<OmbRefCnt>& value) {
    stacked_[name].push_back(value);
}

void OmbXmlParserContext::popProperty(const OmbString& name) {
    const auto it = stacked_.find(name);
    if (it == stacked_.end()) return;
    it->second.pop_back();
    if (it->second.empty()) stacked_.erase(it);
}

bool OmbXmlParserContext::getConfigurationParameter(const OmbString& key, OmbString& value) {
    return params_ && params_->get(key, value);
}

OmbRef<OmbConfiguration> OmbXmlParserContext::loadFile(const OmbString& fileName) {
    std::error_code error;
    const fs::path path = fs::absolute(fs::path(std::string(fileName.view())), error).lexically_normal();
    const OmbString absolute(path.string());
    if (std::find(files_.begin(), files_.end(), absolute) != files_.end())
        OMB_THROW(XmlParserError, OmbString("Circular references detected while loading file ") + absolute);
    if (const OmbRef<OmbConfiguration> shared =
            omb_dynamic_cast<OmbConfiguration>(OmbRuntime::getSharedConfig(absolute)))
        return shared;
    if (const auto it = loaded_.find(absolute); it != loaded_.end()) return it->second;

    // Only regular files: a device such as /dev/zero would be read forever.
    std::ifstream in;
    if (fs::is_regular_file(path, error)) in.open(path, std::ios::binary);
    if (!in.is_open()) OMB_THROW(XmlParserError, OmbString("Failed to open file: ") + absolute);
    std::ostringstream text;
    text << in.rdbuf();
    in.close();
    TiXmlDocument document;
    OmbString parseError;
    if (!OmbXmlUtilities::loadXmlFromString(OmbString(text.str()), document, parseError))
        OMB_THROW(XmlParserError, absolute + parseError + OmbString(": Not a valid Xml file."));

    CurrentDirectory directory(path.parent_path());
    OmbRef<OmbConfiguration> configuration = load(document, absolute);
    const TiXmlElement* root = document.RootElement();
    if (const char* shared = root->Attribute("Shared"); shared && std::string_view(shared) == "true")
        OmbRuntime::sharedConfig(absolute, OmbRef<OmbEngineObject>(configuration));
    loaded_[absolute] = configuration;
    return configuration;
}

OmbRef<OmbConfiguration> OmbXmlParserContext::loadString(const OmbString& text) {
    TiXmlDocument document;
    OmbString parseError;
    if (!OmbXmlUtilities::loadXmlFromString(text, document, parseError))
        OMB_THROW(XmlParserError, parseError + OmbString(": Not a valid Xml string."));
    return load(document, OmbString());
}

OmbRef<OmbConfiguration> OmbXmlParserContext::load(TiXmlDocument& document, const OmbString& path) {
    TiXmlElement* root = document.RootElement();
    if (!root) OMB_THROW(XmlParserError, OmbString::literal("The document has no root element."));
    for (const TiXmlNode* node = document.FirstChild(); node && comment_.empty(); node = node->NextSibling())
        if (const TiXmlComment* comment = node->ToComment()) comment_ = OmbString(comment->Value());
    OmbRef<OmbConfiguration> configuration(new OmbConfiguration);
    Pushed<decltype(configurations_), OmbRef<OmbConfiguration>> pushedConfiguration(configurations_, configuration);
    Pushed<decltype(scopes_), std::map<OmbString, OmbRef<OmbRefCnt>>> pushedScope(scopes_, {});
    Pushed<decltype(files_), OmbString> pushedFile(files_, path);
    readConfigurationElement(root);
    return configuration;
}

void OmbXmlParserContext::readConfigurationElement(TiXmlElement* element) {
    if (OmbString(element->Value()) != OmbString::literal("Configuration"))
        OmbXmlParser::fail(element, OmbString("The root element must be Configuration, not '") +
                                        OmbString(element->Value()) + OmbString("'."));
    if (element->FirstChildElement("OmbravelStudioBlob")) OMB_THROW(IncomleteStudioFile);
    const char* ns = element->Attribute("Namespace");
    if (!ns) OMB_THROW(XmlParserError, OmbString::literal("Namespace attribute missing on Configuration element."));
    NamespaceTransaction transaction(*this, OmbString(ns));
    setConfigNamespace(OmbString(ns));

    const std::uint32_t outerVersion = version_;
    version_ = 0x05000000;
    if (const char* version = element->Attribute("Version")) {
        version_ = packVersion(OmbString(version));
        if (version_ > engineVersion)
            OmbLog::warning(Omb_formatMessage(
                "Attempting to load a configuration file created with a later version of Ombravel Studio. File "
                "version is %1%, this Ombravel Engine version is 5.4.0.3.",
                {OmbString(version)}));
    }
    struct RestoreVersion {
        std::uint32_t& version;
        std::uint32_t saved;
        ~RestoreVersion() { version = saved; }
    } restore{version_, outerVersion};

    for (TiXmlElement* child = element->FirstChildElement(); child; child = child->NextSiblingElement())
        if (OmbString(child->Value()) != OmbString::literal("Plugins")) createInstance(child);
}

OmbRef<OmbRefCnt> OmbXmlParserContext::createInstance(TiXmlElement* element) {
    struct Depth {
        int& depth;
        explicit Depth(int& d) : depth(++d) {}
        ~Depth() { --depth; }
    } depth(depth_);
    if (depth_ > OmbXmlParser::maximumDepth)
        OmbXmlParser::fail(element, OmbString("Elements are nested more than ") +
                                        OmbString(std::to_string(OmbXmlParser::maximumDepth)) +
                                        OmbString(" levels deep. "));
    const OmbString tag(element->Value());
    ClassMetaData* metaData = getClassMetaData(tag, false);
    if (!metaData) {
        const OmbString plugin = oecore::detail::pluginOfClass(tag);
        if (!plugin.empty()) {
            loadPluginByName(plugin);
            metaData = getClassMetaData(tag, false);
        }
    }
    if (!metaData)
        OmbXmlParser::fail(element, OmbString("Cannot create instance of class ") + tag +
                                        OmbString(" since the type has not been registered. "));
    OmbRef<OmbRefCnt> result = metaData->createInstance(*this, element);
    if (auto* extension = dynamic_cast<MarkupExtension*>(result.get())) result = extension->provideValue(*this);
    if (result && !namespace_.empty()) registerName(element, result);
    if (result && datasetInitialization_ == OmbDataSetInitialization::Immediate && OmbXmlParser::initializeDataSet)
        OmbXmlParser::initializeDataSet(*result);
    return result;
}

void OmbXmlParserContext::registerName(TiXmlElement* element, const OmbRef<OmbRefCnt>& object) {
    const OmbString name = OmbXmlParser::getInstanceName(*this, element);
    if (name.empty() || scopes_.empty()) return;
    const OmbRef<OmbRefCnt> isPublic = OmbXmlParser::parsePropertyGeneric(*this, element, OmbString::literal("Public"),
                                                                          OmbString::literal("bool"), false);
    const OmbString qualified = namespace_ + OmbString::literal(".") + name;
    scopes_.back()[qualified] = object;
    const auto* flag = dynamic_cast<const OmbBoxedValue<bool>*>(isPublic.get());
    if (flag && flag->value() && !configurations_.empty()) configurations_.back()->add(qualified, object);
}

void OmbXmlParserContext::loadPluginByName(const OmbString& name) {
    for (const auto& plugin : plugins_)
        if (plugin->name == name) return;
    auto plugin = std::make_unique<Plugin>();
    plugin->name = name;
    if (name.empty()) {
        for (auto& metaData : oecore::detail::coreMetaData()) {
            registerClass(metaData.get());
            ownMetaData_.push_back(std::move(metaData));
        }
        for (const OmbEnumDescription* e : OmbEnumDescription::all())
            registerTypeConverter(e->typeName(), enumConverter(*e));
        for (const auto& [typeName, converter] : oecore::detail::libraryTypeConverters())
            registerTypeConverter(typeName, converter);
    } else {
        plugin->instance = oecore::detail::loadPluginModule(name);
        plugin->instance->registerClasses(*this);
    }
    plugins_.push_back(std::move(plugin));
}

OmbXmlParserContext::NamespaceTransaction::NamespaceTransaction(OmbXmlParserContext& context, const OmbString& ns)
    : context_(context), previous_(context.namespace_) {
    context_.namespace_ = ns;
}

OmbXmlParserContext::NamespaceTransaction::~NamespaceTransaction() { context_.namespace_ = previous_; }

StackedProperty::StackedProperty(OmbXmlParserContext& context, const OmbString& name, const OmbRef<OmbRefCnt>& value)
    : context_(context), name_(name) {
    context_.pushProperty(name, value);
}

StackedProperty::~StackedProperty() { context_.popProperty(name_); }
