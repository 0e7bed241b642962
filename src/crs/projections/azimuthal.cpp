// The azimuthal base, and the azimuthal equidistant projection.
//
// Azimuthal equidistant on the ellipsoid: x = s sin(az), y = s cos(az) from
// the geodesic distance s and azimuth az at the centre (Vincenty's inverse,
// with the root-finding solution for nearly antipodal points); the inverse
// by the direct problem. Vincenty's series (to the third order in f) hold
// x and y within 0.7 mm of an exact geodesic solution up to 19 300 km from
// the centre, 1.3 mm at 19 750 km, where a tiny azimuth error counts. On the
// sphere: Snyder, Map Projections - A Working Manual, USGS PP 1395, eqs.
// 25-2 to 25-5 and 20-14 to 20-16.
#include "projectiondescriptions.h"
#include "projectionmath.h"

#include <oecore/core/exception.h>
#include <oecore/crs/geodesic.h>
#include <oecore/crs/projections/azimuthal.h>

#include <cmath>

using namespace OmbProjectionMath;

OMB_DEFINE_ENGINE_CLASS(OmbAzimuthalGlobal, OmbProjection, "AzimuthalProjection", 0)
OMB_DEFINE_ENGINE_CLASS(OmbAzimuthalEquidistant, OmbAzimuthalGlobal, "AzimuthalEquidistantProjection", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbAzimuthalEquidistant)

OMB_DESCRIBE_CLASS(OmbAzimuthalGlobal) {
    using A = OmbAzimuthalGlobal;
    d.property<double>(
        "CentralLatitude", [](const A& p) { return p.centralLatitude(); },
        [](A& p, double v) { p.set(p.centralLongitude(), v); });
    d.property<double>(
        "CentralLongitude", [](const A& p) { return p.centralLongitude(); },
        [](A& p, double v) { p.set(v, p.centralLatitude()); });
    Omb_describeFalseOrigin(d);
    d.property<OmbProjectionPurpose>(
        "Purpose", [](const A& p) { return p.purpose(); }, [](A& p, OmbProjectionPurpose v) { p.purpose(v); },
        OmbProjectionPurpose::Presentation);
}

OMB_DESCRIBE_CLASS(OmbAzimuthalEquidistant) { Omb_describeEarthShape(d, OmbEarthShape::Ellipsoid); }

void OmbAzimuthalGlobal::set(double centralLongitude, double centralLatitude) {
    if (!(centralLongitude >= -180 && centralLongitude <= 180 && centralLatitude >= -90 && centralLatitude <= 90))
        OMB_THROW(BadProjectionParameters);
    this->centralLongitude(centralLongitude);
    this->centralLatitude(centralLatitude);
}

void OmbAzimuthalGlobal::nominalMetersXY(const OmbProjCachedNumbers* cached, double& mx, double& my) const {
    mx = my = cached->metersPerUnit / scaleFactor();
}

bool OmbAzimuthalGlobal::sameAzimuthalParameters(const OmbProjection& other) const {
    return sameParameters(other) && purpose_ == static_cast<const OmbAzimuthalGlobal&>(other).purpose_;
}

// --- azimuthal equidistant --------------------------------------------------------

namespace {

class AeqdCachedNumbers : public OmbProjCachedNumbers {
public:
    AeqdCachedNumbers(const OmbGeodeticDatum& datum, const OmbAzimuthalEquidistant& p)
        : OmbProjCachedNumbers(datum, p.metersPerProjUnit()), ellipsoid(datum.ellipsoid()) {
        centre = OmbPoint(p.centralLongitude(), p.centralLatitude());
        sphere = p.shape() == OmbEarthShape::Sphere;
        radius = sphere ? p.sphereRadiusFor(*this, p.centralLatitude()) : a;
        const double lat0 = centre.y * radiansPerDegree;
        sinLat0 = std::sin(lat0), cosLat0 = std::cos(lat0);
        falseEasting = p.falseEasting(), falseNorthing = p.falseNorthing();
    }

    OmbRef<OmbEllipsoid> ellipsoid;
    OmbPoint centre;
    bool sphere;
    double radius, sinLat0, cosLat0, falseEasting, falseNorthing;
};

const AeqdCachedNumbers& aeqd(const OmbProjCachedNumbers* cached) {
    return *static_cast<const AeqdCachedNumbers*>(cached);
}

}  // namespace

OmbProjCachedNumbers* OmbAzimuthalEquidistant::init(const OmbGeodeticDatum& datum) const {
    return new AeqdCachedNumbers(datum, *this);
}

void OmbAzimuthalEquidistant::project(OmbPoint& p, const OmbProjCachedNumbers* cached) const {
    const AeqdCachedNumbers& c = aeqd(cached);
    double distance, azimuth;
    if (c.sphere) {
        const double lat = p.y * radiansPerDegree, dLon = (p.x - c.centre.x) * radiansPerDegree;
        // The angle by atan2 of its sine and cosine: acos loses half the
        // digits near the centre.
        const double east = std::cos(lat) * std::sin(dLon);
        const double north = c.cosLat0 * std::sin(lat) - c.sinLat0 * std::cos(lat) * std::cos(dLon);
        const double cosAngle = c.sinLat0 * std::sin(lat) + c.cosLat0 * std::cos(lat) * std::cos(dLon);
        distance = c.radius * std::atan2(std::hypot(east, north), cosAngle);
        azimuth = std::atan2(east, north);
    } else {
        OmbGeodesicInverse g = Omb_distanceAndAzimuthsVincenty(*c.ellipsoid, c.centre, p);
        if (!g.converged) g = Omb_distanceAndAzimuthsExact(*c.ellipsoid, c.centre, p);
        distance = g.distance;
        azimuth = g.azimuth * radiansPerDegree;
    }
    p.x = c.falseEasting + distance * std::sin(azimuth) * c.unitsPerMeter;
    p.y = c.falseNorthing + distance * std::cos(azimuth) * c.unitsPerMeter;
}

void OmbAzimuthalEquidistant::unproject(OmbPoint& p, const OmbProjCachedNumbers* cached) const {
    const AeqdCachedNumbers& c = aeqd(cached);
    const double x = (p.x - c.falseEasting) * c.metersPerUnit, y = (p.y - c.falseNorthing) * c.metersPerUnit;
    const double distance = std::hypot(x, y);
    const double azimuth = std::atan2(x, y);
    if (!c.sphere) {
        const OmbPoint q = Omb_pointPlusDirectedDistance(*c.ellipsoid, c.centre, azimuth * degreesPerRadian, distance);
        p.x = wrapLongitude(q.x), p.y = q.y;
        return;
    }
    const double angle = distance / c.radius;
    const double sinLat = c.sinLat0 * std::cos(angle) + c.cosLat0 * std::sin(angle) * std::cos(azimuth);
    p.y = asinSafe(sinLat) * degreesPerRadian;
    p.x = wrapLongitude(
        c.centre.x + std::atan2(std::sin(azimuth) * std::sin(angle) * c.cosLat0, std::cos(angle) - c.sinLat0 * sinLat) *
                         degreesPerRadian);
}

bool OmbAzimuthalEquidistant::isValid(const OmbPoint& lola, const OmbProjCachedNumbers* cached) const {
    // Every point but the centre's antipode, whose azimuth is undefined.
    if (!OmbProjection::isValid(lola, cached)) return false;
    return std::fabs(lola.y + centralLatitude()) > 1e-9 ||
           std::fabs(wrapLongitude(lola.x - centralLongitude() - 180)) > 1e-9;
}

bool OmbAzimuthalEquidistant::equivalent(const OmbProjection& other) const {
    if (!sameAzimuthalParameters(other)) return false;
    const auto& a = static_cast<const OmbAzimuthalEquidistant&>(other);
    return sameEarthShape(a);
}
