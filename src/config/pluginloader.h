// Extension modules: libOE<Name>.so beside libOECore.so or on
// OMBRAVEL_ENGINE_MODULE_PATH, loaded with dlopen.
#pragma once

#include <oecore/config/xmlparser.h>
#include <oecore/core/string.h>

#include <memory>

namespace oecore::detail {

// The plug-in that provides a class, or the empty string.
OmbString pluginOfClass(const OmbString& className);

// Loads the module of a plug-in and creates its instance. Throws
// OmbXUnknownPlugin for a name not in the table and OmbXXmlParserError,
// naming the paths tried, when the module is missing, does not load, lacks
// CreatePluginInstance or was built for another library version.
std::unique_ptr<OmbPluginInstance> loadPluginModule(const OmbString& pluginName);

// The module's handle, or null with the reasons in error; modules stay
// loaded for the life of the process, since objects they created may live on.
void* openModule(const OmbString& baseName, OmbString& error);

}  // namespace oecore::detail
