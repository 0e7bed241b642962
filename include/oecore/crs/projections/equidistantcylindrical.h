// Equidistant cylindrical (plate carree with a standard parallel): metric,
// on the sphere or the ellipsoid, and angular, with x and y in an angle
// unit. The world wraps around in x.
//
// Immutable once read; shared between threads.
#pragma once

#include <oecore/crs/projection.h>

class OmbEquidistantCylindrical : public OmbProjection, public OmbEarthShapeParameters {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    OmbEquidistantCylindrical() : OmbProjection(true, false), OmbEarthShapeParameters(OmbEarthShape::Ellipsoid) {}
    OmbEquidistantCylindrical* clone() const override { return new OmbEquidistantCylindrical(*this); }

    // The parallel of true scale in x.
    double standardParallel() const noexcept { return standardParallel_; }
    void standardParallel(double degrees) { standardParallel_ = degrees; }

    using OmbProjection::project;
    using OmbProjection::unproject;
    OmbProjCachedNumbers* init(const OmbGeodeticDatum& datum) const override;
    void project(OmbPoint& p, const OmbProjCachedNumbers* cached) const override;
    void unproject(OmbPoint& p, const OmbProjCachedNumbers* cached) const override;
    void nominalMetersXY(const OmbProjCachedNumbers* cached, double& mx, double& my) const override;
    bool equivalent(const OmbProjection& other) const override;
    // Other's coordinates are this projection's moved by whole world widths
    // (worldWidth in projected units); everything else identical.
    bool compatibleWith(const OmbEquidistantCylindrical& other, double worldWidth) const;

private:
    double standardParallel_ = 0;
};

class OmbEquidistantCylindricalAngularProjection : public OmbProjection {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    OmbEquidistantCylindricalAngularProjection() : OmbProjection(true, false) {}
    OmbEquidistantCylindricalAngularProjection* clone() const override {
        return new OmbEquidistantCylindricalAngularProjection(*this);
    }

    // Degrees unless set ("AngleUnits.Degree").
    const OmbRef<OmbAngleUnit>& angleUnit() const;
    void angleUnit(const OmbRef<OmbAngleUnit>& unit) { angleUnit_ = unit; }
    const OmbRef<OmbAngleUnit>& configuredAngleUnit() const noexcept { return angleUnit_; }
    double standardParallel() const noexcept { return standardParallel_; }
    void standardParallel(double degrees) { standardParallel_ = degrees; }

    using OmbProjection::project;
    using OmbProjection::unproject;
    void project(OmbPoint& p, const OmbProjCachedNumbers* cached) const override;
    void unproject(OmbPoint& p, const OmbProjCachedNumbers* cached) const override;
    // Metres per angle unit along the equator.
    void nominalMetersXY(const OmbProjCachedNumbers* cached, double& mx, double& my) const override;
    bool equivalent(const OmbProjection& other) const override;
    // As for the metric form.
    bool compatibleWith(const OmbEquidistantCylindricalAngularProjection& other, double worldWidth) const;

private:
    OmbRef<OmbAngleUnit> angleUnit_;
    double standardParallel_ = 0;
};
