#include <oecore/attr/atoms.h>
#include <oecore/core/exception.h>
#include <oecore/core/log.h>
#include <oecore/core/runtime.h>

#include <mutex>
#include <unordered_map>

namespace {

struct AtomTable {
    std::mutex mutex;
    std::unordered_map<OmbString, OmbAtom> byName;
    std::unordered_map<OmbAtom, OmbString> byAtom;
    std::unordered_map<OmbString, OmbAtom> constants;
    OmbAtom next = 1;
    OmbAtom highestConstant = 0;

    AtomTable() {
        // The empty string is the constant 0.
        constants.emplace(OmbString(), 0);
        byName.emplace(OmbString(), 0);
        byAtom.emplace(0, OmbString());
    }

    OmbAtom add(const OmbString& name) {
        const OmbAtom atom = next++;
        byName.emplace(name, atom);
        byAtom.emplace(atom, name);
        return atom;
    }
};

AtomTable& table() {
    static AtomTable t;
    return t;
}

}  // namespace

OmbAtom OmbAtoms::atom(const OmbString& name) {
    AtomTable& t = table();
    std::lock_guard lock(t.mutex);
    const auto it = t.byName.find(name);
    return it != t.byName.end() ? it->second : t.add(name);
}

OmbAtom OmbAtoms::atom(const OmbAtomConstant* constant) {
    AtomTable& t = table();
    std::lock_guard lock(t.mutex);
    const OmbString& name = constant->name();
    if (const auto it = t.constants.find(name); it != t.constants.end()) return it->second;
    const auto known = t.byName.find(name);
    const OmbAtom atom = known != t.byName.end() ? known->second : t.add(name);
    t.constants.emplace(name, atom);
    if (atom > t.highestConstant) t.highestConstant = atom;
    return atom;
}

OmbString OmbAtoms::name(OmbAtom atom) {
    AtomTable& t = table();
    std::lock_guard lock(t.mutex);
    const auto it = t.byAtom.find(atom);
    if (it == t.byAtom.end()) OMB_THROW(AtomsIllegalAtom);
    return it->second;
}

bool OmbAtoms::isAtomString(const OmbString& text) { return !text.empty() && text.dataUtf8()[0] == '#'; }

namespace {

// Forgets every atom but the constants; the next ones follow the highest.
void keepOnlyConstants(AtomTable& t) {
    std::lock_guard lock(t.mutex);
    t.byName = t.constants;
    t.byAtom.clear();
    for (const auto& [name, atom] : t.constants) t.byAtom.emplace(atom, name);
    t.next = t.highestConstant + 1;
}

}  // namespace

void OmbAtoms::init() {
    OmbLog::info("Initializing atom table");
    keepOnlyConstants(table());
}

void OmbAtoms::cleanUp() {
    OmbLog::info("Destroying atom table");
    keepOnlyConstants(table());
}

// The runtime keeps the constants and forgets the other atoms at each start.
[[maybe_unused]] static const bool atomTableRegistered =
    (OmbRuntime::registerService(OmbRuntime::Service::Atoms, OmbAtoms::init, OmbAtoms::cleanUp), true);
