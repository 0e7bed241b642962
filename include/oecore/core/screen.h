// OmbScreen: the resolution of the display that maps are drawn for.
#pragma once

#include <cstdint>

class OmbScreen {
public:
    // The system's resolution (96 DPI on Linux, where a library has no
    // display of its own to ask), overridden by OMBRAVEL_ENGINE_5_DPI_X and
    // OMBRAVEL_ENGINE_5_DPI_Y when set and non-empty. A value that is not
    // positive is logged as an error and both fall back to 96.
    static OmbScreen fromSystem();
    OmbScreen(std::int64_t systemDpiX, std::int64_t systemDpiY);

    std::int64_t dpiX() const noexcept { return dpiX_; }
    std::int64_t dpiY() const noexcept { return dpiY_; }
    // The size of one screen pixel in metres.
    double pixWidth() const noexcept { return 1.0 / (static_cast<double>(dpiX_) / 0.0254); }
    double pixHeight() const noexcept { return 1.0 / (static_cast<double>(dpiY_) / 0.0254); }

private:
    std::int64_t dpiX_;
    std::int64_t dpiY_;
};
