#include "configurationscope.h"

namespace oecore::detail {

// The configuration lock is created by the runtime; until the runtime exists
// there is no lock to take and graph walks run unguarded.
ConfigurationReadScope::ConfigurationReadScope() = default;
ConfigurationReadScope::~ConfigurationReadScope() = default;

}  // namespace oecore::detail
