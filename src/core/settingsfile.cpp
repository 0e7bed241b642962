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

// The boolean settings: file key, environment variable, field, default. The
// environment can only switch a setting away from its default: an
// on-by-default one goes off for any value but "1", an off-by-default one
// goes on for "1" only.
struct OmbSettingsFile::BoolKey {
    const char* key;
    const char* variable;
    bool OmbSettingsFile::*field;
    bool defaultValue;
};

const OmbSettingsFile::BoolKey OmbSettingsFile::boolKeys[] = {
    {"OPENGL_STENCIL_BUFFER", "OMBRAVEL_ENGINE_OPENGL_STENCILBUFFER", &OmbSettingsFile::openGLStencilBuffer_, true},
    {"OPENGL_TEXTURE_NONPOWEROFTWO", "OMBRAVEL_ENGINE_OPENGL_TEXTURE_NONPOWEROFTWO",
     &OmbSettingsFile::openGLNonPowerOfTwoTextures_, true},
    {"OPENGL_HIDDEN_WINDOW", "OMBRAVEL_ENGINE_OPENGL_HIDDEN_WINDOW", &OmbSettingsFile::openGLHiddenWindow_, true},
    {"DIRECTX_MULTISAMPLE_2", "OMBRAVEL_ENGINE_DIRECTX_MULTISAMPLE_2", &OmbSettingsFile::directXMultiSample2_, false},
    {"DIRECTX_TEXTURE_NONPOWEROFTWO", "OMBRAVEL_ENGINE_DIRECTX_TEXTURE_NONPOWEROFTWO",
     &OmbSettingsFile::directXNonPowerOfTwoTextures_, true},
    {"DIRECTX_VSYNC", "OMBRAVEL_ENGINE_DIRECTX_VSYNC", &OmbSettingsFile::directXVSync_, true},
    {"SAFE_GDAL_LOCKING", "OMBRAVEL_ENGINE_SAFE_GDAL_LOCKING", &OmbSettingsFile::safeGdalLocking_, false},
    {"TACTICAL_POINT_TEXT_HALO", "OMBRAVEL_ENGINE_TACTICAL_POINT_TEXT_HALO", &OmbSettingsFile::tacticalPointTextHalo_,
     true},
};

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
        if (key == OmbString::literal("IGNORE_ENVIRONMENT_VARIABLES")) ignoreEnvironment = toBool(value, false);
        if (key == OmbString::literal("LOG_FILE")) logFileName_ = value;
        if (key == OmbString::literal("CATALOG_TIMEOUT")) catalogTimeout_ = toTimeout(value);
        if (key == OmbString::literal("MEMORY_FRAGMENTATION_LOG_FILE")) memoryFragmentationLog_ = value;
        for (const BoolKey& b : boolKeys)
            if (key == OmbString::literal(b.key)) this->*b.field = toBool(value, b.defaultValue);
    }
    return ignoreEnvironment;
}

void OmbSettingsFile::readEnvironment() {
    OmbString value;
    for (const BoolKey& b : boolKeys) {
        if (!environment(b.variable, value)) continue;
        const bool one = value == OmbString::literal("1");
        if (b.defaultValue && !one) this->*b.field = false;
        if (!b.defaultValue && one) this->*b.field = true;
    }
    if (environment("OMBRAVEL_ENGINE_CATALOG_TIMEOUT", value)) catalogTimeout_ = toTimeout(value);
    if (environment("OMBRAVEL_ENGINE_MEMORY_FRAGMENTATION_LOG", value)) memoryFragmentationLog_ = value;
}
