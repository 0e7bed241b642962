// Krovak, north oriented: EPSG Guidance Note 7-2, methods 9819 (Krovak)
// and 1041 (Krovak North Orientated): the ellipsoid onto Gauss's conformal
// sphere, the sphere turned to oblique coordinates about the cone's axis,
// then a conformal cone touching at the pseudo standard parallel. Easting
// and northing are the negated westing and southing; the south-west form
// gives x = westing, y = southing. Exact within rounding;
// the inverse iterates the latitude to 1e-12 rad.
#include "projectiondescriptions.h"
#include "projectionmath.h"

#include <oecore/crs/projections/krovak.h>

#include <cmath>

using namespace OmbProjectionMath;

OMB_DEFINE_ENGINE_CLASS(OmbKrovak, OmbProjection, "KrovakNorthOrientedProjection", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbKrovak)

OMB_DESCRIBE_CLASS(OmbKrovak) {
    Omb_describeCentre(d);
    d.property<double>(
        "ColatitudeConeAxis", [](const OmbKrovak& p) { return p.colatitudeConeAxis(); },
        [](OmbKrovak& p, double v) { p.colatitudeConeAxis(v); }, 30.28813975277778);
    d.property<double>(
        "PseudoStandardParallel", [](const OmbKrovak& p) { return p.pseudoStandardParallel(); },
        [](OmbKrovak& p, double v) { p.pseudoStandardParallel(v); }, 78.5);
    Omb_describeScaleFactor(d);
    Omb_describeFalseOrigin(d);
    d.property<bool>(
        "NorthOriented", [](const OmbKrovak& p) { return p.northOriented(); },
        [](OmbKrovak& p, bool v) { p.northOriented(v); }, true);
}

namespace {

class KrovakCachedNumbers : public OmbProjCachedNumbers {
public:
    KrovakCachedNumbers(const OmbGeodeticDatum& datum, const OmbKrovak& p)
        : OmbProjCachedNumbers(datum, p.metersPerProjUnit()) {
        const double latC = p.centralLatitude() * radiansPerDegree;
        const double sinC = std::sin(latC), cosC = std::cos(latC);
        const double A = a * std::sqrt(1 - e2) / (1 - e2 * sinC * sinC);
        B = std::sqrt(1 + e2 * cosC * cosC * cosC * cosC / (1 - e2));
        const double gamma0 = std::asin(sinC / B);
        t0 = std::tan(M_PI / 4 + gamma0 / 2) * std::pow((1 + e * sinC) / (1 - e * sinC), e * B / 2) /
             std::pow(std::tan(M_PI / 4 + latC / 2), B);
        const double latP = p.pseudoStandardParallel() * radiansPerDegree;
        n = std::sin(latP);
        r0 = p.scaleFactor() * A / std::tan(latP);
        tanHalfP = std::tan(M_PI / 4 + latP / 2);
        tanP = std::pow(tanHalfP, n);
        const double alpha = p.colatitudeConeAxis() * radiansPerDegree;
        sinAlpha = std::sin(alpha), cosAlpha = std::cos(alpha);
        centralLongitude = p.centralLongitude();
        falseEasting = p.falseEasting() * metersPerUnit, falseNorthing = p.falseNorthing() * metersPerUnit;
    }

    double B, t0, n, r0, tanHalfP, tanP, sinAlpha, cosAlpha;
    double centralLongitude, falseEasting, falseNorthing;
};

const KrovakCachedNumbers& numbers(const OmbProjCachedNumbers* cached) {
    return *static_cast<const KrovakCachedNumbers*>(cached);
}

}  // namespace

OmbKrovak::OmbKrovak() {
    centralLatitude(49.5);
    centralLongitude(24.833333333333333);
    scaleFactor(0.9999);
}

OmbProjCachedNumbers* OmbKrovak::init(const OmbGeodeticDatum& datum) const {
    return new KrovakCachedNumbers(datum, *this);
}

void OmbKrovak::project(OmbPoint& p, const OmbProjCachedNumbers* cached) const {
    const KrovakCachedNumbers& c = numbers(cached);
    const double lat = p.y * radiansPerDegree;
    const double es = c.e * std::sin(lat);
    const double U =
        2 *
        (std::atan(c.t0 * std::pow(std::tan(lat / 2 + M_PI / 4), c.B) / std::pow((1 + es) / (1 - es), c.e * c.B / 2)) -
         M_PI / 4);
    const double V = c.B * wrapLongitude(c.centralLongitude - p.x) * radiansPerDegree;
    const double T = asinSafe(c.cosAlpha * std::sin(U) + c.sinAlpha * std::cos(U) * std::cos(V));
    const double D = asinSafe(std::cos(U) * std::sin(V) / std::cos(T));
    const double theta = c.n * D;
    const double r = c.r0 * c.tanP / std::pow(std::tan(T / 2 + M_PI / 4), c.n);
    // Westing and southing, negated when north oriented.
    const double sign = northOriented_ ? -1 : 1;
    p.x = sign * (r * std::sin(theta) + c.falseEasting) * c.unitsPerMeter;
    p.y = sign * (r * std::cos(theta) + c.falseNorthing) * c.unitsPerMeter;
}

void OmbKrovak::unproject(OmbPoint& p, const OmbProjCachedNumbers* cached) const {
    const KrovakCachedNumbers& c = numbers(cached);
    const double sign = northOriented_ ? -1 : 1;
    const double southing = sign * p.y * c.metersPerUnit - c.falseNorthing;
    const double westing = sign * p.x * c.metersPerUnit - c.falseEasting;
    const double r = std::hypot(southing, westing);
    const double theta = std::atan2(westing, southing);
    const double D = theta / c.n;
    const double T = 2 * (std::atan(std::pow(c.r0 / r, 1 / c.n) * c.tanHalfP) - M_PI / 4);
    const double U = asinSafe(c.cosAlpha * std::sin(T) - c.sinAlpha * std::cos(T) * std::cos(D));
    const double V = asinSafe(std::cos(T) * std::sin(D) / std::cos(U));
    const double k = std::pow(c.t0, -1 / c.B) * std::pow(std::tan(U / 2 + M_PI / 4), 1 / c.B);
    double lat = U;
    for (int i = 0;; ++i) {
        if (i == 30) projectionError(p, "Krovak.unproject failed");
        const double es = c.e * std::sin(lat);
        const double next = 2 * (std::atan(k * std::pow((1 + es) / (1 - es), c.e / 2)) - M_PI / 4);
        const bool settled = std::fabs(next - lat) <= 1e-12;
        lat = next;
        if (settled) break;
    }
    p.x = wrapLongitude(c.centralLongitude - V / c.B * degreesPerRadian);
    p.y = lat * degreesPerRadian;
}

void OmbKrovak::nominalMetersXY(const OmbProjCachedNumbers* cached, double& mx, double& my) const {
    mx = my = cached->metersPerUnit / scaleFactor();
}

bool OmbKrovak::equivalent(const OmbProjection& other) const {
    if (!sameParameters(other)) return false;
    const auto& k = static_cast<const OmbKrovak&>(other);
    return colatitudeConeAxis_ == k.colatitudeConeAxis_ && pseudoStandardParallel_ == k.pseudoStandardParallel_ &&
           northOriented_ == k.northOriented_;
}
