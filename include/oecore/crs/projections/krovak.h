// Krovak's oblique conformal conic, as used in the Czech Republic and
// Slovakia: north oriented (easting, northing) or south-west oriented.
//
// Immutable once read; shared between threads.
#pragma once

#include <oecore/crs/projection.h>

class OmbKrovak : public OmbProjection {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    // The S-JTSK constants: centre 49 deg 30' N, 24 deg 50' E of Greenwich,
    // scale 0.9999 on the pseudo standard parallel 78 deg 30'.
    OmbKrovak();
    OmbKrovak* clone() const override { return new OmbKrovak(*this); }

    // Of the cone's axis, degrees.
    double colatitudeConeAxis() const noexcept { return colatitudeConeAxis_; }
    void colatitudeConeAxis(double degrees) { colatitudeConeAxis_ = degrees; }
    double pseudoStandardParallel() const noexcept { return pseudoStandardParallel_; }
    void pseudoStandardParallel(double degrees) { pseudoStandardParallel_ = degrees; }
    // Easting and northing (the default), or westing and southing as
    // positive numbers (the classical Czech and Slovak grid).
    bool northOriented() const noexcept { return northOriented_; }
    void northOriented(bool north) { northOriented_ = north; }

    using OmbProjection::project;
    using OmbProjection::unproject;
    OmbProjCachedNumbers* init(const OmbGeodeticDatum& datum) const override;
    void project(OmbPoint& p, const OmbProjCachedNumbers* cached) const override;
    // OmbXProjectionError ("Krovak.unproject failed") when the latitude
    // does not settle.
    void unproject(OmbPoint& p, const OmbProjCachedNumbers* cached) const override;
    void nominalMetersXY(const OmbProjCachedNumbers* cached, double& mx, double& my) const override;
    bool isValidGlobally() const override { return false; }
    bool equivalent(const OmbProjection& other) const override;

private:
    double colatitudeConeAxis_ = 30.28813975277778;
    double pseudoStandardParallel_ = 78.5;
    bool northOriented_ = true;
};
