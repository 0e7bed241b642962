#include <oecore/config/resourceresolver.h>
#include <oecore/core/runtime.h>

#include <filesystem>

OMB_DEFINE_ENGINE_CLASS(OmbResourceResolver, OmbEngineObject, "ResourceResolver", 0)

OmbString OmbResourceResolver::resolveString(const OmbString& path, const OmbString& fileName) const {
    return evaluatePath(path, fileName);
}

OmbString OmbResourceResolver::evaluatePath(const OmbString& base, const OmbString& path) {
    const std::filesystem::path p(std::string(path.view()));
    if (p.is_absolute() || base.empty()) return OmbString(p.lexically_normal().string());
    return OmbString((std::filesystem::path(std::string(base.view())) / p).lexically_normal().string());
}

// The runtime's resolver lives with the configuration language; it keeps no
// state, so one instance serves every load of the process.
const OmbRef<OmbResourceResolver>& OmbRuntime::defaultResourceResolver() {
    static const OmbRef<OmbResourceResolver> resolver(new OmbResourceResolver);
    return resolver;
}
