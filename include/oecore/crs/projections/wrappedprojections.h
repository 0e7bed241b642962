// Projections that move another projection's output in the plane: turned
// about the projected origin, or shifted so that a new point becomes the
// origin.
//
// Immutable once read; shared between threads.
#pragma once

#include <oecore/crs/projection.h>

// The base projection followed by a fixed affine map of the plane.
class OmbWrappingProjection : public OmbProjection {
    OMB_DECLARE_ENGINE_CLASS()

public:
    const OmbRef<OmbProjection>& baseProjection() const noexcept { return base_; }
    void baseProjection(const OmbRef<OmbProjection>& base);

    using OmbProjection::project;
    using OmbProjection::unproject;
    // OmbXNullValue without a base projection.
    OmbProjCachedNumbers* init(const OmbGeodeticDatum& datum) const override;
    void project(OmbPointArray& points, const OmbProjCachedNumbers* cached) const override;
    void project(OmbPoint& p, const OmbProjCachedNumbers* cached) const override;
    void unproject(OmbPointArray& points, const OmbProjCachedNumbers* cached) const override;
    void unproject(OmbPoint& p, const OmbProjCachedNumbers* cached) const override;
    void nominalMetersXY(const OmbProjCachedNumbers* cached, double& mx, double& my) const override;
    bool georeferenced() const override { return base_->georeferenced(); }
    OmbRect getValidArea(const OmbProjCachedNumbers* cached) const override;
    bool isValid(const OmbPoint& lola, const OmbProjCachedNumbers* cached) const override;
    bool isValidGlobally() const override { return base_->isValidGlobally(); }
    OmbPoint projectedOrigin(const OmbProjCachedNumbers* cached) const override;

    // The plane map x' = m00 x + m01 y + tx, y' = m10 x + m11 y + ty.
    struct Affine {
        double m00 = 1, m01 = 0, m10 = 0, m11 = 1, tx = 0, ty = 0;
        void apply(OmbPoint& p) const;
        void applyInverse(OmbPoint& p) const;
    };

protected:
    OmbWrappingProjection() = default;
    OmbWrappingProjection(const OmbWrappingProjection& other);
    // The map for the base projection's constants on a datum.
    virtual Affine affine(const OmbProjCachedNumbers* baseCached) const = 0;
    bool sameBase(const OmbWrappingProjection& other) const;

private:
    OmbRef<OmbProjection> base_;
};

class OmbRotatedProjection : public OmbWrappingProjection {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    OmbRotatedProjection() = default;
    OmbRotatedProjection(const OmbRef<OmbProjection>& base, double up);
    OmbRotatedProjection* clone() const override { return new OmbRotatedProjection(*this); }

    // Degrees counter-clockwise about the base's projected origin.
    double up() const noexcept { return up_; }
    void up(double degrees) { up_ = degrees; }
    bool equivalent(const OmbProjection& other) const override;

protected:
    Affine affine(const OmbProjCachedNumbers* baseCached) const override;

private:
    double up_ = 0;
};

class OmbProjectionWithNewOrigin : public OmbWrappingProjection {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    OmbProjectionWithNewOrigin() = default;
    // Named after the base with "Recentered" appended.
    OmbProjectionWithNewOrigin(const OmbRef<OmbProjection>& base, const OmbPoint& newOrigin);
    OmbProjectionWithNewOrigin* clone() const override { return new OmbProjectionWithNewOrigin(*this); }

    // Long/lat in degrees of the point that projects to (0, 0).
    const OmbPoint& newOrigin() const noexcept { return newOrigin_; }
    void newOrigin(const OmbPoint& lola) { newOrigin_ = lola; }
    bool equivalent(const OmbProjection& other) const override;

protected:
    Affine affine(const OmbProjCachedNumbers* baseCached) const override;

private:
    OmbPoint newOrigin_;
};
