// Rosenmund's oblique Mercator, the Swiss national projection.
//
// Immutable once read; shared between threads.
#pragma once

#include <oecore/crs/projection.h>

class OmbRosenmundObliqueMercator : public OmbProjection {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    OmbRosenmundObliqueMercator() = default;
    OmbRosenmundObliqueMercator* clone() const override { return new OmbRosenmundObliqueMercator(*this); }

    // The latitude on the conformal sphere of the point where the cylinder
    // touches; 0 derives it from the central latitude.
    double normalLatitude() const noexcept { return normalLatitude_; }
    void normalLatitude(double degrees) { normalLatitude_ = degrees; }

    using OmbProjection::project;
    using OmbProjection::unproject;
    OmbProjCachedNumbers* init(const OmbGeodeticDatum& datum) const override;
    void project(OmbPoint& p, const OmbProjCachedNumbers* cached) const override;
    // OmbXProjectionError ("arcsin failed in RosenmundObliqueMercator") for
    // a point outside the projected world.
    void unproject(OmbPoint& p, const OmbProjCachedNumbers* cached) const override;
    void nominalMetersXY(const OmbProjCachedNumbers* cached, double& mx, double& my) const override;
    bool isValidGlobally() const override { return false; }
    bool equivalent(const OmbProjection& other) const override;

private:
    double normalLatitude_ = 0;
};
