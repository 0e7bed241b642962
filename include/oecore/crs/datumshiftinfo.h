// OmbDatumShiftInfo: what is known about a datum shift (where it comes
// from, how accurate it is, where it applies), kept with a shift or offered
// by a datum as one of its alternatives.
//
// Immutable once read; shared between threads.
#pragma once

#include <oecore/config/classdescription.h>
#include <oecore/core/refvec.h>
#include <oecore/core/resourceobject.h>
#include <oecore/linalg/rect.h>

// How strictly a coordinate system is built when no datum shift is known:
// Conservative refuses, Lenient assumes one.
enum class OmbDatumShiftChoice { Conservative = 0, Lenient = 1 };
OMB_DESCRIBE_ENUM(OmbDatumShiftChoice, "DatumShiftChoice", {{"Conservative", 0}, {"Lenient", 1}})

class OmbDatumShiftInfo : public OmbResourceObject {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    OmbDatumShiftInfo* clone() const override { return new OmbDatumShiftInfo(*this); }

    OmbString authority;
    OmbString authorityCode;
    // In metres, 0 when unknown: horizontal and vertical.
    double horizontalAccuracy = 0;
    double verticalAccuracy = 0;
    OmbString scope;
    OmbString remarks;
    OmbString originalAccuracy;
    OmbString informationSource;
    OmbString fileStatus;
    OmbString areaOfUseName;
    OmbString areaOfUseDescription;
    OmbString areaOfUseCode;
    // Long/lat degrees on WGS 84; invalid (the default) when not known.
    OmbRect areaOfUse = OmbRect::invalid();
    OmbDatumShiftChoice datumShiftChoice = OmbDatumShiftChoice::Conservative;

    // Whether the area of use meets the long/lat rectangle; an unknown area
    // meets every rectangle.
    bool appliesTo(const OmbRect& lola) const { return areaOfUse.isInvalid() || areaOfUse.overlap(lola); }
};

using OmbDatumShiftInfoVec = OmbRefVec<OmbDatumShiftInfo>;
