#include "pluginloader.h"

#include <oecore/core/class.h>
#include <oecore/core/exception.h>
#include <oecore/core/stringbuilder.h>
#include <oecore/core/stringutils.h>

#include <dlfcn.h>

#include <filesystem>
#include <vector>

namespace fs = std::filesystem;

namespace oecore::detail {

namespace {

struct PluginClass {
    const char* className;
    const char* plugin;
};

// The classes that live in extension modules rather than in the library.
constexpr PluginClass pluginClasses[] = {
    {"ShapefileDataSet", "DataSets"}, {"GdalDataSet", "DataSets"},
    {"OgrDataSet", "DataSets"},       {"BufferZoneOperator", "Operators"},
    {"GridGenerator", "Operators"},   {"CM93VectorDataSet", "CM93"},
    {"OgcWmsLayer", "Ogc"},           {"TacticalVisualizer", "Tactical"},
    {"PrintAreaMode", "Printer"},     {"TestPluginObject", "Test"},
};

// The folder libOECore.so was loaded from.
fs::path libraryFolder() {
    Dl_info info{};
    if (dladdr(reinterpret_cast<void*>(&libraryFolder), &info) == 0 || !info.dli_fname) return {};
    return fs::path(info.dli_fname).parent_path();
}

std::vector<fs::path> candidates(const OmbString& baseName) {
    const std::string file = "lib" + std::string(baseName.view()) + ".so";
    std::vector<fs::path> paths;
    if (const fs::path folder = libraryFolder(); !folder.empty()) paths.push_back(folder / file);
    std::vector<OmbString> extra;
    OmbStringUtils::split(OmbStringUtils::getEnvironmentVariable(OmbString::literal("OMBRAVEL_ENGINE_MODULE_PATH")),
                          ':', extra);
    for (const OmbString& folder : extra)
        if (!folder.empty()) paths.push_back(fs::path(std::string(folder.view())) / file);
    return paths;
}

}  // namespace

OmbString pluginOfClass(const OmbString& className) {
    for (const PluginClass& c : pluginClasses)
        if (className == OmbString::literal(c.className)) return OmbString::literal(c.plugin);
    return OmbString();
}

void* openModule(const OmbString& baseName, OmbString& error) {
    OmbStringBuilder reasons;
    bool found = false;
    for (const fs::path& path : candidates(baseName)) {
        std::error_code ignored;
        if (!fs::exists(path, ignored)) continue;
        found = true;
        if (void* handle = dlopen(path.c_str(), RTLD_NOW | RTLD_LOCAL)) return handle;
        reasons << " " << path.string() << ": " << dlerror() << ";";
    }
    if (!found) {
        reasons << " not found in";
        for (const fs::path& path : candidates(baseName)) reasons << " " << path.parent_path().string();
        reasons << " (set OMBRAVEL_ENGINE_MODULE_PATH to add folders)";
    }
    error = reasons.str();
    return nullptr;
}

std::unique_ptr<OmbPluginInstance> loadPluginModule(const OmbString& pluginName) {
    const OmbString baseName = pluginLibName(pluginName);
    if (baseName.empty()) OMB_THROW(UnknownPlugin, pluginName);
    OmbString reasons;
    void* handle = openModule(baseName, reasons);
    if (!handle) OMB_THROW(XmlParserError, OmbString("Failed to load plugin ") + pluginName + OmbString(":") + reasons);
    const auto create = reinterpret_cast<OmbCreatePluginInstanceFunction>(dlsym(handle, "CreatePluginInstance"));
    if (!create)
        OMB_THROW(XmlParserError,
                  OmbString("Failed to retrieve CreatePluginInstance function for plugin ") + pluginName);
    std::unique_ptr<OmbPluginInstance> instance(create(OmbPluginAbiVersion));
    if (!instance)
        OMB_THROW(XmlParserError, OmbString("Failed to load plugin ") + pluginName +
                                      OmbString(": the module was built for another version of OECore (ABI ") +
                                      OmbString(std::to_string(OmbPluginAbiVersion)) + OmbString(" expected)"));
    return instance;
}

}  // namespace oecore::detail
