#include <oecore/config/configuration.h>
#include <oecore/config/xmlparser.h>
#include <oecore/core/exception.h>

#include <cstddef>
#include <cstdint>

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const OmbString text(reinterpret_cast<const char*>(data), reinterpret_cast<const char*>(data) + size);
    try {
        const OmbRef<OmbConfiguration> configuration =
            OmbXmlParser::loadString(text, {}, OmbDataSetInitialization::Delayed, {});
        // Whatever was read can be written again.
        const OmbRef<OmbEngineObjectVec> objects = configuration->publicObjects();
        for (const OmbRef<OmbEngineObject>& object : *objects) object->save();
    } catch (const OmbException&) {
    }
    return 0;
}
