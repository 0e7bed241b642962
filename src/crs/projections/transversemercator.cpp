// Transverse Mercator on the ellipsoid.
//
// Near the central meridian the forward mapping is the classic series in
// powers of A = dLon cos(lat) up to the 8th power (Snyder, Map Projections
// - A Working Manual, USGS PP 1395, eqs. 8-9 and 8-10, with the meridian
// distance of eq. 3-21). Farther out it maps the conformal latitude by the
// Gauss-Schreiber projection and corrects with Krueger's series in the
// third flattening n to the 4th order (Poder and Engsager, "Some
// conformal mappings and transformations for geodesy and topographic
// cartography", KMS 1998; Karney, J. Geodesy 85 (2011), eqs. 35-36). The
// correction fades out between 65 and 75 degrees of conformal distance from
// the central meridian, which keeps the whole world finite. The inverse is
// always the series form, refined by fixed-point steps where the forward
// correction fades.
//
// Accuracy against the exact mapping: see the test suite, which compares
// with GeographicLib's TransverseMercatorProj on random points.
#include "projectionmath.h"

#include <oecore/core/exception.h>
#include <oecore/core/stringbuilder.h>
#include <oecore/crs/projections/transversemercator.h>

#include <cmath>

OMB_DEFINE_ENGINE_CLASS(OmbTransverseMercator, OmbProjection, "TransverseMercatorProjection", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbTransverseMercator)
OMB_DEFINE_ENGINE_CLASS(OmbUTM, OmbProjection, "UtmProjection", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbUTM)

#include "projectiondescriptions.h"

OMB_DESCRIBE_CLASS(OmbTransverseMercator) {
    Omb_describeCentre(d);
    Omb_describeFalseOrigin(d);
    Omb_describeScaleFactor(d);
}

OMB_DESCRIBE_CLASS(OmbUTM) {
    d.property<int>(
        "Zone", [](const OmbUTM& p) { return p.zone(); }, [](OmbUTM& p, int v) { p.zone(v); }, 1);
    d.property<OmbUTMHemisphere>(
        "Hemisphere", [](const OmbUTM& p) { return p.hemisphere(); },
        [](OmbUTM& p, OmbUTMHemisphere v) { p.hemisphere(v); }, OmbUTMHemisphere::North);
}

namespace {

using namespace OmbProjectionMath;

// Conformal distances (atanh of the sine) from the central meridian where
// the forward correction starts and ends fading, and beyond which the
// inverse takes the coordinates uncorrected.
constexpr double fadeStart = 1.5064542373319447;  // 65 degrees
constexpr double fadeEnd = 2.027589421800132;     // 75 degrees
constexpr double inverseUncorrected = 2.0973239967195934;
constexpr double uLimit = 0.9999999;
// The refinement stops when the forward series reproduces the point within
// 1e-12 of the radius (6 micrometres); it contracts about tenfold a step.
constexpr double refinedEnough = 1e-12;
constexpr int maxRefinements = 12;
// Below this conformal distance (11 degrees) the inverse and forward series
// undo each other within 1e-12 degrees; the classic series' zone lies
// within it.
constexpr double seriesAgree = 0.2;

class TMCachedNumbers : public OmbMeriDistProjCachedNumbers {
public:
    TMCachedNumbers(const OmbGeodeticDatum& datum, const OmbTransverseMercator& tm)
        : OmbMeriDistProjCachedNumbers(datum, tm.metersPerProjUnit(), tm.centralLatitude()) {
        k0 = tm.scaleFactor();
        centralLongitude = tm.centralLongitude();
        const double n2 = n * n, n3 = n2 * n, n4 = n3 * n;
        k0Qn = k0 * a / (1 + n) * (1 + n2 / 4 + n4 / 64);
        const double e4 = e2 * e2, e6 = e4 * e2, e8 = e4 * e4;
        toConformal[0] = e2;
        toConformal[1] = (5 - e2) * e4 / 6;
        toConformal[2] = (104 - 45 * e2) * e6 / 120;
        toConformal[3] = 1237.0 / 1260 * e8;
        toGeodetic[0] = e2 + e4 + e6 + e8;
        toGeodetic[1] = -(7 + 17 * e2 + 30 * e4) * e4 / 6;
        toGeodetic[2] = (224 + 889 * e2) * e6 / 120;
        toGeodetic[3] = -4279.0 / 1260 * e8;
        forward[0] = n * (0.5 - 2 * n / 3 + 5 * n2 / 16 + 41 * n3 / 180);
        forward[1] = n2 * (13.0 / 48 - 3 * n / 5 + 557 * n2 / 1440);
        forward[2] = n3 * (61.0 / 240 - 103 * n / 140);
        forward[3] = n4 * 49561 / 161280;
        inverse[0] = n * (0.5 - 2 * n / 3 + 37 * n2 / 96 - n3 / 360);
        inverse[1] = n2 * (1.0 / 48 + n / 15 - 437 * n2 / 1440);
        inverse[2] = n3 * (17.0 / 480 - 37 * n / 840);
        inverse[3] = n4 * 4397 / 161280;
        falseEastingMeters = tm.falseEasting() * metersPerUnit;
        // The extended series measures y from the equator, so the offset
        // takes M0 off once for both series.
        northingOffsetMeters = tm.falseNorthing() * metersPerUnit - k0 * m0;
    }

    double k0, k0Qn, centralLongitude;
    double toConformal[4], toGeodetic[4], forward[4], inverse[4];
    double falseEastingMeters, northingOffsetMeters;
};

// sum_j c[j] sin(2j(xi + i eta)) for j = 1..4 by Clenshaw's recurrence in
// complex arithmetic; the real part goes to dXi, the imaginary to dEta.
inline void krueger(const double c[4], double xi, double eta, double& dXi, double& dEta) {
    const double sin2 = std::sin(2 * xi), cos2 = std::cos(2 * xi);
    const double exp2 = std::exp(2 * eta), inv = 1 / exp2;
    const double sinh2 = (exp2 - inv) / 2, cosh2 = (exp2 + inv) / 2;
    const double ar = 2 * cos2 * cosh2, ai = -2 * sin2 * sinh2;
    double yr0 = c[3], yi0 = 0, yr1 = 0, yi1 = 0;
    for (int k = 2; k >= 0; --k) {
        const double yr2 = yr1, yi2 = yi1;
        yr1 = yr0, yi1 = yi0;
        yr0 = ar * yr1 - ai * yi1 - yr2 + c[k];
        yi0 = ar * yi1 + ai * yr1 - yi2;
    }
    const double sr = sin2 * cosh2, si = cos2 * sinh2;
    dXi = yr0 * sr - yi0 * si;
    dEta = yr0 * si + yi0 * sr;
}

inline double fadeWeight(double eta) {
    return std::clamp((fadeEnd - std::fabs(eta)) / (fadeEnd - fadeStart), 0.0, 1.0);
}

// Forward, in metres.
inline void classicSeries(const TMCachedNumbers& c, double dLon, double lat, double& x, double& y) {
    const double phi = lat * radiansPerDegree;
    const double s = std::sin(phi), co = std::cos(phi);
    const double l = dLon * radiansPerDegree;
    const double A = l * co, A2 = A * A;
    const double T = std::fabs(co) <= 1e-10 ? 0 : (s * s) / (co * co);
    const double C = c.ep2 * co * co;
    const double N = c.primeVerticalRadius(s);
    const double T2 = T * T, T3 = T2 * T;
    x = c.falseEastingMeters +
        c.k0 * N * A *
            (1 + A2 / 6 *
                     ((1 - T + C) +
                      A2 / 20 * ((5 - 18 * T + T2 + 14 * C - 58 * T * C) + A2 / 42 * (61 - 479 * T + 179 * T2 - T3))));
    // N tan(lat) A^2 / 2, written without the tangent so the poles stay finite.
    const double tanTerm = N * s * co * l * l / 2;
    y = c.northingOffsetMeters +
        c.k0 * (c.meridianDistance(phi, s, co) +
                tanTerm * (1 + A2 / 12 *
                                   ((5 - T + 9 * C + 4 * C * C) + A2 / 30 *
                                                                      ((61 - 58 * T + T2 + 270 * C - 330 * T * C) +
                                                                       A2 / 56 * (1385 - 3111 * T + 543 * T2 - T3)))));
}

inline void extendedSeries(const TMCachedNumbers& c, double dLon, double lat, double& x, double& y) {
    const double phi = lat * radiansPerDegree;
    const double s = std::sin(phi), co = std::cos(phi), s2 = s * s;
    const double* k = c.toConformal;
    const double delta = (k[0] + s2 * (k[1] + s2 * (k[2] + s2 * k[3]))) * s * co;
    const double sinDelta = delta - delta * delta * delta / 6, cosDelta = 1 - delta * delta / 2;
    // The conformal latitude chi = lat - delta.
    double sinChi = cosDelta * s - sinDelta * co, cosChi = sinDelta * s + cosDelta * co;
    const double r = std::hypot(sinChi, cosChi);
    sinChi /= r, cosChi /= r;
    const double l = dLon * radiansPerDegree;
    const double xi = std::atan2(sinChi, cosChi * std::cos(l));
    double u = std::sin(l) * cosChi;
    if (std::fabs(u) > uLimit) u = std::copysign(uLimit + 0.8 * (std::fabs(u) - uLimit), u);
    const double eta = std::atanh(u);
    double dXi = 0, dEta = 0;
    const double w = fadeWeight(eta);
    if (w > 0) krueger(c.forward, xi, eta, dXi, dEta);
    x = c.falseEastingMeters + c.k0Qn * (eta + w * dEta);
    y = c.northingOffsetMeters + c.k0Qn * (xi + w * dXi);
}

inline bool inClassicZone(double dLon, double lat) {
    return std::fabs(dLon) <= 6.18 + 1.69e-5 * std::fabs(lat * lat * lat);
}

// The classic series parts from the exact mapping by up to a millimetre at
// the edge of its zone, so the series inverse does not quite undo it: one
// Newton step on the classic series does.
inline void undoClassicSeries(const TMCachedNumbers& c, double x, double y, double& dLon, double& lat) {
    if (std::fabs(lat) > 89.9) return;
    newtonStep(
        [&c](double lon, double la, double& px, double& py) {
            classicSeries(c, lon, la, px, py);
            return true;
        },
        x, y, dLon, lat);
}

inline void forward(const TMCachedNumbers& c, OmbPoint& p) {
    const double dLon = wrapLongitude(p.x - c.centralLongitude);
    const double lat = p.y;
    double x, y;
    if (inClassicZone(dLon, lat))
        classicSeries(c, dLon, lat, x, y);
    else
        extendedSeries(c, dLon, lat, x, y);
    p.x = x * c.unitsPerMeter;
    p.y = y * c.unitsPerMeter;
}

// From the Gauss-Schreiber coordinates xi', eta' to the geodetic ones.
inline void inverse(const TMCachedNumbers& c, OmbPoint& p) {
    const double xMeters = p.x * c.metersPerUnit, yMeters = p.y * c.metersPerUnit;
    const double xi = (yMeters - c.northingOffsetMeters) / c.k0Qn;
    const double eta = (xMeters - c.falseEastingMeters) / c.k0Qn;
    double xiG = xi, etaG = eta;
    const double absEta = std::fabs(eta);
    if (absEta <= inverseUncorrected) {
        double dXi, dEta;
        krueger(c.inverse, xi, eta, dXi, dEta);
        xiG = xi - dXi, etaG = eta - dEta;
        // The 4th-order inverse series is not the forward series' exact
        // inverse (they part by millimetres at 55 degrees), nor the faded
        // forward's: fixed-point steps on the weighted forward series. Near
        // the central meridian they agree within a micrometre.
        for (int step = 0; absEta >= seriesAgree && step < maxRefinements; ++step) {
            const double w = fadeWeight(etaG);
            dXi = dEta = 0;
            if (w > 0) krueger(c.forward, xiG, etaG, dXi, dEta);
            const double rXi = xi - (xiG + w * dXi), rEta = eta - (etaG + w * dEta);
            xiG += rXi, etaG += rEta;
            if (std::fabs(rXi) <= refinedEnough && std::fabs(rEta) <= refinedEnough) break;
        }
    }
    double u = std::tanh(etaG);
    if (std::fabs(u) > uLimit)
        u = std::copysign(std::min(uLimit + 1.25 * (std::fabs(u) - uLimit), 0.9999999999999999), u);
    const double secEta = std::sqrt(1 - u * u);  // 1 / cosh(eta)
    const double sinXi = std::sin(xiG), cosXi = std::cos(xiG);
    const double chi = std::atan2(sinXi * secEta, std::hypot(u, cosXi * secEta));
    const double dLon = std::atan2(u, cosXi * secEta);
    const double s = std::sin(chi), co = std::cos(chi), s2 = s * s;
    const double* k = c.toGeodetic;
    double lat = (chi + (k[0] + s2 * (k[1] + s2 * (k[2] + s2 * k[3]))) * s * co) * degreesPerRadian;
    double dLonDegrees = dLon * degreesPerRadian;
    if (inClassicZone(dLonDegrees, lat)) undoClassicSeries(c, xMeters, yMeters, dLonDegrees, lat);
    p.x = wrapLongitude(dLonDegrees + c.centralLongitude);
    p.y = lat;
}

const TMCachedNumbers& numbers(const OmbProjCachedNumbers* cached) {
    return *static_cast<const TMCachedNumbers*>(cached);
}

}  // namespace

OmbTransverseMercator::OmbTransverseMercator(double centralLongitude, double centralLatitude, double falseEasting,
                                             double falseNorthing, double scaleFactor,
                                             const OmbRef<OmbLengthUnit>& lengthUnit) {
    this->centralLongitude(centralLongitude);
    this->centralLatitude(centralLatitude);
    this->falseEasting(falseEasting);
    this->falseNorthing(falseNorthing);
    this->scaleFactor(scaleFactor);
    this->lengthUnit(lengthUnit);
}

OmbProjCachedNumbers* OmbTransverseMercator::init(const OmbGeodeticDatum& datum) const {
    return new TMCachedNumbers(datum, *this);
}

void OmbTransverseMercator::project(OmbPointArray& points, const OmbProjCachedNumbers* cached) const {
    const TMCachedNumbers& c = numbers(cached);
    for (OmbPoint& p : points) forward(c, p);
}

void OmbTransverseMercator::project(OmbPoint& p, const OmbProjCachedNumbers* cached) const {
    forward(numbers(cached), p);
}

void OmbTransverseMercator::unproject(OmbPointArray& points, const OmbProjCachedNumbers* cached) const {
    const TMCachedNumbers& c = numbers(cached);
    for (OmbPoint& p : points) inverse(c, p);
}

void OmbTransverseMercator::unproject(OmbPoint& p, const OmbProjCachedNumbers* cached) const {
    inverse(numbers(cached), p);
}

void OmbTransverseMercator::nominalMetersXY(const OmbProjCachedNumbers* cached, double& mx, double& my) const {
    mx = my = cached->metersPerUnit / scaleFactor();
}

// --- UTM --------------------------------------------------------------------------

OmbUTM::OmbUTM(int zone, OmbUTMHemisphere hemisphere) { set(zone, hemisphere); }

OmbUTM::OmbUTM(const OmbUTM& other)
    : OmbProjection(other), zone_(other.zone_), hemisphere_(other.hemisphere_), tm_(other.tm_->clone()) {}

OmbString OmbUTM::zoneName(int zone, OmbUTMHemisphere hemisphere) {
    OmbStringBuilder text;
    text << "Utm" << zone << (hemisphere == OmbUTMHemisphere::South ? "S" : "N");
    return text.str();
}

void OmbUTM::set(int zone, OmbUTMHemisphere hemisphere) {
    if (zone < 1 || zone > 60) OMB_THROW(RangeError, "zone", "utm( zone, hemisphere)", "1, 2, 3, ..., or 60");
    // A name given in a configuration stays; the zone's own name follows it.
    if (name().empty() || name() == zoneName(zone_, hemisphere_)) name(zoneName(zone, hemisphere));
    zone_ = zone;
    hemisphere_ = hemisphere;
    centralLongitude(6.0 * zone - 183);
    falseEasting(500000);
    falseNorthing(hemisphere == OmbUTMHemisphere::South ? 10000000 : 0);
    scaleFactor(0.9996);
    tm_ = OmbRef<OmbTransverseMercator>(
        new OmbTransverseMercator(centralLongitude(), 0, falseEasting(), falseNorthing(), scaleFactor()));
}

bool OmbUTM::equivalent(const OmbProjection& other) const {
    const auto* utm = dynamic_cast<const OmbUTM*>(&other);
    return utm && utm->zone_ == zone_ && utm->hemisphere_ == hemisphere_;
}
