// The registry that RegistryValue reads. Linux has none, so it is an
// INI-style file named by OMBRAVEL_ENGINE_REGISTRY_FILE: sections are key
// paths ("[HKEY_CURRENT_USER\Software\Demo]"), lines "Name=Value".
#pragma once

#include <oecore/core/string.h>

namespace oecore::detail {

bool isRegistryRootKey(const OmbString& root);
// The value under the key; false when the file, the key or the value is missing.
bool readRegistryValue(const OmbString& key, const OmbString& valueName, OmbString& value);

}  // namespace oecore::detail
