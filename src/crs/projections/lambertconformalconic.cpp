// Lambert conformal conic, two standard parallels, on the ellipsoid.
//
// Snyder, Map Projections - A Working Manual, USGS PP 1395, eqs. 15-1 to
// 15-11 (forward), 14-4, 15-5, 15-7 to 15-9 and 7-9 (inverse; the latitude
// by fixed-point iteration to 1e-12 rad). EPSG method 9802. Exact within
// rounding; valid everywhere but at the pole away from the cone's apex.
#include "projectiondescriptions.h"
#include "projectionmath.h"

#include <oecore/core/exception.h>
#include <oecore/crs/projections/lambertconformalconic.h>

#include <cmath>

OMB_DEFINE_ENGINE_CLASS(OmbLambertConformalConic2SP, OmbProjection, "LambertConformalConicProjection", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbLambertConformalConic2SP)

OMB_DESCRIBE_CLASS(OmbLambertConformalConic2SP) {
    using L = OmbLambertConformalConic2SP;
    Omb_describeCentre(d);
    Omb_describeFalseOrigin(d);
    Omb_describeScaleFactor(d);
    d.property<double>(
         "StandardParallel1", [](const L& p) { return p.standardParallel1(); },
         [](L& p, double v) { p.standardParallel1(v); })
        .required();
    d.property<double>(
         "StandardParallel2", [](const L& p) { return p.standardParallel2(); },
         [](L& p, double v) { p.standardParallel2(v); })
        .required();
}

namespace {

using namespace OmbProjectionMath;

class LccCachedNumbers : public OmbProjCachedNumbers {
public:
    LccCachedNumbers(const OmbGeodeticDatum& datum, const OmbLambertConformalConic2SP& p)
        : OmbProjCachedNumbers(datum, p.metersPerProjUnit()) {
        const double phi1 = p.standardParallel1() * radiansPerDegree, phi2 = p.standardParallel2() * radiansPerDegree;
        const double m1 = m(phi1), m2 = m(phi2), t1 = t(phi1), t2 = t(phi2);
        cone = phi1 == phi2 ? std::sin(phi1) : (std::log(m1) - std::log(m2)) / (std::log(t1) - std::log(t2));
        aF = a * p.scaleFactor() * m1 / (cone * std::pow(t1, cone)) * unitsPerMeter;
        rho0 = rho(p.centralLatitude() * radiansPerDegree);
        centralLongitude = p.centralLongitude();
        falseEasting = p.falseEasting();
        falseNorthing = p.falseNorthing();
    }

    double m(double phi) const {
        const double s = std::sin(phi);
        return std::cos(phi) / std::sqrt(1 - e2 * s * s);
    }
    double t(double phi) const { return isometricExp(phi, e); }
    // In projected units; 0 at the apex, infinite at the far pole.
    double rho(double phi) const {
        if (std::fabs(phi) >= M_PI / 2 && phi * cone > 0) return 0;
        return aF * std::pow(t(phi), cone);
    }

    double cone, aF, rho0;
    double centralLongitude, falseEasting, falseNorthing;
};

const LccCachedNumbers& numbers(const OmbProjCachedNumbers* cached) {
    return *static_cast<const LccCachedNumbers*>(cached);
}

inline void forward(const LccCachedNumbers& c, OmbPoint& p) {
    const double theta = c.cone * wrapLongitude(p.x - c.centralLongitude) * radiansPerDegree;
    const double r = c.rho(p.y * radiansPerDegree);
    p.x = c.falseEasting + r * std::sin(theta);
    p.y = c.falseNorthing + c.rho0 - r * std::cos(theta);
}

}  // namespace

OmbLambertConformalConic2SP::OmbLambertConformalConic2SP(double centralLongitude, double centralLatitude,
                                                         double standardParallel1, double standardParallel2,
                                                         double falseEasting, double falseNorthing, double scaleFactor)
    : standardParallel1_(standardParallel1), standardParallel2_(standardParallel2) {
    this->centralLongitude(centralLongitude);
    this->centralLatitude(centralLatitude);
    this->falseEasting(falseEasting);
    this->falseNorthing(falseNorthing);
    this->scaleFactor(scaleFactor);
    checkParallels();
}

void OmbLambertConformalConic2SP::checkParallels() const {
    const auto inRange = [](double latitude) { return std::fabs(latitude) >= 0.001 && std::fabs(latitude) <= 89.999; };
    const OmbString where = name().empty() ? OmbString::literal("LambertConformalConicProjection") : name();
    if (standardParallel1_ == standardParallel2_) {
        if (!inRange(standardParallel1_))
            OMB_THROW(RangeError, "the single standard parallel", where,
                      "between -89.999 and -0.001 or between +0.001 and +89.999; did you want a PolarStereographic "
                      "or a Stereographic projection?");
        return;
    }
    const char* mercatorRange =
        "between -89.999 and -0.001 or between +0.001 and +89.999; did you want a Mercator projection?";
    if (!inRange((standardParallel1_ + standardParallel2_) / 2))
        OMB_THROW(RangeError, "average of standardParallel1 and standardParallel2", where, mercatorRange);
    if (!inRange(standardParallel1_)) OMB_THROW(RangeError, "standardParallel1", where, mercatorRange);
    if (!inRange(standardParallel2_)) OMB_THROW(RangeError, "standardParallel2", where, mercatorRange);
}

OmbProjCachedNumbers* OmbLambertConformalConic2SP::init(const OmbGeodeticDatum& datum) const {
    checkParallels();
    return new LccCachedNumbers(datum, *this);
}

void OmbLambertConformalConic2SP::project(OmbPointArray& points, const OmbProjCachedNumbers* cached) const {
    const LccCachedNumbers& c = numbers(cached);
    for (OmbPoint& p : points) forward(c, p);
}

void OmbLambertConformalConic2SP::project(OmbPoint& p, const OmbProjCachedNumbers* cached) const {
    forward(numbers(cached), p);
}

void OmbLambertConformalConic2SP::unproject(OmbPointArray& points, const OmbProjCachedNumbers* cached) const {
    for (OmbPoint& p : points) unproject(p, cached);
}

void OmbLambertConformalConic2SP::unproject(OmbPoint& p, const OmbProjCachedNumbers* cached) const {
    const LccCachedNumbers& c = numbers(cached);
    const double x = p.x - c.falseEasting, y = c.rho0 - (p.y - c.falseNorthing);
    const double sign = c.cone < 0 ? -1 : 1;
    const double r = sign * std::hypot(x, y);
    const double theta = std::atan2(sign * x, sign * y);
    const double lon = wrapLongitude(theta / c.cone * degreesPerRadian + c.centralLongitude);
    if (r == 0) {
        p.x = lon, p.y = sign * 90;
        return;
    }
    double phi;
    if (!latitudeFromIsometricExp(std::pow(r / c.aF, 1 / c.cone), c.e, phi))
        projectionError(p, "Lambert rcalc_phi calculation did not converge.");
    p.x = lon;
    p.y = phi * degreesPerRadian;
}

void OmbLambertConformalConic2SP::nominalMetersXY(const OmbProjCachedNumbers* cached, double& mx, double& my) const {
    mx = my = cached->metersPerUnit / scaleFactor();
}

OmbRect OmbLambertConformalConic2SP::getValidArea(const OmbProjCachedNumbers* cached) const {
    return numbers(cached).cone > 0 ? OmbRect(-180, -89.999, 180, 90) : OmbRect(-180, -90, 180, 89.999);
}

bool OmbLambertConformalConic2SP::isValid(const OmbPoint& lola, const OmbProjCachedNumbers* cached) const {
    if (!OmbProjection::isValid(lola, cached)) return false;
    const double farPole = numbers(cached).cone > 0 ? -90 : 90;
    return std::fabs(lola.y - farPole) > 1e-9;
}

bool OmbLambertConformalConic2SP::equivalent(const OmbProjection& other) const {
    if (!sameParameters(other)) return false;
    const auto& l = static_cast<const OmbLambertConformalConic2SP&>(other);
    return standardParallel1_ == l.standardParallel1_ && standardParallel2_ == l.standardParallel2_;
}
