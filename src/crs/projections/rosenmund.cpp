// Rosenmund's oblique Mercator: the ellipsoid onto Gauss's conformal sphere
// (radius sqrt(rho0 nu0) at the central latitude), the sphere turned so
// that the normal point lies on its equator, then the spherical Mercator.
// Rosenmund (1903); EPSG Guidance Note 7-2, method 9814 (Swiss Oblique
// Mercator); swisstopo, "Formulas and constants for the calculation of the
// Swiss conformal cylindrical projection", 2016, section 3. Exact within
// rounding; the inverse iterates the latitude to 1e-12 rad.
#include "projectiondescriptions.h"
#include "projectionmath.h"

#include <oecore/crs/projections/rosenmund.h>

#include <cmath>

using namespace OmbProjectionMath;

OMB_DEFINE_ENGINE_CLASS(OmbRosenmundObliqueMercator, OmbProjection, "RosenmundObliqueMercatorProjection", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbRosenmundObliqueMercator)

OMB_DESCRIBE_CLASS(OmbRosenmundObliqueMercator) {
    Omb_describeCentre(d);
    Omb_describeFalseOrigin(d);
    d.property<double>(
        "NormalLatitude", [](const OmbRosenmundObliqueMercator& p) { return p.normalLatitude(); },
        [](OmbRosenmundObliqueMercator& p, double v) { p.normalLatitude(v); });
    Omb_describeScaleFactor(d);
}

namespace {

class RomCachedNumbers : public OmbProjCachedNumbers {
public:
    RomCachedNumbers(const OmbGeodeticDatum& datum, const OmbRosenmundObliqueMercator& p)
        : OmbProjCachedNumbers(datum, p.metersPerProjUnit()) {
        const double lat0 = p.centralLatitude() * radiansPerDegree;
        const double s0 = std::sin(lat0), c0 = std::cos(lat0);
        radius = a * std::sqrt(1 - e2) / (1 - e2 * s0 * s0) * p.scaleFactor();
        alpha = std::sqrt(1 + e2 / (1 - e2) * c0 * c0 * c0 * c0);
        const double b0 = p.normalLatitude() != 0 ? p.normalLatitude() * radiansPerDegree : std::asin(s0 / alpha);
        sinB0 = std::sin(b0), cosB0 = std::cos(b0);
        K = std::log(std::tan(M_PI / 4 + b0 / 2)) - alpha * isometric(lat0);
        centralLongitude = p.centralLongitude();
        falseEasting = p.falseEasting() * metersPerUnit, falseNorthing = p.falseNorthing() * metersPerUnit;
    }

    double isometric(double lat) const {
        const double s = std::sin(lat);
        return std::atanh(s) - e * std::atanh(e * s);
    }

    double radius, alpha, sinB0, cosB0, K;
    double centralLongitude, falseEasting, falseNorthing;
};

const RomCachedNumbers& numbers(const OmbProjCachedNumbers* cached) {
    return *static_cast<const RomCachedNumbers*>(cached);
}

}  // namespace

OmbProjCachedNumbers* OmbRosenmundObliqueMercator::init(const OmbGeodeticDatum& datum) const {
    return new RomCachedNumbers(datum, *this);
}

void OmbRosenmundObliqueMercator::project(OmbPoint& p, const OmbProjCachedNumbers* cached) const {
    const RomCachedNumbers& c = numbers(cached);
    // On the sphere: latitude b and longitude l from the central meridian.
    const double b = 2 * std::atan(std::exp(c.alpha * c.isometric(p.y * radiansPerDegree) + c.K)) - M_PI / 2;
    const double l = c.alpha * wrapLongitude(p.x - c.centralLongitude) * radiansPerDegree;
    // Turned so that the normal point lies on the equator.
    const double lTurned =
        std::atan2(std::sin(l) * std::cos(b), c.sinB0 * std::sin(b) + c.cosB0 * std::cos(b) * std::cos(l));
    const double sinBTurned = c.cosB0 * std::sin(b) - c.sinB0 * std::cos(b) * std::cos(l);
    p.x = (c.falseEasting + c.radius * lTurned) * c.unitsPerMeter;
    p.y = (c.falseNorthing + c.radius * std::atanh(sinBTurned)) * c.unitsPerMeter;
}

void OmbRosenmundObliqueMercator::unproject(OmbPoint& p, const OmbProjCachedNumbers* cached) const {
    const RomCachedNumbers& c = numbers(cached);
    const double lTurned = (p.x * c.metersPerUnit - c.falseEasting) / c.radius;
    const double bTurned = 2 * std::atan(std::exp((p.y * c.metersPerUnit - c.falseNorthing) / c.radius)) - M_PI / 2;
    const double sinB = c.cosB0 * std::sin(bTurned) + c.sinB0 * std::cos(bTurned) * std::cos(lTurned);
    if (std::fabs(sinB) > 1.00000000000001) projectionError(p, "arcsin failed in RosenmundObliqueMercator");
    const double b = std::asin(std::clamp(sinB, -1.0, 1.0));
    const double l = std::atan2(std::sin(lTurned) * std::cos(bTurned),
                                c.cosB0 * std::cos(bTurned) * std::cos(lTurned) - c.sinB0 * std::sin(bTurned));
    // The isometric latitude on the ellipsoid, then the latitude.
    const double psi = (std::log(std::tan(M_PI / 4 + b / 2)) - c.K) / c.alpha;
    double lat;
    if (!latitudeFromIsometricExp(std::exp(-psi), c.e, lat)) projectionError(p, "the latitude did not converge");
    p.x = wrapLongitude(c.centralLongitude + l / c.alpha * degreesPerRadian);
    p.y = lat * degreesPerRadian;
}

void OmbRosenmundObliqueMercator::nominalMetersXY(const OmbProjCachedNumbers* cached, double& mx, double& my) const {
    mx = my = cached->metersPerUnit / scaleFactor();
}

bool OmbRosenmundObliqueMercator::equivalent(const OmbProjection& other) const {
    return sameParameters(other) &&
           normalLatitude_ == static_cast<const OmbRosenmundObliqueMercator&>(other).normalLatitude_;
}
