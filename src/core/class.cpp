#include <oecore/core/class.h>
#include <oecore/core/engineobject.h>

#include <mutex>
#include <set>
#include <string>

namespace {

struct ClassList {
    std::mutex mutex;
    std::vector<OmbClass*> records;
};

ClassList& classList() {
    static ClassList list;
    return list;
}

struct PluginRow {
    OmbPluginId id;
    const char* name;
    const char* module;
};

// Id 10 belongs to a module this library does not know; the table ends with id 0.
constexpr PluginRow pluginTable[] = {
    {1, "DataSets", "OEDataSets"},  {2, "Operators", "OEOperators"},
    {3, "DwgDxf", "OEDwgDxf"},      {4, "Ecw", "OEEcw"},
    {5, "CM93", "OECM93"},          {6, "MrSid", "OEMrSid"},
    {7, "Printer", "OEPrinter"},    {8, "CustomObjects", "OECustomObjects"},
    {9, "Test", "OETest"},          {11, "Ogc", "OEOgc"},
    {12, "Tactical", "OETactical"}, {13, "Catalog", "OECatalog"},
    {0, nullptr, nullptr},
};

}  // namespace

OmbClass::OmbClass(OmbClass* base, OmbPluginId plugin, const char* name)
    : base_(base), plugin_(plugin), name_(name ? name : "") {
    ClassList& list = classList();
    std::lock_guard lock(list.mutex);
    list.records.push_back(this);
}

bool OmbClass::isA(const OmbClass* cls) const noexcept {
    for (const OmbClass* c = this; c; c = c->base_)
        if (c == cls) return true;
    return false;
}

std::vector<OmbClass*> OmbClass::all() {
    ClassList& list = classList();
    std::lock_guard lock(list.mutex);
    return list.records;
}

OmbString pluginName(OmbPluginId id) {
    for (const PluginRow* row = pluginTable; row->id != 0; ++row)
        if (row->id == id) return OmbString::literal(row->name);
    return OmbString::literal("Unknown plugin");
}

OmbString pluginLibName(const OmbString& name) {
    for (const PluginRow* row = pluginTable; row->id != 0; ++row)
        if (name == OmbString::literal(row->name)) return OmbString::literal(row->module);
    return OmbString();
}

const char* Omb_templateClassName(const char* kind, const char* argument) {
    static std::mutex mutex;
    static std::set<std::string> names;
    std::lock_guard lock(mutex);
    return names.insert(std::string(kind) + "<" + argument + ">").first->c_str();
}
