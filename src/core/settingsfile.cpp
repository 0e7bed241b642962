#include <oecore/core/settingsfile.h>
#include <oecore/core/stringutils.h>

#include <limits.h>
#include <unistd.h>
#include <cctype>
#include <fstream>
#include <vector>

namespace {

// Settings files are small; anything larger is not one.
constexpr std::streamsize maximumFileSize = 1 << 20;

const std::vector<OmbString>& spaceAndTab() {
    static const std::vector<OmbString> list{OmbString::literal(" "), OmbString::literal("\t"),
                                             OmbString::literal("\r")};
    return list;
}

// "1"/"on" and "0"/"off" in any case; anything else keeps the default. The
// comparison is ASCII-only: a settings file may hold any bytes at all.
bool toBool(const OmbString& value, bool defaultValue) {
    std::string v(OmbStringUtils::strip(value, ' ').view());
    for (char& c : v) c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
    if (v == "1" || v == "on") return true;
    if (v == "0" || v == "off") return false;
    return defaultValue;
}

std::int64_t toTimeout(const OmbString& value) {
    const std::int64_t seconds = OmbStringUtils::atoi64(value);
    return seconds == 0 ? 10 : seconds;
}

// A variable that is set and not empty.
bool environment(const char* name, OmbString& value) {
    value = OmbStringUtils::getEnvironmentVariable(OmbString::literal(name));
    return !value.empty();
}

// An on-by-default setting that the environment can only turn off.
void turnOffUnlessOne(const char* name, bool& setting) {
    OmbString value;
    if (environment(name, value) && value != OmbString::literal("1")) setting = false;
}

// An off-by-default setting that the environment can only turn on.
void turnOnIfOne(const char* name, bool& setting) {
    OmbString value;
    if (environment(name, value) && value == OmbString::literal("1")) setting = true;
}

}  // namespace

OmbString OmbSettingsFile::defaultFileName() {
    std::vector<char> path(PATH_MAX + 1);
    const ssize_t length = ::readlink("/proc/self/exe", path.data(), path.size() - 1);
    if (length <= 0) return OmbString();
    return OmbString(path.data(), path.data() + length) + OmbString::literal(".ini");
}

OmbRef<OmbSettingsFile> OmbSettingsFile::load() { return load(defaultFileName()); }

OmbRef<OmbSettingsFile> OmbSettingsFile::load(const OmbString& fileName) {
    OmbRef<OmbSettingsFile> settings(new OmbSettingsFile);
    if (!settings->readFile(fileName)) settings->readEnvironment();
    return settings;
}

bool OmbSettingsFile::readFile(const OmbString& fileName) {
    std::ifstream in(fileName.dataUtf8(), std::ios::binary);
    if (!in) return false;
    std::string text(maximumFileSize, '\0');
    in.read(text.data(), maximumFileSize);
    text.resize(static_cast<std::size_t>(in.gcount()));

    bool ignoreEnvironment = false;
    std::vector<OmbString> lines;
    std::vector<OmbString> parts;
    OmbStringUtils::split(OmbString(text), '\n', lines);
    for (const OmbString& rawLine : lines) {
        // Carriage returns go with the white space: files edited elsewhere
        // end their lines with CR LF.
        const OmbString line = OmbStringUtils::strip(rawLine, spaceAndTab());
        if (line.empty() || line.find(OmbString::literal("="), 1) < 0) continue;
        OmbStringUtils::split(line, '=', parts);
        if (parts.size() != 2) continue;
        const OmbString& key = parts[0];
        const OmbString& value = parts[1];
        if (key == OmbString::literal("IGNORE_ENVIRONMENT_VARIABLES"))
            ignoreEnvironment = toBool(value, false);
        else if (key == OmbString::literal("OPENGL_STENCIL_BUFFER"))
            openGLStencilBuffer_ = toBool(value, true);
        else if (key == OmbString::literal("OPENGL_TEXTURE_NONPOWEROFTWO"))
            openGLNonPowerOfTwoTextures_ = toBool(value, true);
        else if (key == OmbString::literal("OPENGL_HIDDEN_WINDOW"))
            openGLHiddenWindow_ = toBool(value, true);
        else if (key == OmbString::literal("DIRECTX_MULTISAMPLE_2"))
            directXMultiSample2_ = toBool(value, false);
        else if (key == OmbString::literal("DIRECTX_TEXTURE_NONPOWEROFTWO"))
            directXNonPowerOfTwoTextures_ = toBool(value, true);
        else if (key == OmbString::literal("DIRECTX_VSYNC"))
            directXVSync_ = toBool(value, true);
        else if (key == OmbString::literal("SAFE_GDAL_LOCKING"))
            safeGdalLocking_ = toBool(value, false);
        else if (key == OmbString::literal("LOG_FILE"))
            logFileName_ = value;
        else if (key == OmbString::literal("TACTICAL_POINT_TEXT_HALO"))
            tacticalPointTextHalo_ = toBool(value, true);
        else if (key == OmbString::literal("CATALOG_TIMEOUT"))
            catalogTimeout_ = toTimeout(value);
        else if (key == OmbString::literal("MEMORY_FRAGMENTATION_LOG_FILE"))
            memoryFragmentationLog_ = value;
    }
    return ignoreEnvironment;
}

void OmbSettingsFile::readEnvironment() {
    turnOffUnlessOne("OMBRAVEL_ENGINE_OPENGL_STENCILBUFFER", openGLStencilBuffer_);
    turnOffUnlessOne("OMBRAVEL_ENGINE_OPENGL_TEXTURE_NONPOWEROFTWO", openGLNonPowerOfTwoTextures_);
    turnOffUnlessOne("OMBRAVEL_ENGINE_OPENGL_HIDDEN_WINDOW", openGLHiddenWindow_);
    turnOnIfOne("OMBRAVEL_ENGINE_DIRECTX_MULTISAMPLE_2", directXMultiSample2_);
    turnOffUnlessOne("OMBRAVEL_ENGINE_DIRECTX_TEXTURE_NONPOWEROFTWO", directXNonPowerOfTwoTextures_);
    turnOffUnlessOne("OMBRAVEL_ENGINE_DIRECTX_VSYNC", directXVSync_);
    turnOnIfOne("OMBRAVEL_ENGINE_SAFE_GDAL_LOCKING", safeGdalLocking_);
    turnOffUnlessOne("OMBRAVEL_ENGINE_TACTICAL_POINT_TEXT_HALO", tacticalPointTextHalo_);
    OmbString value;
    if (environment("OMBRAVEL_ENGINE_CATALOG_TIMEOUT", value)) catalogTimeout_ = toTimeout(value);
    if (environment("OMBRAVEL_ENGINE_MEMORY_FRAGMENTATION_LOG", value)) memoryFragmentationLog_ = value;
}
