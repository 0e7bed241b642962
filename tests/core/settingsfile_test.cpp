#include <oecore/core/settingsfile.h>

#include <gtest/gtest.h>

#include <cstdlib>

#include "tempdir.h"

namespace {

// Sets environment variables for one test and removes them afterwards.
class Environment {
public:
    ~Environment() {
        for (const std::string& name : names_) ::unsetenv(name.c_str());
    }
    void set(const std::string& name, const std::string& value) {
        ::setenv(name.c_str(), value.c_str(), 1);
        names_.push_back(name);
    }

private:
    std::vector<std::string> names_;
};

OmbRef<OmbSettingsFile> settingsOf(const TempDir& dir, const std::string& text) {
    return OmbSettingsFile::load(OmbString(dir.write("app.ini", text)));
}

void expectDefaults(const OmbSettingsFile& s) {
    EXPECT_TRUE(s.logFileName().empty());
    EXPECT_TRUE(s.useOpenGLStencilBuffer());
    EXPECT_TRUE(s.useOpenGLNonPowerOfTwoTextures());
    EXPECT_TRUE(s.useOpenGLHiddenWindow());
    EXPECT_FALSE(s.useDirectXMultiSample2());
    EXPECT_TRUE(s.useDirectXNonPowerOfTwoTextures());
    EXPECT_TRUE(s.useDirectXVSync());
    EXPECT_FALSE(s.useSafeGdalLocking());
    EXPECT_TRUE(s.displayTacticalPointTextHalo());
    EXPECT_EQ(s.catalogTimeout(), 10);
    EXPECT_TRUE(s.memoryFragmentationLog().empty());
}

}  // namespace

TEST(SettingsFile, EveryKeyIsRead) {
    TempDir dir;
    const auto s = settingsOf(dir,
                              "OPENGL_STENCIL_BUFFER=off\n"
                              "OPENGL_TEXTURE_NONPOWEROFTWO=0\n"
                              "OPENGL_HIDDEN_WINDOW=OFF\n"
                              "DIRECTX_MULTISAMPLE_2=On\n"
                              "DIRECTX_TEXTURE_NONPOWEROFTWO=0\n"
                              "DIRECTX_VSYNC=OFF\n"
                              "SAFE_GDAL_LOCKING=1\n"
                              "LOG_FILE=/var/log/app.log\n"
                              "TACTICAL_POINT_TEXT_HALO=off\n"
                              "CATALOG_TIMEOUT=25\n"
                              "MEMORY_FRAGMENTATION_LOG_FILE=frag.txt\n"
                              "UNKNOWN_KEY=1\n");
    EXPECT_FALSE(s->useOpenGLStencilBuffer());
    EXPECT_FALSE(s->useOpenGLNonPowerOfTwoTextures());
    EXPECT_FALSE(s->useOpenGLHiddenWindow());
    EXPECT_TRUE(s->useDirectXMultiSample2());
    EXPECT_FALSE(s->useDirectXNonPowerOfTwoTextures());
    EXPECT_FALSE(s->useDirectXVSync());
    EXPECT_TRUE(s->useSafeGdalLocking());
    EXPECT_EQ(s->logFileName(), OmbString("/var/log/app.log"));
    EXPECT_FALSE(s->displayTacticalPointTextHalo());
    EXPECT_EQ(s->catalogTimeout(), 25);
    EXPECT_EQ(s->memoryFragmentationLog(), OmbString("frag.txt"));
}

TEST(SettingsFile, LineRules) {
    TempDir dir;
    const auto s = settingsOf(dir,
                              "  \tDIRECTX_VSYNC=maybe  \n"  // unknown value: the default stays
                              "SAFE_GDAL_LOCKING =1\n"       // the key keeps its space and matches nothing
                              "LOG_FILE= spaced.log\n"       // the value keeps its leading space
                              "=1\n"                         // no key
                              "CATALOG_TIMEOUT=0\n"          // 0 means the default
                              "DIRECTX_MULTISAMPLE_2=1=1\n"  // two '=' make three parts
                              "OPENGL_HIDDEN_WINDOW=\n");    // empty value: the default
    EXPECT_TRUE(s->useDirectXVSync());
    EXPECT_FALSE(s->useSafeGdalLocking());
    EXPECT_EQ(s->logFileName(), OmbString(" spaced.log"));
    EXPECT_EQ(s->catalogTimeout(), 10);
    EXPECT_FALSE(s->useDirectXMultiSample2());
    EXPECT_TRUE(s->useOpenGLHiddenWindow());
}

TEST(SettingsFile, CrLfLineEndsAreUnderstood) {
    TempDir dir;
    const auto s = settingsOf(dir, "DIRECTX_VSYNC=0\r\nLOG_FILE=engine.log\r\nCATALOG_TIMEOUT=30\r\n");
    EXPECT_FALSE(s->useDirectXVSync());
    EXPECT_EQ(s->logFileName(), OmbString("engine.log"));
    EXPECT_EQ(s->catalogTimeout(), 30);
}

TEST(SettingsFile, TheEnvironmentOnlyTurnsSettingsAwayFromTheirDefaults) {
    TempDir dir;
    Environment env;
    env.set("OMBRAVEL_ENGINE_DIRECTX_VSYNC", "1");          // "1" cannot turn it back on
    env.set("OMBRAVEL_ENGINE_OPENGL_STENCILBUFFER", "no");  // anything but "1" turns it off
    env.set("OMBRAVEL_ENGINE_SAFE_GDAL_LOCKING", "1");
    env.set("OMBRAVEL_ENGINE_DIRECTX_MULTISAMPLE_2", "yes");  // only "1" turns it on
    env.set("OMBRAVEL_ENGINE_CATALOG_TIMEOUT", "0");
    env.set("OMBRAVEL_ENGINE_MEMORY_FRAGMENTATION_LOG", "env.txt");
    env.set("OMBRAVEL_ENGINE_TACTICAL_POINT_TEXT_HALO", "");  // empty: no effect
    const auto s = settingsOf(dir, "DIRECTX_VSYNC=0\nCATALOG_TIMEOUT=5\nMEMORY_FRAGMENTATION_LOG_FILE=file.txt\n");
    EXPECT_FALSE(s->useDirectXVSync());
    EXPECT_FALSE(s->useOpenGLStencilBuffer());
    EXPECT_TRUE(s->useSafeGdalLocking());
    EXPECT_FALSE(s->useDirectXMultiSample2());
    EXPECT_EQ(s->catalogTimeout(), 10);
    EXPECT_EQ(s->memoryFragmentationLog(), OmbString("env.txt"));
    EXPECT_TRUE(s->displayTacticalPointTextHalo());

    const auto ignoring = settingsOf(dir, "IGNORE_ENVIRONMENT_VARIABLES=on\n");
    EXPECT_TRUE(ignoring->useOpenGLStencilBuffer());
    EXPECT_FALSE(ignoring->useSafeGdalLocking());
    EXPECT_TRUE(ignoring->memoryFragmentationLog().empty());
}

TEST(SettingsFile, BadFilesGiveTheDefaults) {
    TempDir dir;
    expectDefaults(*OmbSettingsFile::load(OmbString((dir / "missing.ini").string())));
    expectDefaults(*OmbSettingsFile::load(OmbString(dir.path().string())));  // a directory cannot be read
    std::string garbage;
    for (int i = 0; i < 4096; ++i) garbage += static_cast<char>((i * 7919) % 256);
    expectDefaults(*settingsOf(dir, garbage));
    expectDefaults(*settingsOf(dir, std::string(300000, 'x') + "=" + std::string(300000, 'y') + "\n"));
    expectDefaults(*settingsOf(dir, "DIRECTX_VSYNC=\xC3\n\xFF\xFE=\x80\nOPENGL_HIDDEN_WINDOW=\xE2\x82\n"));
    expectDefaults(*settingsOf(dir, std::string("DIRECTX_VSYNC\0=0\n", 17)));
}

TEST(SettingsFile, DefaultFileIsTheExecutablePathPlusIni) {
    const std::string name(OmbSettingsFile::defaultFileName().view());
    EXPECT_EQ(name, std::filesystem::canonical("/proc/self/exe").string() + ".ini");
}
