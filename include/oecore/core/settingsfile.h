// OmbSettingsFile: the library's own settings, read once at start-up from
// the file beside the executable (its full path plus ".ini") and from
// OMBRAVEL_ENGINE_... environment variables.
#pragma once

#include <oecore/core/ref.h>
#include <oecore/core/refcnt.h>
#include <oecore/core/string.h>

#include <cstdint>

class OmbSettingsFile : public OmbRefCnt {
public:
    // The settings of the running executable's file; never fails: a missing
    // or unreadable file gives the defaults (plus the environment).
    static OmbRef<OmbSettingsFile> load();
    static OmbRef<OmbSettingsFile> load(const OmbString& fileName);
    // The executable's full path plus ".ini".
    static OmbString defaultFileName();

    const OmbString& logFileName() const noexcept { return logFileName_; }
    bool useOpenGLStencilBuffer() const noexcept { return openGLStencilBuffer_; }
    bool useOpenGLNonPowerOfTwoTextures() const noexcept { return openGLNonPowerOfTwoTextures_; }
    bool useOpenGLHiddenWindow() const noexcept { return openGLHiddenWindow_; }
    bool useDirectXMultiSample2() const noexcept { return directXMultiSample2_; }
    bool useDirectXNonPowerOfTwoTextures() const noexcept { return directXNonPowerOfTwoTextures_; }
    bool useDirectXVSync() const noexcept { return directXVSync_; }
    bool useSafeGdalLocking() const noexcept { return safeGdalLocking_; }
    bool displayTacticalPointTextHalo() const noexcept { return tacticalPointTextHalo_; }
    std::int64_t catalogTimeout() const noexcept { return catalogTimeout_; }
    const OmbString& memoryFragmentationLog() const noexcept { return memoryFragmentationLog_; }

private:
    struct BoolKey;
    static const BoolKey boolKeys[];

    OmbSettingsFile() = default;
    // Returns whether the environment is to be ignored.
    bool readFile(const OmbString& fileName);
    void readEnvironment();

    OmbString logFileName_;
    bool openGLStencilBuffer_ = true;
    bool openGLNonPowerOfTwoTextures_ = true;
    bool openGLHiddenWindow_ = true;
    bool directXMultiSample2_ = false;
    bool directXNonPowerOfTwoTextures_ = true;
    bool directXVSync_ = true;
    bool safeGdalLocking_ = false;
    bool tacticalPointTextHalo_ = true;
    std::int64_t catalogTimeout_ = 10;
    OmbString memoryFragmentationLog_;
};
