// An extension module for the tests: the plug-in "Test" (libOETest.so) with
// one class, TestPluginObject.
#include <oecore/config/classdescription.h>
#include <oecore/config/xmlparser.h>
#include <oecore/core/resourceobject.h>

#include <memory>

class TestPluginObject : public OmbResourceObject {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    TestPluginObject* clone() const override { return new TestPluginObject(*this); }
    long long value = 0;
};

OMB_DEFINE_ENGINE_CLASS(TestPluginObject, OmbResourceObject, "TestPluginObject", 9)
OMB_DEFINE_DESCRIBED_MEMBERS(TestPluginObject)

OMB_DESCRIBE_CLASS(TestPluginObject) {
    d.property<long long>("Value", &TestPluginObject::value, [](TestPluginObject& o, long long v) { o.value = v; });
}

// How often a context let go of the module's classes; the tests read it.
extern "C" {
int testPluginUnregistered = 0;
}

namespace {

class TestPlugin : public OmbPluginInstance {
public:
    void registerClasses(OmbXmlParserContext& context) override {
        metaData_ = OmbClassDescription::of(TestPluginObject::runtimeClass())->metaData();
        context.registerClass(metaData_.get());
    }
    void unregisterClasses(OmbXmlParserContext& context) override {
        context.unregisterClass(metaData_.get());
        ++testPluginUnregistered;
    }

private:
    std::unique_ptr<ClassMetaData> metaData_;
};

}  // namespace

extern "C" OmbPluginInstance* CreatePluginInstance(int abiVersion) {
    return abiVersion == OmbPluginAbiVersion ? new TestPlugin : nullptr;
}
