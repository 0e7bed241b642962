// The configuration properties of the library's own engine classes.
#include <oecore/config/classdescription.h>
#include <oecore/core/resourceobject.h>

[[maybe_unused]] static const bool childObjectModeDescribed = (OmbEnumNames<OmbChildObjectMode>::description(), true);

OMB_DESCRIBE_CLASS(OmbResourceObject) {
    d.property<OmbString>(
        "Name", [](const OmbResourceObject& o) { return o.name(); },
        [](OmbResourceObject& o, const OmbString& name) { o.name(name); });
}
