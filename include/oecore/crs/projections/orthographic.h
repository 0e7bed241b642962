// Orthographic: the visible hemisphere as seen from infinitely far above
// the centre, on the ellipsoid (EPSG method 9840).
//
// Immutable once read; shared between threads.
#pragma once

#include <oecore/crs/projection.h>

class OmbOrthographic : public OmbProjection {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    OmbOrthographic() = default;
    // OmbXRangeError for a centre outside [-180, 180] x [-90, 90].
    OmbOrthographic(double centralLongitude, double centralLatitude, double falseEasting = 0, double falseNorthing = 0);
    OmbOrthographic* clone() const override { return new OmbOrthographic(*this); }

    // Checked setters for building from a configuration.
    void checkedCentralLongitude(double degrees);
    void checkedCentralLatitude(double degrees);

    using OmbProjection::project;
    using OmbProjection::unproject;
    OmbProjCachedNumbers* init(const OmbGeodeticDatum& datum) const override;
    // OmbXProjectionError for a point on the far side.
    void project(OmbPoint& p, const OmbProjCachedNumbers* cached) const override;
    // OmbXProjectionError for a point outside the projected disc.
    void unproject(OmbPoint& p, const OmbProjCachedNumbers* cached) const override;
    void nominalMetersXY(const OmbProjCachedNumbers* cached, double& mx, double& my) const override;
    // The hemisphere facing the viewer.
    bool isValid(const OmbPoint& lola, const OmbProjCachedNumbers* cached) const override;
    bool isValidGlobally() const override { return false; }
    bool equivalent(const OmbProjection& other) const override { return sameParameters(other); }
};
