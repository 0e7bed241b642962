// Holds the runtime's configuration lock for reading while an engine-object
// graph is walked (reusing a write lock the calling thread already holds).
// Every graph walk goes through this guard, so the lock is taken in one place.
#pragma once

namespace oecore::detail {

class ConfigurationReadScope {
public:
    ConfigurationReadScope();
    ~ConfigurationReadScope();
    ConfigurationReadScope(const ConfigurationReadScope&) = delete;
    ConfigurationReadScope& operator=(const ConfigurationReadScope&) = delete;
};

}  // namespace oecore::detail
