#include <oecore/core/log.h>
#include <oecore/core/screen.h>
#include <oecore/core/stringutils.h>

#include <string>

namespace {

constexpr std::int64_t linuxSystemDpi = 96;
constexpr std::int64_t fallbackDpi = 96;

void override(const char* variable, std::int64_t& dpi) {
    const OmbString value = OmbStringUtils::getEnvironmentVariable(OmbString::literal(variable));
    if (!value.empty()) dpi = OmbStringUtils::atoi64(value);
}

OmbString number(std::int64_t n) { return OmbString(std::to_string(n)); }

}  // namespace

OmbScreen OmbScreen::fromSystem() { return OmbScreen(linuxSystemDpi, linuxSystemDpi); }

OmbScreen::OmbScreen(std::int64_t systemDpiX, std::int64_t systemDpiY) : dpiX_(systemDpiX), dpiY_(systemDpiY) {
    override("OMBRAVEL_ENGINE_5_DPI_X", dpiX_);
    override("OMBRAVEL_ENGINE_5_DPI_Y", dpiY_);
    if (dpiX_ <= 0 || dpiY_ <= 0) {
        OmbLog::error("Unable to get screen resolution from system, using default value.");
        dpiX_ = dpiY_ = fallbackDpi;
    }
    if (systemDpiX <= 0 || systemDpiY <= 0)
        OmbLog::info(Omb_formatMessage("System screen resolution (X, Y): (%1%, %2%) DPI.",
                                       {number(systemDpiX), number(systemDpiY)}));
    OmbLog::info(Omb_formatMessage("Used screen resolution (X, Y): (%1%, %2%) DPI.", {number(dpiX_), number(dpiY_)}));
}
