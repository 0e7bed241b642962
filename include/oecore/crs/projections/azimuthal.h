// The azimuthal family: projections onto a plane touching the earth at a
// centre. Stereographic (two variants), polar stereographic and azimuthal
// equidistant are computed here; the equal-area member evaluates through
// PROJ (see projlibprojections.h).
//
// Immutable once read; shared between threads.
#pragma once

#include <oecore/crs/projection.h>

// What a projection is chosen for; kept with the configuration, the
// mapping does not depend on it.
enum class OmbProjectionPurpose { Storage = 0, Presentation = 1 };
OMB_DESCRIBE_ENUM(OmbProjectionPurpose, "ProjectionPurpose", {{"Storage", 0}, {"Presentation", 1}})

enum class OmbStereographicVariant { UnitedStates = 0, International = 1 };
OMB_DESCRIBE_ENUM(OmbStereographicVariant, "StereographicVariant", {{"UnitedStates", 0}, {"International", 1}})

class OmbAzimuthalGlobal : public OmbProjection {
    OMB_DECLARE_ENGINE_CLASS()

public:
    // The centre; OmbXBadProjectionParameters outside [-180, 180] x [-90, 90].
    void set(double centralLongitude, double centralLatitude);
    OmbProjectionPurpose purpose() const noexcept { return purpose_; }
    void purpose(OmbProjectionPurpose purpose) { purpose_ = purpose; }

    void nominalMetersXY(const OmbProjCachedNumbers* cached, double& mx, double& my) const override;
    bool isValidGlobally() const override { return false; }

protected:
    OmbAzimuthalGlobal() = default;
    bool sameAzimuthalParameters(const OmbProjection& other) const;

private:
    OmbProjectionPurpose purpose_ = OmbProjectionPurpose::Presentation;
};

// Conformal; everything but the antipode of the centre. UnitedStates is
// Snyder's oblique form on the conformal sphere, International the double
// projection through Gauss's conformal sphere (EPSG 9809).
class OmbStereographic : public OmbAzimuthalGlobal {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    OmbStereographic() = default;
    OmbStereographic(double centralLongitude, double centralLatitude, double scaleFactor,
                     OmbStereographicVariant variant, double falseEasting = 0, double falseNorthing = 0);
    OmbStereographic* clone() const override { return new OmbStereographic(*this); }

    OmbStereographicVariant variant() const noexcept { return variant_; }
    void variant(OmbStereographicVariant v) { variant_ = v; }

    using OmbProjection::project;
    using OmbProjection::unproject;
    OmbProjCachedNumbers* init(const OmbGeodeticDatum& datum) const override;
    void project(OmbPoint& p, const OmbProjCachedNumbers* cached) const override;
    void unproject(OmbPoint& p, const OmbProjCachedNumbers* cached) const override;
    bool isValid(const OmbPoint& lola, const OmbProjCachedNumbers* cached) const override;
    bool equivalent(const OmbProjection& other) const override;

private:
    OmbStereographicVariant variant_ = OmbStereographicVariant::UnitedStates;
};

// Stereographic about a pole, with its scale given either as scaleFactor at
// the pole or as a standard parallel of true scale (not both).
class OmbPolarStereographic : public OmbAzimuthalGlobal {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    explicit OmbPolarStereographic(bool northPole = true);
    OmbPolarStereographic* clone() const override { return new OmbPolarStereographic(*this); }

    bool northPole() const noexcept { return northPole_; }
    void northPole(bool north);
    // 0 when not given; then scaleFactor applies.
    double standardParallel() const noexcept { return standardParallel_; }
    void standardParallel(double degrees) { standardParallel_ = degrees; }

    using OmbProjection::project;
    using OmbProjection::unproject;
    // OmbXPolarStereographicTooManyArgumentsSpecified when both the scale
    // factor and the standard parallel are given; OmbXRangeError for a
    // standard parallel in the other hemisphere.
    OmbProjCachedNumbers* init(const OmbGeodeticDatum& datum) const override;
    void project(OmbPointArray& points, const OmbProjCachedNumbers* cached) const override;
    void project(OmbPoint& p, const OmbProjCachedNumbers* cached) const override;
    void unproject(OmbPoint& p, const OmbProjCachedNumbers* cached) const override;
    bool isValid(const OmbPoint& lola, const OmbProjCachedNumbers* cached) const override;
    bool equivalent(const OmbProjection& other) const override;

private:
    bool northPole_;
    double standardParallel_ = 0;
};

// Distances and azimuths from the centre are true: the geodesic to a point
// on the ellipsoid (Vincenty), or the great circle on a sphere.
class OmbAzimuthalEquidistant : public OmbAzimuthalGlobal, public OmbEarthShapeParameters {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    OmbAzimuthalEquidistant() : OmbEarthShapeParameters(OmbEarthShape::Ellipsoid) {}
    OmbAzimuthalEquidistant* clone() const override { return new OmbAzimuthalEquidistant(*this); }

    using OmbProjection::project;
    using OmbProjection::unproject;
    OmbProjCachedNumbers* init(const OmbGeodeticDatum& datum) const override;
    void project(OmbPoint& p, const OmbProjCachedNumbers* cached) const override;
    void unproject(OmbPoint& p, const OmbProjCachedNumbers* cached) const override;
    bool isValid(const OmbPoint& lola, const OmbProjCachedNumbers* cached) const override;
    bool equivalent(const OmbProjection& other) const override;

private:
};
