// Equidistant cylindrical. On the ellipsoid EPSG method 1028 (EPSG Guidance
// Note 7-2): x from the parallel radius nu1 cos(lat1) of the standard
// parallel, y the meridian distance from the central latitude (Snyder,
// Map Projections - A Working Manual, eq. 3-21, within 0.1 mm), the
// inverse by Newton's method on it. On the sphere EPSG 1029 (Snyder eqs.
// 12-1, 12-2). The angular form gives the same in an angle unit. Exact
// within rounding otherwise.
#include "projectiondescriptions.h"
#include "projectionmath.h"

#include <oecore/crs/projections/equidistantcylindrical.h>

#include <cmath>

using namespace OmbProjectionMath;

OMB_DEFINE_ENGINE_CLASS(OmbEquidistantCylindrical, OmbProjection, "EquidistantCylindricalProjection", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbEquidistantCylindrical)
OMB_DEFINE_ENGINE_CLASS(OmbEquidistantCylindricalAngularProjection, OmbProjection,
                        "EquidistantCylindricalAngularProjection", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbEquidistantCylindricalAngularProjection)

OMB_DESCRIBE_CLASS(OmbEquidistantCylindrical) {
    using E = OmbEquidistantCylindrical;
    Omb_describeCentre(d);
    Omb_describeFalseOrigin(d);
    d.property<double>(
        "StandardParallel", [](const E& p) { return p.standardParallel(); },
        [](E& p, double v) { p.standardParallel(v); });
    Omb_describeEarthShape(d, OmbEarthShape::Ellipsoid);
}

OMB_DESCRIBE_CLASS(OmbEquidistantCylindricalAngularProjection) {
    using E = OmbEquidistantCylindricalAngularProjection;
    d.object<OmbAngleUnit>(
        "AngleUnit", [](const E& p) { return p.configuredAngleUnit(); },
        [](E& p, const OmbRef<OmbAngleUnit>& v) { p.angleUnit(v); });
    Omb_describeCentre(d);
    d.property<double>(
        "StandardParallel", [](const E& p) { return p.standardParallel(); },
        [](E& p, double v) { p.standardParallel(v); });
    d.property<double>(
        "FalseEasting", [](const E& p) { return p.falseEasting(); }, [](E& p, double v) { p.falseEasting(v); });
    d.property<double>(
        "FalseNorthing", [](const E& p) { return p.falseNorthing(); }, [](E& p, double v) { p.falseNorthing(v); });
}

namespace {

class EqcCachedNumbers : public OmbMeriDistProjCachedNumbers {
public:
    EqcCachedNumbers(const OmbGeodeticDatum& datum, const OmbEquidistantCylindrical& p)
        : OmbMeriDistProjCachedNumbers(datum, p.metersPerProjUnit(), p.centralLatitude()) {
        sphere = p.shape() == OmbEarthShape::Sphere;
        const double lat1 = p.standardParallel() * radiansPerDegree;
        radius = sphere ? p.sphereRadiusFor(*this, p.standardParallel()) : a;
        const double parallelRadius =
            sphere ? radius * std::cos(lat1) : primeVerticalRadius(std::sin(lat1)) * std::cos(lat1);
        kx = parallelRadius * radiansPerDegree * unitsPerMeter;
        centralLongitude = p.centralLongitude();
        centralLatitude = p.centralLatitude();
        falseEasting = p.falseEasting(), falseNorthing = p.falseNorthing();
    }

    bool sphere;
    double radius, kx;
    double centralLongitude, centralLatitude, falseEasting, falseNorthing;
};

const EqcCachedNumbers& numbers(const OmbProjCachedNumbers* cached) {
    return *static_cast<const EqcCachedNumbers*>(cached);
}

}  // namespace

OmbProjCachedNumbers* OmbEquidistantCylindrical::init(const OmbGeodeticDatum& datum) const {
    return new EqcCachedNumbers(datum, *this);
}

void OmbEquidistantCylindrical::project(OmbPoint& p, const OmbProjCachedNumbers* cached) const {
    const EqcCachedNumbers& c = numbers(cached);
    const double northing = c.sphere ? c.radius * (p.y - c.centralLatitude) * radiansPerDegree
                                     : c.meridianDistance(p.y * radiansPerDegree) - c.m0;
    p.x = c.falseEasting + wrapLongitude(p.x - c.centralLongitude) * c.kx;
    p.y = c.falseNorthing + northing * c.unitsPerMeter;
}

void OmbEquidistantCylindrical::unproject(OmbPoint& p, const OmbProjCachedNumbers* cached) const {
    const EqcCachedNumbers& c = numbers(cached);
    const double northing = (p.y - c.falseNorthing) * c.metersPerUnit;
    p.y = c.sphere ? c.centralLatitude + northing / c.radius * degreesPerRadian
                   : c.latitudeFromMeridianDistance(northing + c.m0) * degreesPerRadian;
    p.x = wrapLongitude((p.x - c.falseEasting) / c.kx + c.centralLongitude);
}

void OmbEquidistantCylindrical::nominalMetersXY(const OmbProjCachedNumbers* cached, double& mx, double& my) const {
    mx = my = cached->metersPerUnit;
}

bool OmbEquidistantCylindrical::equivalent(const OmbProjection& other) const {
    if (!sameParameters(other)) return false;
    const auto& e = static_cast<const OmbEquidistantCylindrical&>(other);
    return standardParallel_ == e.standardParallel_ && sameEarthShape(e);
}

bool OmbEquidistantCylindrical::compatibleWith(const OmbEquidistantCylindrical& other, double worldWidth) const {
    return shiftedByWholeWorlds(other, worldWidth) && standardParallel_ == other.standardParallel_ &&
           centralLatitude() == other.centralLatitude() && falseNorthing() == other.falseNorthing() &&
           sameEarthShape(other) && lengthUnit()->equivalent(*other.lengthUnit());
}

// --- angular ----------------------------------------------------------------------

const OmbRef<OmbAngleUnit>& OmbEquidistantCylindricalAngularProjection::angleUnit() const {
    return angleUnit_ ? angleUnit_ : OmbAngleUnit::degree();
}

void OmbEquidistantCylindricalAngularProjection::project(OmbPoint& p, const OmbProjCachedNumbers*) const {
    const double unitsPerDegree = radiansPerDegree / angleUnit()->inRadians();
    p.x = falseEasting() +
          wrapLongitude(p.x - centralLongitude()) * std::cos(standardParallel() * radiansPerDegree) * unitsPerDegree;
    p.y = falseNorthing() + (p.y - centralLatitude()) * unitsPerDegree;
}

void OmbEquidistantCylindricalAngularProjection::unproject(OmbPoint& p, const OmbProjCachedNumbers*) const {
    const double degreesPerUnit = angleUnit()->inRadians() * degreesPerRadian;
    p.x = wrapLongitude(centralLongitude() +
                        (p.x - falseEasting()) * degreesPerUnit / std::cos(standardParallel() * radiansPerDegree));
    p.y = centralLatitude() + (p.y - falseNorthing()) * degreesPerUnit;
}

void OmbEquidistantCylindricalAngularProjection::nominalMetersXY(const OmbProjCachedNumbers* cached, double& mx,
                                                                 double& my) const {
    mx = my = cached->a * angleUnit()->inRadians();
}

bool OmbEquidistantCylindricalAngularProjection::equivalent(const OmbProjection& other) const {
    if (!sameParameters(other)) return false;
    const auto& e = static_cast<const OmbEquidistantCylindricalAngularProjection&>(other);
    return standardParallel_ == e.standardParallel_ && angleUnit()->equivalent(*e.angleUnit());
}

bool OmbEquidistantCylindricalAngularProjection::compatibleWith(const OmbEquidistantCylindricalAngularProjection& other,
                                                                double worldWidth) const {
    return shiftedByWholeWorlds(other, worldWidth) && standardParallel_ == other.standardParallel_ &&
           centralLatitude() == other.centralLatitude() && falseNorthing() == other.falseNorthing() &&
           angleUnit()->equivalent(*other.angleUnit());
}
