// Run-time class records and the table of extension modules.
#pragma once

#include <oecore/core/string.h>

#include <vector>

// The extension module a class belongs to; 0 for classes of this library.
using OmbPluginId = int;

// One static record per engine class. Records link to their base class's
// record up to OmbEngineObject, and live for the rest of the process.
class OmbClass {
public:
    OmbClass(OmbClass* base, OmbPluginId plugin, const char* name = "");
    OmbClass(const OmbClass&) = delete;
    OmbClass& operator=(const OmbClass&) = delete;

    OmbClass* baseClass() const noexcept { return base_; }
    OmbPluginId plugin() const noexcept { return plugin_; }
    // The configuration element name of the class.
    const char* name() const noexcept { return name_; }
    // Whether this record is cls or derives from it.
    bool isA(const OmbClass* cls) const noexcept;

    // Every record created so far, in creation order.
    static std::vector<OmbClass*> all();

private:
    OmbClass* base_;
    OmbPluginId plugin_;
    const char* name_;
};

// The plug-in's name, or "Unknown plugin" for an id not in the table.
OmbString pluginName(OmbPluginId id);
// The module base name for a plug-in name ("DataSets" -> "OEDataSets"), or
// the empty string for an unknown plug-in.
OmbString pluginLibName(const OmbString& pluginName);
