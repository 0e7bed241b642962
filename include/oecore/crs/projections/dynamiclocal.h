// A local plane about a centre that moves: x and y grow by a fixed number of
// units per degree (a nautical mile per arc minute of latitude, shrunk by
// the cosine of the centre's latitude in x), turned so that `up` points up.
// For views that follow a moving vehicle.
//
// The only projection that changes while in use: set() and every
// conversion are serialised by the projection's own lock.
#pragma once

#include <oecore/crs/projection.h>

#include <mutex>

class OmbDynamicLocalProjection : public OmbProjection {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    OmbDynamicLocalProjection();
    OmbDynamicLocalProjection(const OmbDynamicLocalProjection& other);
    OmbDynamicLocalProjection* clone() const override { return new OmbDynamicLocalProjection(*this); }

    // The centre (degrees) and the direction shown upwards (degrees
    // counter-clockwise from north).
    void set(double longitude, double latitude, double up);
    double up() const;
    void up(double degrees);
    // The centre, read under the lock.
    OmbPoint centre() const;

    using OmbProjection::project;
    using OmbProjection::unproject;
    void project(OmbPointArray& points, const OmbProjCachedNumbers* cached) const override;
    void project(OmbPoint& p, const OmbProjCachedNumbers* cached) const override;
    void unproject(OmbPointArray& points, const OmbProjCachedNumbers* cached) const override;
    void unproject(OmbPoint& p, const OmbProjCachedNumbers* cached) const override;
    void nominalMetersXY(const OmbProjCachedNumbers* cached, double& mx, double& my) const override;
    OmbPoint projectedOrigin(const OmbProjCachedNumbers*) const override { return {}; }
    bool equivalent(const OmbProjection& other) const override;

private:
    // The state the conversions use, copied out under the lock.
    struct Frame {
        double longitude = 0, latitude = 0;
        double kx = 0, ky = 0;  // metres per degree
        double cosUp = 1, sinUp = 0;
    };
    Frame frame() const;
    static void forward(const Frame& f, double unitsPerMeter, OmbPoint& p);
    static void inverse(const Frame& f, double metersPerUnit, OmbPoint& p);

    mutable std::mutex mutex_;
    double up_ = 0;
    Frame frame_;
};
