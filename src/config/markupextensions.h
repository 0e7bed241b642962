// The markup extensions of the configuration language: ResourceReference,
// EnvironmentVariable, RegistryValue, ConfigurationParameter and Path.
#pragma once

#include <oecore/config/classmetadata.h>

#include <memory>
#include <vector>

namespace oecore::detail {

std::vector<std::unique_ptr<ClassMetaData>> markupExtensionMetaData();

}  // namespace oecore::detail
