// Orthographic on the ellipsoid, EPSG method 9840 (EPSG Guidance Note 7-2):
// E and N are the point's coordinates along the east and north axes of the
// plane touching the ellipsoid at the centre. The inverse intersects the
// ellipsoid with the line through the plane point along the centre's
// normal, taking the nearer intersection: exact, no iteration.
#include "projectiondescriptions.h"
#include "projectionmath.h"

#include <oecore/core/exception.h>
#include <oecore/crs/projections/orthographic.h>

#include <cmath>

using namespace OmbProjectionMath;

OMB_DEFINE_ENGINE_CLASS(OmbOrthographic, OmbProjection, "OrthographicProjection", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbOrthographic)

OMB_DESCRIBE_CLASS(OmbOrthographic) {
    using O = OmbOrthographic;
    d.property<double>(
        "CentralLatitude", [](const O& p) { return p.centralLatitude(); },
        [](O& p, double v) { p.checkedCentralLatitude(v); });
    d.property<double>(
        "CentralLongitude", [](const O& p) { return p.centralLongitude(); },
        [](O& p, double v) { p.checkedCentralLongitude(v); });
    Omb_describeFalseOrigin(d);
}

namespace {

class OrthographicCachedNumbers : public OmbProjCachedNumbers {
public:
    OrthographicCachedNumbers(const OmbGeodeticDatum& datum, const OmbOrthographic& p)
        : OmbProjCachedNumbers(datum, p.metersPerProjUnit()) {
        const double lat0 = p.centralLatitude() * radiansPerDegree, lon0 = p.centralLongitude() * radiansPerDegree;
        sinLat0 = std::sin(lat0), cosLat0 = std::cos(lat0);
        sinLon0 = std::sin(lon0), cosLon0 = std::cos(lon0);
        nu0 = primeVerticalRadius(sinLat0);
        centralLongitude = p.centralLongitude();
        falseEasting = p.falseEasting() * metersPerUnit, falseNorthing = p.falseNorthing() * metersPerUnit;
    }

    double sinLat0, cosLat0, sinLon0, cosLon0, nu0;
    double centralLongitude, falseEasting, falseNorthing;
};

const OrthographicCachedNumbers& numbers(const OmbProjCachedNumbers* cached) {
    return *static_cast<const OrthographicCachedNumbers*>(cached);
}

// The cosine of the angle between the centre's normal and the point's, which
// is positive on the visible side.
double facing(const OrthographicCachedNumbers& c, double lat, double dLon) {
    return c.sinLat0 * std::sin(lat) + c.cosLat0 * std::cos(lat) * std::cos(dLon);
}

}  // namespace

OmbOrthographic::OmbOrthographic(double centralLongitude, double centralLatitude, double falseEasting,
                                 double falseNorthing) {
    checkedCentralLongitude(centralLongitude);
    checkedCentralLatitude(centralLatitude);
    this->falseEasting(falseEasting);
    this->falseNorthing(falseNorthing);
}

void OmbOrthographic::checkedCentralLongitude(double degrees) {
    if (!(degrees >= -180 && degrees <= 180))
        OMB_THROW(RangeError, "centralLongitude", "OrthographicProjection", "in [-180,180]");
    centralLongitude(degrees);
}

void OmbOrthographic::checkedCentralLatitude(double degrees) {
    if (!(degrees >= -90 && degrees <= 90))
        OMB_THROW(RangeError, "centralLatitude", "OrthographicProjection", "in [-90,90]");
    centralLatitude(degrees);
}

OmbProjCachedNumbers* OmbOrthographic::init(const OmbGeodeticDatum& datum) const {
    return new OrthographicCachedNumbers(datum, *this);
}

void OmbOrthographic::project(OmbPoint& p, const OmbProjCachedNumbers* cached) const {
    const OrthographicCachedNumbers& c = numbers(cached);
    const double lat = p.y * radiansPerDegree, dLon = (p.x - c.centralLongitude) * radiansPerDegree;
    if (facing(c, lat, dLon) < -1e-12) projectionError(p, "the point lies on the far side of the earth");
    const double s = std::sin(lat), co = std::cos(lat);
    const double nu = c.primeVerticalRadius(s);
    const double e = nu * co * std::sin(dLon);
    const double n =
        nu * (s * c.cosLat0 - co * c.sinLat0 * std::cos(dLon)) + c.e2 * (c.nu0 * c.sinLat0 - nu * s) * c.cosLat0;
    p.x = (c.falseEasting + e) * c.unitsPerMeter;
    p.y = (c.falseNorthing + n) * c.unitsPerMeter;
}

void OmbOrthographic::unproject(OmbPoint& p, const OmbProjCachedNumbers* cached) const {
    const OrthographicCachedNumbers& c = numbers(cached);
    const double east = p.x * c.metersPerUnit - c.falseEasting, north = p.y * c.metersPerUnit - c.falseNorthing;
    // The centre's east, north and up axes, and the centre itself.
    const double ex = -c.sinLon0, ey = c.cosLon0;
    const double nx = -c.sinLat0 * c.cosLon0, ny = -c.sinLat0 * c.sinLon0, nz = c.cosLat0;
    const double ux = c.cosLat0 * c.cosLon0, uy = c.cosLat0 * c.sinLon0, uz = c.sinLat0;
    const double px = c.nu0 * c.cosLat0 * c.cosLon0, py = c.nu0 * c.cosLat0 * c.sinLon0,
                 pz = c.nu0 * (1 - c.e2) * c.sinLat0;
    const double qx = px + east * ex + north * nx, qy = py + east * ey + north * ny, qz = pz + north * nz;
    // (x^2 + y^2) / a^2 + z^2 / b^2 = 1 along q + t u.
    const double a2 = c.a * c.a, b2 = c.b * c.b;
    const double A = (ux * ux + uy * uy) / a2 + uz * uz / b2;
    const double B = 2 * ((qx * ux + qy * uy) / a2 + qz * uz / b2);
    const double C = (qx * qx + qy * qy) / a2 + qz * qz / b2 - 1;
    const double discriminant = B * B - 4 * A * C;
    if (discriminant < 0) projectionError(p, "the point lies outside the projected earth");
    const double t = (-B + std::sqrt(discriminant)) / (2 * A);
    const double x = qx + t * ux, y = qy + t * uy, z = qz + t * uz;
    p.x = wrapLongitude(std::atan2(y, x) * degreesPerRadian);
    p.y = std::atan2(z, (1 - c.e2) * std::hypot(x, y)) * degreesPerRadian;
}

void OmbOrthographic::nominalMetersXY(const OmbProjCachedNumbers* cached, double& mx, double& my) const {
    mx = my = cached->metersPerUnit;
}

bool OmbOrthographic::isValid(const OmbPoint& lola, const OmbProjCachedNumbers* cached) const {
    const OrthographicCachedNumbers& c = numbers(cached);
    return OmbProjection::isValid(lola, cached) &&
           facing(c, lola.y * radiansPerDegree, (lola.x - c.centralLongitude) * radiansPerDegree) >= -1e-12;
}
