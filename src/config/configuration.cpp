#include <oecore/config/configuration.h>
#include <oecore/config/resourceresolver.h>
#include <oecore/core/exception.h>
#include <oecore/core/log.h>
#include <oecore/core/runtime.h>
#include <oecore/core/stringbuilder.h>

#include <dlfcn.h>

#include <filesystem>
#include <string>

#include <tinyxml.h>

#include "documentwriter.h"
#include "pluginloader.h"

OMB_DEFINE_ENGINE_CLASS(OmbConfiguration, OmbEngineObject, "Configuration", 0)
OMB_DEFINE_ENGINE_CLASS(OmbConfigurationParameters, OmbEngineObject, "ConfigurationParameters", 0)

std::mutex OmbConfiguration::mutex_;

void OmbConfigurationParameters::add(const OmbString& key, std::int64_t value) {
    values_[key] = OmbString(std::to_string(value));
}

void OmbConfigurationParameters::add(const OmbString& key, unsigned long value) {
    values_[key] = OmbString(std::to_string(value));
}

void OmbConfigurationParameters::add(const OmbString& key, double value) {
    OmbStringBuilder text;
    text << OmbFormat::real(value);
    values_[key] = text.str();
}

void OmbConfigurationParameters::add(const OmbString& key, bool value) {
    values_[key] = OmbString::literal(value ? "true" : "false");
}

void OmbConfigurationParameters::add(const OmbString& key, const OmbString& value) { values_[key] = value; }

bool OmbConfigurationParameters::get(const OmbString& key, OmbString& out) const {
    const auto it = values_.find(key);
    if (it == values_.end()) return false;
    out = it->second;
    return true;
}

OmbRef<OmbConfiguration> OmbRuntime::loadFile(const OmbString& fileName,
                                              const OmbRef<OmbConfigurationParameters>& parameters,
                                              OmbDataSetInitialization dataSetInitialization,
                                              const OmbRef<OmbResourceResolver>& resolver) {
    return OmbXmlParser::loadFile(fileName, parameters, dataSetInitialization, resolver);
}

OmbRef<OmbConfiguration> OmbRuntime::loadString(const OmbString& text,
                                                const OmbRef<OmbConfigurationParameters>& parameters,
                                                OmbDataSetInitialization dataSetInitialization,
                                                const OmbRef<OmbResourceResolver>& resolver) {
    return OmbXmlParser::loadString(text, parameters, dataSetInitialization, resolver);
}

OmbConfiguration::OmbConfiguration(const OmbString& fileName, OmbDataSetInitialization datasetInitialization,
                                   const OmbRef<OmbResourceResolver>& resolver) {
    if (!OmbRuntime::isInitialized()) OMB_THROW(OmbravelEngineNotInitialized);
    const std::string extension = std::filesystem::path(std::string(fileName.view())).extension().string();
    if (extension == ".mpx") {
        loadMapPackage(fileName, resolver);
        return;
    }
    std::lock_guard lock(mutex_);
    copyFrom(*OmbRuntime::loadFile(fileName, OmbRef<OmbConfigurationParameters>(), datasetInitialization, resolver));
}

OmbConfiguration::OmbConfiguration(const OmbString& fileName, const OmbRef<OmbConfigurationParameters>& params,
                                   OmbDataSetInitialization datasetInitialization,
                                   const OmbRef<OmbResourceResolver>& resolver) {
    if (!OmbRuntime::isInitialized()) OMB_THROW(OmbravelEngineNotInitialized);
    std::lock_guard lock(mutex_);
    copyFrom(*OmbRuntime::loadFile(fileName, params, datasetInitialization, resolver));
}

void OmbConfiguration::copyFrom(const OmbConfiguration& loaded) {
    publicObjects_ = loaded.publicObjects_;
    defaultNamespace_ = loaded.defaultNamespace_;
    comment_ = loaded.comment_;
}

// Map packages are opened by the data-set module.
void OmbConfiguration::loadMapPackage(const OmbString& fileName, const OmbRef<OmbResourceResolver>& resolver) {
    if (resolver)
        OMB_THROW(GenericException, OmbString::literal("You cannot specify a resource resolver when loading a "
                                                       "configuration from a map package."));
    using Load = OmbConfiguration* (*)(const char* fileName);
    OmbString reasons;
    void* module = oecore::detail::openModule(pluginLibName(OmbString::literal("DataSets")), reasons);
    const auto load = module ? reinterpret_cast<Load>(dlsym(module, "LoadConfigurationFromMapPackage")) : nullptr;
    if (!load)
        OMB_THROW(GenericException, OmbString::literal("Could not find LoadConfigurationFromMapPackage entry point."));
    const OmbRef<OmbConfiguration> loaded(load(fileName.dataUtf8()));
    if (!loaded)
        OMB_THROW(GenericException, Omb_formatMessage("Could not load map configuration from %1%.", {fileName}));
    copyFrom(*loaded);
}

OmbRef<OmbConfiguration> OmbConfiguration::fromString(const OmbString& text,
                                                      const OmbRef<OmbConfigurationParameters>& params,
                                                      OmbDataSetInitialization datasetInitialization,
                                                      const OmbRef<OmbResourceResolver>& resolver) {
    if (!OmbRuntime::isInitialized()) OMB_THROW(OmbravelEngineNotInitialized);
    return OmbRuntime::loadString(text, params, datasetInitialization, resolver);
}

OmbRef<OmbConfiguration> OmbConfiguration::fromString(const OmbString& text,
                                                      OmbDataSetInitialization datasetInitialization,
                                                      const OmbRef<OmbResourceResolver>& resolver) {
    return fromString(text, OmbRef<OmbConfigurationParameters>(), datasetInitialization, resolver);
}

void OmbConfiguration::toXml(OmbXmlSerializer&, TiXmlElement*, TiXmlElement*, const char*, const char*, bool) const {
    OMB_THROW(GenericException, OmbString::literal("Can't save a Configuration instance to a new Configuration; try "
                                                   "saving the objects inside the configuration instead."));
}

OmbRef<OmbEngineObject> OmbConfiguration::getPublicObject(const OmbString& name) const {
    auto it = publicObjects_.find(name);
    if (it == publicObjects_.end()) it = publicObjects_.find(defaultNamespace_ + OmbString::literal(".") + name);
    if (it == publicObjects_.end()) return OmbRef<OmbEngineObject>();
    return omb_dynamic_cast<OmbEngineObject>(it->second);
}

OmbRef<OmbRefCnt> OmbConfiguration::getAny(const OmbString& name) const {
    const auto it = publicObjects_.find(name);
    return it == publicObjects_.end() ? OmbRef<OmbRefCnt>() : it->second;
}

OmbRef<OmbVec<OmbString>> OmbConfiguration::publicNames() const {
    OmbRef<OmbVec<OmbString>> names(new OmbVec<OmbString>);
    for (const auto& [name, object] : publicObjects_) names->add(name);
    return names;
}

OmbRef<OmbEngineObjectVec> OmbConfiguration::publicObjects() const {
    OmbRef<OmbEngineObjectVec> objects(new OmbEngineObjectVec);
    for (const auto& [name, object] : publicObjects_)
        if (const OmbRef<OmbEngineObject> engineObject = omb_dynamic_cast<OmbEngineObject>(object))
            objects->add(engineObject);
    return objects;
}

void OmbConfiguration::add(const OmbString& name, const OmbRef<OmbRefCnt>& object) { publicObjects_[name] = object; }

void OmbConfiguration::save(const OmbString& fileName, const OmbRef<OmbEngineObject>& object, OmbSaveMode mode) {
    object->save(fileName, mode);
}

OmbString OmbConfiguration::save(const OmbRef<OmbEngineObject>& object, OmbSaveMode mode) { return object->save(mode); }

void OmbConfiguration::savePublicObjects(const OmbString& fileName, OmbSaveMode mode) const {
    const OmbRef<OmbEngineObjectVec> objects = publicObjects();
    std::vector<const OmbEngineObject*> list;
    for (const OmbRef<OmbEngineObject>& object : *objects) list.push_back(object.get());
    TiXmlDocument document;
    oecore::detail::buildDocument(list, oecore::detail::namespaceOfFile(fileName), mode, comment_, document);
    oecore::detail::writeDocument(document, fileName);
}
