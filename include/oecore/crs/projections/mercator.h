// Mercator, on the sphere or the ellipsoid, and Miller's cylindrical
// projection. The world wraps around in x.
//
// Immutable once read; shared between threads.
#pragma once

#include <oecore/crs/projection.h>

class OmbMercator : public OmbProjection, public OmbEarthShapeParameters {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    OmbMercator();
    OmbMercator* clone() const override { return new OmbMercator(*this); }

    // Latitude of true scale in [-89, 89]; when not 0 it decides the scale
    // in place of scaleFactor.
    double standardParallel() const noexcept { return standardParallel_; }
    void standardParallel(double degrees);

    using OmbProjection::project;
    using OmbProjection::unproject;
    OmbProjCachedNumbers* init(const OmbGeodeticDatum& datum) const override;
    void project(OmbPointArray& points, const OmbProjCachedNumbers* cached) const override;
    void project(OmbPoint& p, const OmbProjCachedNumbers* cached) const override;
    void unproject(OmbPointArray& points, const OmbProjCachedNumbers* cached) const override;
    void unproject(OmbPoint& p, const OmbProjCachedNumbers* cached) const override;
    void nominalMetersXY(const OmbProjCachedNumbers* cached, double& mx, double& my) const override;
    bool equivalent(const OmbProjection& other) const override;

    // Whether coordinates of other are this projection's moved by whole
    // world widths (worldWidth in projected units): central longitude and
    // false easting agree to such a move within 1e-5 units, scale factor
    // and standard parallel within 1e-9, the rest is identical.
    bool compatibleWith(const OmbMercator& other, double worldWidth) const;

protected:
    // Miller's compromise c: the spherical y of c times the latitude,
    // divided by c. 1 is Mercator itself.
    virtual double compromiseFactor() const { return 1; }

private:
    double standardParallel_ = 0;
};

class OmbMiller : public OmbMercator {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    explicit OmbMiller(double compromise = 0.8) : compromise_(compromise) {}
    OmbMiller* clone() const override { return new OmbMiller(*this); }

    // 0 gives the equirectangular projection, 1 Mercator.
    double compromise() const noexcept { return compromise_; }
    void compromise(double c) { compromise_ = c; }
    bool equivalent(const OmbProjection& other) const override;

protected:
    double compromiseFactor() const override { return compromise_; }

private:
    double compromise_;
};
