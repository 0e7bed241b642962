#include "registry.h"

#include <oecore/core/stringutils.h>

#include <strings.h>
#include <fstream>

namespace oecore::detail {

namespace {

// Registry names compare without regard to (ASCII) case; the file may hold
// any bytes, so no Unicode case mapping is attempted.
bool sameName(const OmbString& a, const OmbString& b) {
    return a.size() == b.size() && ::strncasecmp(a.dataUtf8(), b.dataUtf8(), a.size()) == 0;
}

}  // namespace

bool isRegistryRootKey(const OmbString& root) {
    for (const char* known :
         {"HKEY_CLASSES_ROOT", "HKEY_CURRENT_CONFIG", "HKEY_CURRENT_USER", "HKEY_LOCAL_MACHINE", "HKEY_USERS"})
        if (root == OmbString::literal(known)) return true;
    return false;
}

bool readRegistryValue(const OmbString& key, const OmbString& valueName, OmbString& value) {
    const OmbString file = OmbStringUtils::getEnvironmentVariable(OmbString::literal("OMBRAVEL_ENGINE_REGISTRY_FILE"));
    if (file.empty()) return false;
    std::ifstream in(file.dataUtf8());
    const std::vector<OmbString> space{OmbString::literal(" "), OmbString::literal("\t"), OmbString::literal("\r")};
    const OmbString section = OmbString::literal("[") + key + OmbString::literal("]");
    bool inSection = false;
    OmbString line;
    while (OmbStringUtils::readLine(in, line)) {
        line = OmbStringUtils::strip(line, space);
        if (line.startsWith(OmbString::literal("["))) {
            inSection = sameName(line, section);
            continue;
        }
        const std::ptrdiff_t equals = line.find(OmbString::literal("="));
        if (!inSection || equals < 0) continue;
        const OmbString name = OmbStringUtils::strip(line.substr(0, static_cast<std::size_t>(equals)), space);
        if (!sameName(name, valueName)) continue;
        value = line.substr(static_cast<std::size_t>(equals) + 1);
        return true;
    }
    return false;
}

}  // namespace oecore::detail
