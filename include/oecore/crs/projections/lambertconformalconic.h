// Lambert conformal conic with two standard parallels.
//
// Immutable once read; shared between threads.
#pragma once

#include <oecore/crs/projection.h>

class OmbLambertConformalConic2SP : public OmbProjection {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    OmbLambertConformalConic2SP() = default;
    // The parallels are checked here and again by init() (a configuration
    // sets them one at a time): each within +-[0.001, 89.999], and their
    // average too; OmbXRangeError otherwise.
    OmbLambertConformalConic2SP(double centralLongitude, double centralLatitude, double standardParallel1,
                                double standardParallel2, double falseEasting = 0, double falseNorthing = 0,
                                double scaleFactor = 1);
    OmbLambertConformalConic2SP* clone() const override { return new OmbLambertConformalConic2SP(*this); }

    double standardParallel1() const noexcept { return standardParallel1_; }
    void standardParallel1(double degrees) { standardParallel1_ = degrees; }
    double standardParallel2() const noexcept { return standardParallel2_; }
    void standardParallel2(double degrees) { standardParallel2_ = degrees; }

    using OmbProjection::project;
    using OmbProjection::unproject;
    OmbProjCachedNumbers* init(const OmbGeodeticDatum& datum) const override;
    void project(OmbPointArray& points, const OmbProjCachedNumbers* cached) const override;
    void project(OmbPoint& p, const OmbProjCachedNumbers* cached) const override;
    void unproject(OmbPointArray& points, const OmbProjCachedNumbers* cached) const override;
    void unproject(OmbPoint& p, const OmbProjCachedNumbers* cached) const override;
    void nominalMetersXY(const OmbProjCachedNumbers* cached, double& mx, double& my) const override;
    // The pole opposite the cone's apex maps to infinity: the valid area
    // stops a thousandth of a degree short of it.
    OmbRect getValidArea(const OmbProjCachedNumbers* cached) const override;
    bool isValid(const OmbPoint& lola, const OmbProjCachedNumbers* cached) const override;
    bool isValidGlobally() const override { return false; }
    bool equivalent(const OmbProjection& other) const override;

private:
    void checkParallels() const;

    double standardParallel1_ = 0;
    double standardParallel2_ = 0;
};
