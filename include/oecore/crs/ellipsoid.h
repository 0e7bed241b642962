// OmbEllipsoid: the reference ellipsoid of a geodetic datum.
//
// Immutable once made; shared between threads.
#pragma once

#include <oecore/config/classdescription.h>
#include <oecore/core/resourceobject.h>

// Every predefined ellipsoid: name, accessor, a (m), 1/f, EPSG code.
// clang-format off
#define OMB_PREDEFINED_ELLIPSOIDS(X) \
    X(Airy1830, airy1830, 6377563.396, 299.3249646, 7001) \
    X(AiryModified1849, airyModified1849, 6377340.189, 299.3249646, 7002) \
    X(AustralianNationalSpheroid, australianNationalSpheroid, 6378160.0, 298.25, 7003) \
    X(Bessel1841, bessel1841, 6377397.155, 299.1528128, 7004) \
    X(BesselNorway, besselNorway, 6377492.018, 299.1528128, 7005) \
    X(BesselNamibia, besselNamibia, 6377483.865, 299.1528128, 7004) \
    X(Clarke1858, clarke1858, 6378293.645, 294.26067636926103, 7007) \
    X(Clarke1866, clarke1866, 6378206.4, 294.9786982138982, 7008) \
    X(Clarke1880, clarke1880, 6378249.144808011, 293.46630765562986, 7034) \
    X(Clarke1880Arc, clarke1880Arc, 6378249.145, 293.4663077, 7013) \
    X(Clarke1880Benoit, clarke1880Benoit, 6378300.789, 293.4663155389811, 7010) \
    X(Clarke1880Ign, clarke1880Ign, 6378249.2, 293.4660212936269, 7011) \
    X(Clarke1880Rgs, clarke1880Rgs, 6378249.145, 293.465, 7012) \
    X(Everest1830Definition, everest1830Definition, 6377299.365595381, 300.80172554336184, 7042) \
    X(Everest1830_1937Adjustment, everest1830_1937Adjustment, 6377276.345, 300.8017, 7015) \
    X(Everest1830_1962Definition, everest1830_1962Definition, 6377301.243, 300.8017255, 7044) \
    X(Everest1830_1967Definition, everest1830_1967Definition, 6377298.556, 300.8017, 7016) \
    X(Everest1830_1975Definition, everest1830_1975Definition, 6377299.151, 300.8017255, 7045) \
    X(Everest1830Rso1969, everest1830Rso1969, 6377295.664, 300.8017, 7056) \
    X(Everest1830Modified, everest1830Modified, 6377304.063, 300.8017, 7018) \
    X(Grs1967, grs1967, 6378160.0, 298.247167427, 7036) \
    X(Grs1967Modified, grs1967Modified, 6378160.0, 298.25, 7050) \
    X(Grs1980, grs1980, 6378137.0, 298.257222101, 7019) \
    X(Helmert1906, helmert1906, 6378200.0, 298.3, 7020) \
    X(IndonesianNationalSpheroid, indonesianNationalSpheroid, 6378160.0, 298.247, 7021) \
    X(International1924, international1924, 6378388.0, 297.0, 7022) \
    X(Krassowsky1940, krassowsky1940, 6378245.0, 298.3, 7024) \
    X(Plessis1817, plessis1817, 6376523.0, 308.64, 7027) \
    X(PZ90, pz90, 6378136.0, 298.257839303, 7054) \
    X(WarOffice, warOffice, 6378300.0, 296.0, 7029) \
    X(Wgs72, wgs72, 6378135.0, 298.26, 7043) \
    X(Wgs84, wgs84, 6378137.0, 298.257223563, 7030) \
    X(Xian1980, xian1980, 6378140.0, 298.257, 7049)
// clang-format on

class OmbEllipsoid : public OmbResourceObject {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    // An inverse flattening of 0 makes a sphere.
    OmbEllipsoid(double equatorialRadius = 6378137.0, double inverseFlattening = 298.257223563,
                 const OmbString& authority = OmbString(), const OmbString& authorityCode = OmbString());
    OmbEllipsoid* clone() const override { return new OmbEllipsoid(*this); }

    double equatorialRadius() const noexcept { return a_; }
    double inverseFlattening() const noexcept { return inverseF_; }
    double flattening() const noexcept { return f_; }
    double polarRadius() const noexcept { return b_; }
    // First eccentricity squared.
    double e2() const noexcept { return e2_; }
    const OmbString& authority() const noexcept { return authority_; }
    const OmbString& authorityCode() const noexcept { return authorityCode_; }
    // For building from a configuration; an ellipsoid in use must not change.
    void equatorialRadius(double a) { set(a, inverseF_); }
    void inverseFlattening(double inverseFlattening) { set(a_, inverseFlattening); }
    void authority(const OmbString& authority) { authority_ = authority; }
    void authorityCode(const OmbString& code) { authorityCode_ = code; }

    // Radii within 1 mm, and both spheres or inverse flattenings within 1e-8.
    bool equivalent(const OmbEllipsoid& other) const;

    // In place: lon and lat in degrees and height in metres, to geocentric
    // X, Y, Z in metres; and back with one Bowring step.
    void geodeticToGeocentricXYZ(double& lon, double& lat, double& h) const;
    void geocentricXYZToGeodetic(double& x, double& y, double& z) const;

    // The predefined ellipsoids, while the runtime is initialised
    // (registered as "Ellipsoids." + name).
#define OMB_ELLIPSOID_ACCESSOR(NAME, ACCESSOR, A, INVF, CODE) static const OmbRef<OmbEllipsoid>& ACCESSOR();
    OMB_PREDEFINED_ELLIPSOIDS(OMB_ELLIPSOID_ACCESSOR)
#undef OMB_ELLIPSOID_ACCESSOR

    static void createPredefined();
    static void destroyPredefined();

private:
    void set(double equatorialRadius, double inverseFlattening);

    double a_ = 0;
    double inverseF_ = 0;
    double f_ = 0;
    double b_ = 0;
    double e2_ = 0;
    OmbString authority_;
    OmbString authorityCode_;
};
