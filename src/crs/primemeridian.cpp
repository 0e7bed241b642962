#include <oecore/core/runtime.h>
#include <oecore/crs/primemeridian.h>

OMB_DEFINE_ENGINE_CLASS(OmbPrimeMeridian, OmbResourceObject, "PrimeMeridian", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbPrimeMeridian)

OMB_DESCRIBE_CLASS(OmbPrimeMeridian) {
    d.property<double>(
         "LongitudeFromGreenwich", [](const OmbPrimeMeridian& m) { return m.longitudeFromGreenwich(); },
         [](OmbPrimeMeridian& m, double v) { m.longitudeFromGreenwich(v); })
        .required();
}

namespace {

enum PredefinedMeridian {
#define OMB_MERIDIAN_INDEX(NAME, ACCESSOR, DEGREES) Meridian##NAME,
    OMB_PREDEFINED_PRIME_MERIDIANS(OMB_MERIDIAN_INDEX)
#undef OMB_MERIDIAN_INDEX
        MeridianCount
};

OmbRef<OmbPrimeMeridian> predefined[MeridianCount];

// The registered name of a meridian; Oslo's carries a historical misspelling
// that configurations refer to.
OmbString registeredName(const char* name) {
    const OmbString n(name);
    return OmbString::literal("PrimeMeridians.") + (n == OmbString::literal("Oslo") ? OmbString::literal("Olso") : n);
}

[[maybe_unused]] const bool registered =
    (OmbRuntime::registerPredefinedClass(OmbRuntime::PredefinedClass::PrimeMeridians,
                                         OmbPrimeMeridian::createPredefined, OmbPrimeMeridian::destroyPredefined),
     true);

}  // namespace

void OmbPrimeMeridian::createPredefined() {
#define OMB_CREATE_MERIDIAN(NAME, ACCESSOR, DEGREES)                                      \
    predefined[Meridian##NAME] = OmbRef<OmbPrimeMeridian>(new OmbPrimeMeridian(DEGREES)); \
    predefined[Meridian##NAME]->name(OmbString::literal(#NAME));                          \
    OmbRuntime::registerPredefined(registeredName(#NAME), OmbRef<OmbEngineObject>(predefined[Meridian##NAME]));
    OMB_PREDEFINED_PRIME_MERIDIANS(OMB_CREATE_MERIDIAN)
#undef OMB_CREATE_MERIDIAN
}

void OmbPrimeMeridian::destroyPredefined() {
    for (OmbRef<OmbPrimeMeridian>& m : predefined) m.reset();
}

#define OMB_MERIDIAN_ACCESSOR(NAME, ACCESSOR, DEGREES) \
    const OmbRef<OmbPrimeMeridian>& OmbPrimeMeridian::ACCESSOR() { return predefined[Meridian##NAME]; }
OMB_PREDEFINED_PRIME_MERIDIANS(OMB_MERIDIAN_ACCESSOR)
#undef OMB_MERIDIAN_ACCESSOR
