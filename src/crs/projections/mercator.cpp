// Mercator and Miller cylindrical.
//
// Mercator: Snyder, Map Projections - A Working Manual, USGS PP 1395,
// eqs. 7-1, 7-2 (sphere), 7-6, 7-7 (ellipsoid), the inverse by the
// iteration of eq. 7-9. The scale of a standard parallel by eq. 7-8 (its
// spherical form, cos lat1). Miller: Snyder eqs. 11-1, 11-2 in the general
// form y = y_Mercator(c lat) / c with Miller's c = 0.8.
//
// Exact within rounding; valid for the whole world: latitudes beyond
// +-89.98 are compressed towards the pole so that the poles map to +-89.99
// and y stays finite.
#include "projectiondescriptions.h"
#include "projectionmath.h"

#include <oecore/core/exception.h>
#include <oecore/crs/projections/mercator.h>

#include <cmath>

OMB_DEFINE_ENGINE_CLASS(OmbMercator, OmbProjection, "MercatorProjection", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbMercator)
OMB_DEFINE_ENGINE_CLASS(OmbMiller, OmbMercator, "MillerCylindricalProjection", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbMiller)

OMB_DESCRIBE_CLASS(OmbMercator) {
    using M = OmbMercator;
    Omb_describeCentralLongitude(d);
    Omb_describeFalseOrigin(d);
    Omb_describeScaleFactor(d);
    d.property<double>(
        "StandardParallel", [](const M& p) { return p.standardParallel(); },
        [](M& p, double v) { p.standardParallel(v); });
    Omb_describeEarthShape(d, OmbEarthShape::Sphere);
}

OMB_DESCRIBE_CLASS(OmbMiller) {
    d.property<double>(
        "Compromise", [](const OmbMiller& p) { return p.compromise(); },
        [](OmbMiller& p, double v) { p.compromise(v); }, 0.8);
}

namespace {

using namespace OmbProjectionMath;

constexpr double poleCompressionStart = 89.98;

class MercatorCachedNumbers : public OmbProjCachedNumbers {
public:
    MercatorCachedNumbers(const OmbGeodeticDatum& datum, const OmbMercator& m, double compromiseFactor)
        : OmbProjCachedNumbers(datum, m.metersPerProjUnit()), compromise(compromiseFactor) {
        ellipsoidal = m.shape() == OmbEarthShape::Ellipsoid && compromise == 1;
        const double radius = ellipsoidal ? a : m.sphereRadiusFor(*this, m.standardParallel());
        double k0 = m.scaleFactor();
        if (m.standardParallel() != 0) {
            const double lat1 = m.standardParallel() * radiansPerDegree;
            const double s = std::sin(lat1);
            k0 = std::cos(lat1) / (ellipsoidal ? std::sqrt(1 - e2 * s * s) : 1.0);
        }
        kx = ky = radius * k0 * radiansPerDegree * unitsPerMeter;
        centralLongitude = m.centralLongitude();
        falseEasting = m.falseEasting();
        falseNorthing = m.falseNorthing();
        groundPerUnit = metersPerUnit / k0;
    }

    bool ellipsoidal;
    double compromise;
    double kx, ky;  // projected units per degree
    double centralLongitude, falseEasting, falseNorthing;
    double groundPerUnit;
};

const MercatorCachedNumbers& numbers(const OmbProjCachedNumbers* cached) {
    return *static_cast<const MercatorCachedNumbers*>(cached);
}

inline double moveAwayFromPole(double lat) {
    const double away = std::fabs(lat) - poleCompressionStart;
    return away > 0 ? std::copysign(poleCompressionStart + std::min(away / 2, 0.01), lat) : lat;
}

inline double moveTowardsPole(double lat) {
    const double away = std::fabs(lat) - poleCompressionStart;
    return away > 0 ? std::copysign(std::min(poleCompressionStart + 2 * away, 90.0), lat) : lat;
}

// Longitudes are wrapped only when outside [-180, 180], so -180 stays.
inline double intoWorld(double lon) { return lon >= -180 && lon <= 180 ? lon : wrapLongitude(lon); }

// The sine of an angle in [-pi/2, pi/2] by its Taylor series to the 21st
// power (the remainder stays below 1e-17). Unlike the library's sin it needs
// no argument reduction and inlines into the array loops: three times
// faster.
inline double sinOfLatitude(double x) {
    const double x2 = x * x;
    return x *
           (1 + x2 * (-1.0 / 6 +
                      x2 * (1.0 / 120 + x2 * (-1.0 / 5040 +
                                              x2 * (1.0 / 362880 +
                                                    x2 * (-1.0 / 39916800 +
                                                          x2 * (1.0 / 6227020800 +
                                                                x2 * (-1.0 / 1307674368000 +
                                                                      x2 * (1.0 / 355687428096000 +
                                                                            x2 * (-1.0 / 121645100408832000 +
                                                                                  x2 / 51090942171709440000.0))))))))));
}

// atanh(s), by the logarithm alone.
inline double atanhOf(double s) { return 0.5 * std::log((1 + s) / (1 - s)); }

// The isometric latitude in radians.
inline double isometric(const MercatorCachedNumbers& c, double lat) {
    const double phi = lat * radiansPerDegree;
    if (c.ellipsoidal) {
        const double s = sinOfLatitude(phi);
        return atanhOf(s) - c.e * atanhOf(c.e * s);
    }
    if (c.compromise <= 0.0001) return phi;
    return atanhOf(sinOfLatitude(c.compromise * phi)) / c.compromise;
}

// Its inverse, in degrees.
inline double latitudeOf(const MercatorCachedNumbers& c, double psi) {
    if (!c.ellipsoidal) {
        if (c.compromise <= 0.0001) return psi * degreesPerRadian;
        return std::atan(std::sinh(c.compromise * psi)) / c.compromise * degreesPerRadian;
    }
    double phi;
    latitudeFromIsometricExp(std::exp(-psi), c.e, phi);
    return phi * degreesPerRadian;
}

inline void forward(const MercatorCachedNumbers& c, OmbPoint& p) {
    const double dLon = intoWorld(p.x - c.centralLongitude);
    p.y = c.falseNorthing + isometric(c, moveAwayFromPole(p.y)) * degreesPerRadian * c.ky;
    p.x = c.falseEasting + dLon * c.kx;
}

inline void inverse(const MercatorCachedNumbers& c, OmbPoint& p) {
    p.x = intoWorld((p.x - c.falseEasting) / c.kx + c.centralLongitude);
    p.y = moveTowardsPole(latitudeOf(c, (p.y - c.falseNorthing) / c.ky * radiansPerDegree));
}

}  // namespace

OmbMercator::OmbMercator() : OmbProjection(true, false), OmbEarthShapeParameters(OmbEarthShape::Sphere) {}

void OmbMercator::standardParallel(double degrees) {
    if (!(degrees >= -89 && degrees <= 89))
        OMB_THROW(RangeError, "standardParallel", "MercatorProjection", "in [-89, 89]");
    standardParallel_ = degrees;
}

OmbProjCachedNumbers* OmbMercator::init(const OmbGeodeticDatum& datum) const {
    return new MercatorCachedNumbers(datum, *this, compromiseFactor());
}

void OmbMercator::project(OmbPointArray& points, const OmbProjCachedNumbers* cached) const {
    const MercatorCachedNumbers& c = numbers(cached);
    for (OmbPoint& p : points) forward(c, p);
}

void OmbMercator::project(OmbPoint& p, const OmbProjCachedNumbers* cached) const { forward(numbers(cached), p); }

void OmbMercator::unproject(OmbPointArray& points, const OmbProjCachedNumbers* cached) const {
    const MercatorCachedNumbers& c = numbers(cached);
    for (OmbPoint& p : points) inverse(c, p);
}

void OmbMercator::unproject(OmbPoint& p, const OmbProjCachedNumbers* cached) const { inverse(numbers(cached), p); }

void OmbMercator::nominalMetersXY(const OmbProjCachedNumbers* cached, double& mx, double& my) const {
    mx = my = numbers(cached).groundPerUnit;
}

bool OmbMercator::equivalent(const OmbProjection& other) const {
    if (!sameParameters(other)) return false;
    const auto& m = static_cast<const OmbMercator&>(other);
    return standardParallel_ == m.standardParallel_ && sameEarthShape(m);
}

bool OmbMercator::compatibleWith(const OmbMercator& other, double worldWidth) const {
    return myRuntimeClass() == other.myRuntimeClass() && shiftedByWholeWorlds(other, worldWidth) &&
           std::fabs(scaleFactor() - other.scaleFactor()) <= 1e-9 &&
           std::fabs(standardParallel_ - other.standardParallel_) <= 1e-9 && falseNorthing() == other.falseNorthing() &&
           sameEarthShape(other) && compromiseFactor() == other.compromiseFactor() &&
           lengthUnit()->equivalent(*other.lengthUnit());
}

bool OmbMiller::equivalent(const OmbProjection& other) const {
    return OmbMercator::equivalent(other) && compromise_ == static_cast<const OmbMiller&>(other).compromise_;
}
