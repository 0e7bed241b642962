#include <oecore/config/configuration.h>
#include <oecore/config/xmlparser.h>
#include <oecore/core/exception.h>

#include <gtest/gtest.h>

#include <dlfcn.h>

#include "../errortext.h"

#include <cstdlib>
#include <string>

namespace {

OmbRef<OmbConfiguration> loadPluginDocument() {
    return OmbXmlParser::loadString(OmbString("<Configuration Namespace='Demo'>"
                                              "<TestPluginObject Name='P' Public='true' Value='42'/>"
                                              "</Configuration>"),
                                    {}, OmbDataSetInitialization::Delayed, {});
}

}  // namespace

TEST(Plugins, ModulesLoadOnDemandAndTheirClassesLeaveWithTheContext) {
    ::unsetenv("OMBRAVEL_ENGINE_MODULE_PATH");
    const std::string missing = errorOf([] { loadPluginDocument(); });
    EXPECT_NE(missing.find("Failed to load plugin Test: not found in"), std::string::npos) << missing;
    EXPECT_NE(missing.find("OMBRAVEL_ENGINE_MODULE_PATH"), std::string::npos) << missing;

    ::setenv("OMBRAVEL_ENGINE_MODULE_PATH", OECORE_TEST_MODULE_DIR, 1);
    const OmbRef<OmbConfiguration> c = loadPluginDocument();
    const OmbRef<OmbEngineObject> object = c->getPublicObject(OmbString("P"));
    ASSERT_TRUE(object);
    EXPECT_EQ(pluginName(object->myRuntimeClass()->plugin()), OmbString("Test"));
    EXPECT_NE(object->save().find(OmbString("Value=\"42\"")), -1);

    void* module = dlopen(OECORE_TEST_MODULE_DIR "/libOETest.so", RTLD_NOW | RTLD_NOLOAD);
    ASSERT_NE(module, nullptr);
    const int* unregistered = static_cast<const int*>(dlsym(module, "testPluginUnregistered"));
    ASSERT_NE(unregistered, nullptr);
    EXPECT_EQ(*unregistered, 1);
    dlclose(module);
    ::unsetenv("OMBRAVEL_ENGINE_MODULE_PATH");
}

TEST(Plugins, UnknownPluginsAreNamed) {
    OmbXmlParserContext context({}, OmbDataSetInitialization::Delayed, {});
    EXPECT_EQ(errorOf([&] { context.loadPluginByName(OmbString("Nope")); }), "Unknown plugin 'Nope'");
}
