// Transverse Mercator and UTM.
//
// Immutable once read; shared between threads.
#pragma once

#include <oecore/crs/projection.h>

class OmbTransverseMercator : public OmbProjection {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    OmbTransverseMercator() = default;
    OmbTransverseMercator(double centralLongitude, double centralLatitude, double falseEasting, double falseNorthing,
                          double scaleFactor, const OmbRef<OmbLengthUnit>& lengthUnit = OmbRef<OmbLengthUnit>());
    OmbTransverseMercator* clone() const override { return new OmbTransverseMercator(*this); }

    using OmbProjection::project;
    using OmbProjection::unproject;
    OmbProjCachedNumbers* init(const OmbGeodeticDatum& datum) const override;
    void project(OmbPointArray& points, const OmbProjCachedNumbers* cached) const override;
    void project(OmbPoint& p, const OmbProjCachedNumbers* cached) const override;
    void unproject(OmbPointArray& points, const OmbProjCachedNumbers* cached) const override;
    void unproject(OmbPoint& p, const OmbProjCachedNumbers* cached) const override;
    void nominalMetersXY(const OmbProjCachedNumbers* cached, double& mx, double& my) const override;
    bool equivalent(const OmbProjection& other) const override { return sameParameters(other); }
};

// A UTM zone: Transverse Mercator with the zone's central meridian, scale
// 0.9996, false easting 500 km and false northing 10 000 km in the south.
class OmbUTM : public OmbProjection {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    // Zone 1..60; OmbXRangeError otherwise. Named "Utm" + zone + "N" or "S".
    explicit OmbUTM(int zone = 1, OmbUTMHemisphere hemisphere = OmbUTMHemisphere::North);
    OmbUTM(const OmbUTM& other);
    OmbUTM* clone() const override { return new OmbUTM(*this); }

    int zone() const noexcept { return zone_; }
    void zone(int zone) { set(zone, hemisphere_); }
    OmbUTMHemisphere hemisphere() const noexcept { return hemisphere_; }
    void hemisphere(OmbUTMHemisphere hemisphere) { set(zone_, hemisphere); }

    using OmbProjection::project;
    using OmbProjection::unproject;
    OmbProjCachedNumbers* init(const OmbGeodeticDatum& datum) const override { return tm_->init(datum); }
    bool project(const OmbRect& in, const OmbProjCachedNumbers* cached, OmbRect& out) const override {
        return tm_->project(in, cached, out);
    }
    void project(OmbPointArray& points, const OmbProjCachedNumbers* cached) const override {
        tm_->project(points, cached);
    }
    void project(OmbPoint& p, const OmbProjCachedNumbers* cached) const override { tm_->project(p, cached); }
    void unproject(OmbPointArray& points, const OmbProjCachedNumbers* cached) const override {
        tm_->unproject(points, cached);
    }
    void unproject(OmbPoint& p, const OmbProjCachedNumbers* cached) const override { tm_->unproject(p, cached); }
    void nominalMetersXY(const OmbProjCachedNumbers* cached, double& mx, double& my) const override {
        tm_->nominalMetersXY(cached, mx, my);
    }
    bool equivalent(const OmbProjection& other) const override;

private:
    static OmbString zoneName(int zone, OmbUTMHemisphere hemisphere);
    void set(int zone, OmbUTMHemisphere hemisphere);

    int zone_ = 1;
    OmbUTMHemisphere hemisphere_ = OmbUTMHemisphere::North;
    OmbRef<OmbTransverseMercator> tm_;
};
