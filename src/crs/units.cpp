#include <oecore/core/runtime.h>
#include <oecore/crs/units.h>

OMB_DEFINE_ENGINE_CLASS(OmbLengthUnit, OmbResourceObject, "LengthUnit", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbLengthUnit)
OMB_DEFINE_ENGINE_CLASS(OmbAngleUnit, OmbResourceObject, "AngleUnit", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbAngleUnit)

OMB_DESCRIBE_CLASS(OmbLengthUnit) {
    d.property<double>(
        "InMeters", [](const OmbLengthUnit& u) { return u.inMeters(); },
        [](OmbLengthUnit& u, double v) { u.inMeters(v); }, 1.0);
}

OMB_DESCRIBE_CLASS(OmbAngleUnit) {
    d.property<double>(
        "InRadians", [](const OmbAngleUnit& u) { return u.inRadians(); },
        [](OmbAngleUnit& u, double v) { u.inRadians(v); }, 0.017453292519943295);
}

namespace {

OmbRef<OmbLengthUnit> meterUnit, footUnit, usSurveyFootUnit, nauticalMileUnit;
OmbRef<OmbAngleUnit> degreeUnit, gonUnit, radianUnit;

template <class U>
void create(OmbRef<U>& slot, double factor, const char* name, const char* registeredName) {
    slot = OmbRef<U>(new U(factor));
    slot->name(OmbString(name));
    OmbRuntime::registerPredefined(OmbString(registeredName), OmbRef<OmbEngineObject>(slot));
}

[[maybe_unused]] const bool registered =
    (OmbRuntime::registerPredefinedClass(OmbRuntime::PredefinedClass::LengthUnits, OmbLengthUnit::createPredefined,
                                         OmbLengthUnit::destroyPredefined),
     OmbRuntime::registerPredefinedClass(OmbRuntime::PredefinedClass::AngleUnits, OmbAngleUnit::createPredefined,
                                         OmbAngleUnit::destroyPredefined),
     true);

}  // namespace

void OmbLengthUnit::createPredefined() {
    create(meterUnit, 1.0, "meter", "LengthUnits.Meter");
    create(footUnit, 0.3048, "foot", "LengthUnits.Foot");
    create(usSurveyFootUnit, 0.3048006096012192, "USSurveyFoot", "LengthUnits.USSurveyFoot");
    create(nauticalMileUnit, 1852.0, "nauticalMile", "LengthUnits.NauticalMile");
}

void OmbLengthUnit::destroyPredefined() {
    for (OmbRef<OmbLengthUnit>* u : {&meterUnit, &footUnit, &usSurveyFootUnit, &nauticalMileUnit}) u->reset();
}

const OmbRef<OmbLengthUnit>& OmbLengthUnit::meter() { return meterUnit; }
const OmbRef<OmbLengthUnit>& OmbLengthUnit::foot() { return footUnit; }
const OmbRef<OmbLengthUnit>& OmbLengthUnit::usSurveyFoot() { return usSurveyFootUnit; }
const OmbRef<OmbLengthUnit>& OmbLengthUnit::nauticalMile() { return nauticalMileUnit; }

void OmbAngleUnit::createPredefined() {
    create(degreeUnit, 0.017453292519943295, "degree", "AngleUnits.Degree");
    create(gonUnit, 0.9 * 0.017453292519943295, "gon", "AngleUnits.Gon");
    create(radianUnit, 1.0, "radian", "AngleUnits.Radian");
}

void OmbAngleUnit::destroyPredefined() {
    for (OmbRef<OmbAngleUnit>* u : {&degreeUnit, &gonUnit, &radianUnit}) u->reset();
}

const OmbRef<OmbAngleUnit>& OmbAngleUnit::degree() { return degreeUnit; }
const OmbRef<OmbAngleUnit>& OmbAngleUnit::gon() { return gonUnit; }
const OmbRef<OmbAngleUnit>& OmbAngleUnit::radian() { return radianUnit; }
