// Length and angle units: the factor that turns one unit into metres, or
// into radians.
//
// Immutable once read; shared between threads.
#pragma once

#include <oecore/config/classdescription.h>
#include <oecore/core/resourceobject.h>

class OmbLengthUnit : public OmbResourceObject {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    explicit OmbLengthUnit(double inMeters = 1.0) : inMeters_(inMeters) {}
    OmbLengthUnit* clone() const override { return new OmbLengthUnit(*this); }

    double inMeters() const noexcept { return inMeters_; }
    void inMeters(double metersPerUnit) { inMeters_ = metersPerUnit; }
    double toMeter(double units) const { return units * inMeters_; }
    double fromMeter(double meters) const { return meters / inMeters_; }
    bool equivalent(const OmbLengthUnit& other) const { return inMeters_ == other.inMeters_; }

    // The predefined units, while the runtime is initialised
    // ("LengthUnits.Meter", ".Foot", ".USSurveyFoot", ".NauticalMile").
    static const OmbRef<OmbLengthUnit>& meter();
    static const OmbRef<OmbLengthUnit>& foot();
    static const OmbRef<OmbLengthUnit>& usSurveyFoot();
    static const OmbRef<OmbLengthUnit>& nauticalMile();
    static void createPredefined();
    static void destroyPredefined();

private:
    double inMeters_;
};

class OmbAngleUnit : public OmbResourceObject {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    explicit OmbAngleUnit(double inRadians = 0.017453292519943295) : inRadians_(inRadians) {}
    OmbAngleUnit* clone() const override { return new OmbAngleUnit(*this); }

    double inRadians() const noexcept { return inRadians_; }
    void inRadians(double radiansPerUnit) { inRadians_ = radiansPerUnit; }
    double toRadian(double units) const { return units * inRadians_; }
    double fromRadian(double radians) const { return radians / inRadians_; }
    bool equivalent(const OmbAngleUnit& other) const { return inRadians_ == other.inRadians_; }

    // "AngleUnits.Degree", ".Gon", ".Radian", while the runtime is initialised.
    static const OmbRef<OmbAngleUnit>& degree();
    static const OmbRef<OmbAngleUnit>& gon();
    static const OmbRef<OmbAngleUnit>& radian();
    static void createPredefined();
    static void destroyPredefined();

private:
    double inRadians_;
};
