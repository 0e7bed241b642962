// The projections that leave coordinates as they are: long/lat itself, and
// the plane of data that is not georeferenced (including the screen).
//
// Immutable; shared between threads.
#pragma once

#include <oecore/crs/projection.h>

// Long/lat in degrees. Only the predefined "Projections.LongLat" exists.
class OmbLoLa : public OmbProjection {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    // Raises OmbXInvalidOperation: use OmbProjection::longLat().
    OmbLoLa();
    OmbLoLa* clone() const override { return new OmbLoLa(*this); }

    using OmbProjection::project;
    using OmbProjection::unproject;
    void project(OmbPointArray&, const OmbProjCachedNumbers*) const override {}
    void project(OmbPoint&, const OmbProjCachedNumbers*) const override {}
    void unproject(OmbPointArray&, const OmbProjCachedNumbers*) const override {}
    void unproject(OmbPoint&, const OmbProjCachedNumbers*) const override {}
    // Metres per degree along the equator.
    void nominalMetersXY(const OmbProjCachedNumbers* cached, double& mx, double& my) const override;
    bool equivalent(const OmbProjection& other) const override { return sameParameters(other); }

private:
    friend class OmbProjection;
    struct Predefined {};
    explicit OmbLoLa(Predefined);
};

// Plane coordinates in a length unit, not georeferenced: "unproject" gives
// the same numbers, which no long/lat reading can be made of.
class OmbRectangularProjection : public OmbProjection {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    explicit OmbRectangularProjection(const OmbRef<OmbLengthUnit>& lengthUnit = OmbRef<OmbLengthUnit>()) {
        this->lengthUnit(lengthUnit);
    }
    OmbRectangularProjection* clone() const override { return new OmbRectangularProjection(*this); }

    using OmbProjection::project;
    using OmbProjection::unproject;
    bool project(const OmbRect& in, const OmbProjCachedNumbers*, OmbRect& out) const override;
    void project(OmbPointArray&, const OmbProjCachedNumbers*) const override {}
    void project(OmbPoint&, const OmbProjCachedNumbers*) const override {}
    bool unproject(const OmbRect& in, const OmbProjCachedNumbers*, OmbRect& out) const override;
    void unproject(OmbPointArray&, const OmbProjCachedNumbers*) const override {}
    void unproject(OmbPoint&, const OmbProjCachedNumbers*) const override {}
    bool metersXY(const OmbPoint& p, const OmbProjCachedNumbers* cached, double& mx, double& my) const override;
    void nominalMetersXY(const OmbProjCachedNumbers* cached, double& mx, double& my) const override;
    bool georeferenced() const override { return false; }
    OmbRect getValidArea(const OmbProjCachedNumbers*) const override { return OmbRect::infinite(); }
    bool isValid(const OmbPoint& p, const OmbProjCachedNumbers*) const override;
    bool isValidProjectedPoint(const OmbPoint& p, const OmbProjCachedNumbers* cached) const override {
        return isValid(p, cached);
    }
    OmbPointArray worldPerimeter(const OmbProjCachedNumbers*) const override { return {}; }
    bool equivalent(const OmbProjection& other) const override { return sameParameters(other); }
};
