// The projections evaluated through the PROJ library: Albers equal-area
// conic, Lambert azimuthal equal area, Cassini-Soldner, Hotine oblique
// Mercator, Laborde oblique Mercator and the New Zealand map grid.
//
// Each builds a "+proj=..." definition from its parameters and the datum's
// ellipsoid at init(); the PROJ object lives in the cached numbers, which
// serialise their calls into PROJ. Immutable once read; shared between
// threads.
#pragma once

#include <oecore/crs/projections/azimuthal.h>

#include <string>

// The evaluation through PROJ, added to a projection base class.
template <class Base>
class OmbProjLibEvaluated : public Base {
public:
    using Base::project;
    using Base::unproject;
    OmbProjCachedNumbers* init(const OmbGeodeticDatum& datum) const override;
    void project(OmbPointArray& points, const OmbProjCachedNumbers* cached) const override;
    void project(OmbPoint& p, const OmbProjCachedNumbers* cached) const override;
    void unproject(OmbPointArray& points, const OmbProjCachedNumbers* cached) const override;
    void unproject(OmbPoint& p, const OmbProjCachedNumbers* cached) const override;
    void nominalMetersXY(const OmbProjCachedNumbers* cached, double& mx, double& my) const override;

    // The PROJ definition for the ellipsoid of cached (false origin 0).
    virtual std::string definition(const OmbProjCachedNumbers& cached) const = 0;

protected:
    // "+a=... +f=..." for the ellipsoid, as PROJ takes it.
    static std::string ellipsoidParameters(const OmbProjCachedNumbers& cached);
    // "+lon_0=... +lat_0=..." of the centre.
    std::string centreParameters() const;
};

class OmbAlbersEqualAreaConic : public OmbProjLibEvaluated<OmbProjection> {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    OmbAlbersEqualAreaConic* clone() const override { return new OmbAlbersEqualAreaConic(*this); }
    double standardParallel1() const noexcept { return standardParallel1_; }
    void standardParallel1(double degrees) { standardParallel1_ = degrees; }
    double standardParallel2() const noexcept { return standardParallel2_; }
    void standardParallel2(double degrees) { standardParallel2_ = degrees; }
    std::string definition(const OmbProjCachedNumbers& cached) const override;
    bool equivalent(const OmbProjection& other) const override;

private:
    double standardParallel1_ = 0;
    double standardParallel2_ = 0;
};

class OmbAzimuthalEqualArea : public OmbProjLibEvaluated<OmbAzimuthalGlobal>, public OmbEarthShapeParameters {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    OmbAzimuthalEqualArea() : OmbEarthShapeParameters(OmbEarthShape::Ellipsoid) {}
    OmbAzimuthalEqualArea* clone() const override { return new OmbAzimuthalEqualArea(*this); }
    std::string definition(const OmbProjCachedNumbers& cached) const override;
    bool equivalent(const OmbProjection& other) const override;

private:
};

class OmbCassiniSoldner : public OmbProjLibEvaluated<OmbProjection> {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    OmbCassiniSoldner* clone() const override { return new OmbCassiniSoldner(*this); }
    std::string definition(const OmbProjCachedNumbers& cached) const override;
    bool equivalent(const OmbProjection& other) const override { return sameParameters(other); }
};

// Where a Hotine oblique Mercator measures from: the centre (EPSG 9815) or
// the natural origin near the equator (EPSG 9812).
enum class OmbHotineObliqueMercatorTrueOrigin { CentralPoint = 0, HotineNaturalOriginNearEquator = 1 };
OMB_DESCRIBE_ENUM(OmbHotineObliqueMercatorTrueOrigin, "HotineObliqueMercatorTrueOrigin",
                  {{"CentralPoint", 0}, {"HotineNaturalOriginNearEquator", 1}})

class OmbHotineObliqueMercator : public OmbProjLibEvaluated<OmbProjection> {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    OmbHotineObliqueMercator* clone() const override { return new OmbHotineObliqueMercator(*this); }
    // Of the centre line at the centre, degrees clockwise from north.
    double azimuth() const noexcept { return azimuth_; }
    void azimuth(double degrees) { azimuth_ = degrees; }
    // From the rectified grid to the skew grid, degrees.
    double rectifiedGridAngle() const noexcept { return rectifiedGridAngle_; }
    void rectifiedGridAngle(double degrees) { rectifiedGridAngle_ = degrees; }
    OmbHotineObliqueMercatorTrueOrigin trueOrigin() const noexcept { return trueOrigin_; }
    void trueOrigin(OmbHotineObliqueMercatorTrueOrigin origin) { trueOrigin_ = origin; }
    std::string definition(const OmbProjCachedNumbers& cached) const override;
    bool equivalent(const OmbProjection& other) const override;

private:
    double azimuth_ = 0;
    double rectifiedGridAngle_ = 0;
    OmbHotineObliqueMercatorTrueOrigin trueOrigin_ = OmbHotineObliqueMercatorTrueOrigin::CentralPoint;
};

class OmbLabordeObliqueMercator : public OmbProjLibEvaluated<OmbProjection> {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    OmbLabordeObliqueMercator* clone() const override { return new OmbLabordeObliqueMercator(*this); }
    double azimuth() const noexcept { return azimuth_; }
    void azimuth(double degrees) { azimuth_ = degrees; }
    std::string definition(const OmbProjCachedNumbers& cached) const override;
    bool equivalent(const OmbProjection& other) const override;

private:
    double azimuth_ = 0;
};

// New Zealand map grid: its own origin and the International 1924
// ellipsoid, whatever the datum.
class OmbNewZealandMapGrid : public OmbProjLibEvaluated<OmbProjection> {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    OmbNewZealandMapGrid* clone() const override { return new OmbNewZealandMapGrid(*this); }
    std::string definition(const OmbProjCachedNumbers&) const override { return "+proj=nzmg +ellps=intl +no_defs"; }
    bool equivalent(const OmbProjection& other) const override { return sameParameters(other); }
};
