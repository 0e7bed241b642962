// Oblique and polar stereographic projections on the ellipsoid.
//
// Both oblique variants map the ellipsoid conformally onto a sphere and
// project that sphere stereographically; they differ in the sphere.
// UnitedStates: the conformal latitude chi with the longitude unchanged,
// scaled to true scale k0 at the centre (Snyder, Map Projections - A Working
// Manual, USGS PP 1395, eqs. 3-1, 21-27 to 21-30, 21-36 to 21-39).
// International: Gauss's conformal sphere of radius sqrt(rho0 nu0) with the
// longitude multiplied by n (EPSG Guidance Note 7-2, method 9809, "Oblique
// Stereographic"); the inverse there is taken through the spherical
// stereographic inverse on the same sphere, which holds in every quadrant.
// Polar stereographic: Snyder eqs. 21-33, 21-34, 21-35 to 21-40, with the
// scale given at the pole (EPSG 9810) or by a standard parallel (EPSG 9829).
// Exact within rounding.
#include "projectiondescriptions.h"
#include "projectionmath.h"

#include <oecore/core/exception.h>
#include <oecore/crs/projections/azimuthal.h>

#include <cmath>

using namespace OmbProjectionMath;

OMB_DEFINE_ENGINE_CLASS(OmbStereographic, OmbAzimuthalGlobal, "StereographicProjection", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbStereographic)
OMB_DEFINE_ENGINE_CLASS(OmbPolarStereographic, OmbAzimuthalGlobal, "PolarStereographicProjection", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbPolarStereographic)

OMB_DESCRIBE_CLASS(OmbStereographic) {
    Omb_describeScaleFactor(d);
    d.property<OmbStereographicVariant>(
        "Variant", [](const OmbStereographic& p) { return p.variant(); },
        [](OmbStereographic& p, OmbStereographicVariant v) { p.variant(v); }, OmbStereographicVariant::UnitedStates);
}

OMB_DESCRIBE_CLASS(OmbPolarStereographic) {
    using P = OmbPolarStereographic;
    d.property<bool>(
        "NorthPole", [](const P& p) { return p.northPole(); }, [](P& p, bool v) { p.northPole(v); }, true);
    Omb_describeScaleFactor(d);
    d.property<double>(
        "StandardParallel", [](const P& p) { return p.standardParallel(); },
        [](P& p, double v) { p.standardParallel(v); });
}

namespace {

// The isometric latitude of a geodetic latitude (radians).
double isometric(double lat, double e) {
    const double s = std::sin(lat);
    return std::atanh(s) - e * std::atanh(e * s);
}

class StereographicCachedNumbers : public OmbProjCachedNumbers {
public:
    StereographicCachedNumbers(const OmbGeodeticDatum& datum, const OmbStereographic& p)
        : OmbProjCachedNumbers(datum, p.metersPerProjUnit()) {
        const double lat0 = p.centralLatitude() * radiansPerDegree;
        const double s0 = std::sin(lat0), c0 = std::cos(lat0);
        const double k0 = p.scaleFactor();
        if (p.variant() == OmbStereographicVariant::International) {
            n = std::sqrt(1 + e2 * c0 * c0 * c0 * c0 / (1 - e2));
            const double sinChi = std::tanh(n * isometric(lat0, e));
            const double c = (n + s0) * (1 - sinChi) / ((n - s0) * (1 + sinChi));
            halfLogC = std::log(c) / 2;
            const double radius = a * std::sqrt(1 - e2) / (1 - e2 * s0 * s0);
            diameter = 2 * radius * k0;
        } else {
            n = 1;
            halfLogC = 0;
            // The conformal sphere's scale at the centre is m0 / cos(chi0).
            const double m0 = c0 / std::sqrt(1 - e2 * s0 * s0);
            const double cosChi0 = 1 / std::cosh(isometric(lat0, e));
            diameter = 2 * a * k0 * m0 / cosChi0;
        }
        const double chi0 = std::asin(std::tanh(n * isometric(lat0, e) + halfLogC));
        sinChi0 = std::sin(chi0), cosChi0 = std::cos(chi0);
        diameter *= unitsPerMeter;
        centralLongitude = p.centralLongitude();
        falseEasting = p.falseEasting(), falseNorthing = p.falseNorthing();
    }

    // The conformal latitude's sine and cosine for a geodetic latitude.
    void conformal(double lat, double& sinChi, double& cosChi) const {
        const double q = n * isometric(lat, e) + halfLogC;
        sinChi = std::tanh(q);
        cosChi = 1 / std::cosh(q);
    }
    // 1 + cos of the angle between the centre and the point on the sphere.
    double denominator(double sinChi, double cosChi, double dLon) const {
        return 1 + sinChi0 * sinChi + cosChi0 * cosChi * std::cos(dLon);
    }

    double n, halfLogC, diameter, sinChi0, cosChi0;
    double centralLongitude, falseEasting, falseNorthing;
};

const StereographicCachedNumbers& stereographic(const OmbProjCachedNumbers* cached) {
    return *static_cast<const StereographicCachedNumbers*>(cached);
}

class PolarCachedNumbers : public OmbProjCachedNumbers {
public:
    PolarCachedNumbers(const OmbGeodeticDatum& datum, const OmbPolarStereographic& p)
        : OmbProjCachedNumbers(datum, p.metersPerProjUnit()) {
        sign = p.northPole() ? 1 : -1;
        if (p.standardParallel() != 0) {
            const double latC = sign * p.standardParallel() * radiansPerDegree;
            const double s = std::sin(latC);
            const double mC = std::cos(latC) / std::sqrt(1 - e2 * s * s);
            factor = a * mC / isometricExp(latC, e);
        } else {
            factor = 2 * a * p.scaleFactor() / std::sqrt(std::pow(1 + e, 1 + e) * std::pow(1 - e, 1 - e));
        }
        factor *= unitsPerMeter;
        centralLongitude = p.centralLongitude();
        falseEasting = p.falseEasting(), falseNorthing = p.falseNorthing();
    }

    double sign;    // 1 about the north pole, -1 about the south pole
    double factor;  // rho = factor * t, in projected units
    double centralLongitude, falseEasting, falseNorthing;
};

const PolarCachedNumbers& polar(const OmbProjCachedNumbers* cached) {
    return *static_cast<const PolarCachedNumbers*>(cached);
}

inline void polarForward(const PolarCachedNumbers& c, OmbPoint& p) {
    const double dLon = (p.x - c.centralLongitude) * radiansPerDegree;
    const double rho = c.factor * isometricExp(c.sign * p.y * radiansPerDegree, c.e);
    p.x = c.falseEasting + rho * std::sin(dLon);
    p.y = c.falseNorthing - c.sign * rho * std::cos(dLon);
}

}  // namespace

// --- oblique ----------------------------------------------------------------------

OmbStereographic::OmbStereographic(double centralLongitude, double centralLatitude, double scaleFactor,
                                   OmbStereographicVariant variant, double falseEasting, double falseNorthing)
    : variant_(variant) {
    set(centralLongitude, centralLatitude);
    this->scaleFactor(scaleFactor);
    this->falseEasting(falseEasting);
    this->falseNorthing(falseNorthing);
}

OmbProjCachedNumbers* OmbStereographic::init(const OmbGeodeticDatum& datum) const {
    return new StereographicCachedNumbers(datum, *this);
}

void OmbStereographic::project(OmbPoint& p, const OmbProjCachedNumbers* cached) const {
    const StereographicCachedNumbers& c = stereographic(cached);
    double sinChi, cosChi;
    c.conformal(p.y * radiansPerDegree, sinChi, cosChi);
    const double dLon = c.n * wrapLongitude(p.x - c.centralLongitude) * radiansPerDegree;
    const double b = c.denominator(sinChi, cosChi, dLon);
    if (b <= 1e-15) projectionError(p, "the antipode of the centre has no image");
    p.x = c.falseEasting + c.diameter * cosChi * std::sin(dLon) / b;
    p.y = c.falseNorthing + c.diameter * (c.cosChi0 * sinChi - c.sinChi0 * cosChi * std::cos(dLon)) / b;
}

void OmbStereographic::unproject(OmbPoint& p, const OmbProjCachedNumbers* cached) const {
    const StereographicCachedNumbers& c = stereographic(cached);
    const double x = p.x - c.falseEasting, y = p.y - c.falseNorthing;
    const double rho = std::hypot(x, y);
    double sinChi = c.sinChi0, dLon = 0;
    if (rho > 0) {
        const double angle = 2 * std::atan(rho / c.diameter);
        const double sinA = std::sin(angle), cosA = std::cos(angle);
        sinChi = std::clamp(cosA * c.sinChi0 + y * sinA * c.cosChi0 / rho, -1.0, 1.0);
        dLon = std::atan2(x * sinA, rho * c.cosChi0 * cosA - y * c.sinChi0 * sinA);
    }
    const double psi = (std::atanh(sinChi) - c.halfLogC) / c.n;
    double lat;
    if (!latitudeFromIsometricExp(std::exp(-psi), c.e, lat)) projectionError(p, "the latitude did not converge");
    p.x = wrapLongitude(c.centralLongitude + dLon / c.n * degreesPerRadian);
    p.y = lat * degreesPerRadian;
}

bool OmbStereographic::isValid(const OmbPoint& lola, const OmbProjCachedNumbers* cached) const {
    if (!OmbProjection::isValid(lola, cached)) return false;
    const StereographicCachedNumbers& c = stereographic(cached);
    double sinChi, cosChi;
    c.conformal(lola.y * radiansPerDegree, sinChi, cosChi);
    return c.denominator(sinChi, cosChi, c.n * wrapLongitude(lola.x - c.centralLongitude) * radiansPerDegree) > 1e-15;
}

bool OmbStereographic::equivalent(const OmbProjection& other) const {
    return sameAzimuthalParameters(other) && variant_ == static_cast<const OmbStereographic&>(other).variant_;
}

// --- polar ------------------------------------------------------------------------

OmbPolarStereographic::OmbPolarStereographic(bool northPole) { this->northPole(northPole); }

void OmbPolarStereographic::northPole(bool north) {
    northPole_ = north;
    centralLatitude(north ? 90 : -90);
}

OmbProjCachedNumbers* OmbPolarStereographic::init(const OmbGeodeticDatum& datum) const {
    const OmbString where = name().empty() ? OmbString::literal("PolarStereographicProjection") : name();
    if (standardParallel_ != 0 && scaleFactor() != 1) OMB_THROW(PolarStereographicTooManyArgumentsSpecified, where);
    if (standardParallel_ != 0 && (standardParallel_ > 0) != northPole_)
        OMB_THROW(RangeError, "standardParallel", where, "same hemisphere as central pole");
    return new PolarCachedNumbers(datum, *this);
}

void OmbPolarStereographic::project(OmbPointArray& points, const OmbProjCachedNumbers* cached) const {
    const PolarCachedNumbers& c = polar(cached);
    for (OmbPoint& p : points) polarForward(c, p);
}

void OmbPolarStereographic::project(OmbPoint& p, const OmbProjCachedNumbers* cached) const {
    polarForward(polar(cached), p);
}

void OmbPolarStereographic::unproject(OmbPoint& p, const OmbProjCachedNumbers* cached) const {
    const PolarCachedNumbers& c = polar(cached);
    const double x = p.x - c.falseEasting, y = c.sign * (p.y - c.falseNorthing);
    double lat;
    if (!latitudeFromIsometricExp(std::hypot(x, y) / c.factor, c.e, lat))
        projectionError(p, "the latitude did not converge");
    p.x = wrapLongitude(c.centralLongitude + std::atan2(x, -y) * degreesPerRadian);
    p.y = c.sign * lat * degreesPerRadian;
}

bool OmbPolarStereographic::isValid(const OmbPoint& lola, const OmbProjCachedNumbers* cached) const {
    return OmbProjection::isValid(lola, cached) && std::fabs(lola.y + centralLatitude()) > 1e-9;
}

bool OmbPolarStereographic::equivalent(const OmbProjection& other) const {
    if (!sameAzimuthalParameters(other)) return false;
    const auto& p = static_cast<const OmbPolarStereographic&>(other);
    return northPole_ == p.northPole_ && standardParallel_ == p.standardParallel_;
}
