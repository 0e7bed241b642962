#include "projections/edgesearch.h"
#include "projections/projectionmath.h"

#include <oecore/core/stringbuilder.h>
#include <oecore/crs/projection.h>

#include <cmath>
#include <limits>

OMB_DEFINE_ENGINE_CLASS(OmbProjection, OmbResourceObject, "Projection", 0)

OMB_DESCRIBE_CLASS(OmbProjection) { Omb_describeAuthority(d); }

namespace {

using namespace OmbProjectionMath;

bool finite(const OmbPoint& p) { return std::isfinite(p.x) && std::isfinite(p.y); }

}  // namespace

// --- cached numbers ----------------------------------------------------------------

OmbProjCachedNumbers::OmbProjCachedNumbers(const OmbGeodeticDatum& datum, double unitMeters) {
    const OmbEllipsoid& ellipsoid = *datum.ellipsoid();
    a = ellipsoid.equatorialRadius();
    f = ellipsoid.flattening();
    b = ellipsoid.polarRadius();
    e2 = ellipsoid.e2();
    e = std::sqrt(e2);
    ep2 = e2 / (1 - e2);
    n = f / (2 - f);
    metersPerUnit = unitMeters;
    unitsPerMeter = 1 / unitMeters;
}

double OmbProjCachedNumbers::meridianRadius(double sinLat) const {
    const double w2 = 1 - e2 * sinLat * sinLat;
    return a * (1 - e2) / (w2 * std::sqrt(w2));
}

double OmbProjCachedNumbers::primeVerticalRadius(double sinLat) const {
    return a / std::sqrt(1 - e2 * sinLat * sinLat);
}

double OmbProjCachedNumbers::sphereRadius(const OmbString& source, double argument, double latitude) const {
    const std::string_view s(source.dataUtf8(), source.size());
    if (s.empty() || s == "#equatorialRadius") return a;
    if (s == "#radiusFromArgument") return argument;
    if (s == "#equalArea") {
        if (e == 0) return a;
        const double q = 1 - (1 - e2) / (2 * e) * std::log((1 - e) / (1 + e));
        return a * std::sqrt(q / 2);
    }
    if (s == "#meanRadiusOfCurvatureAtCentralLatitude" || s == "#meanRadiusOfCurvatureAtStandardParallel") {
        const double sinLat = std::sin(latitude * radiansPerDegree);
        return std::sqrt(meridianRadius(sinLat) * primeVerticalRadius(sinLat));
    }
    OMB_THROW(Argument, "sphereRadiusSource \"" + source + "\"");
}

OmbMeriDistProjCachedNumbers::OmbMeriDistProjCachedNumbers(const OmbGeodeticDatum& datum, double unitMeters,
                                                           double centralLatitude)
    : OmbProjCachedNumbers(datum, unitMeters) {
    en[0] = 1 - e2 * (1.0 / 4 + e2 * (3.0 / 64 + e2 * (5.0 / 256 + e2 * 175.0 / 16384)));
    en[1] = e2 * (3.0 / 4 - e2 * (3.0 / 64 + e2 * (5.0 / 256 + e2 * 175.0 / 16384)));
    const double e4 = e2 * e2;
    en[2] = e4 * (15.0 / 32 - e2 * (5.0 / 384 + e2 * 175.0 / 24576));
    en[3] = e4 * e2 * (35.0 / 96 - e2 * 175.0 / 30720);
    en[4] = e4 * e4 * 315.0 / 1024;
    m0 = meridianDistance(centralLatitude * radiansPerDegree);
}

double OmbMeriDistProjCachedNumbers::meridianDistance(double lat) const {
    return meridianDistance(lat, std::sin(lat), std::cos(lat));
}

double OmbMeriDistProjCachedNumbers::latitudeFromMeridianDistance(double m) const {
    // Newton's method on M(lat) - m, whose derivative is the meridian radius.
    double lat = m / (a * en[0]);
    for (int i = 0; i < 20; ++i) {
        const double s = std::sin(lat);
        const double step = (meridianDistance(lat, s, std::cos(lat)) - m) / meridianRadius(s);
        lat -= step;
        if (std::fabs(step) < 1e-14) break;
    }
    return lat;
}

bool OmbEarthShapeParameters::sameEarthShape(const OmbEarthShapeParameters& other) const {
    if (shape_ != other.shape_) return false;
    if (shape_ == OmbEarthShape::Ellipsoid) return true;
    const auto effective = [](const OmbString& source) {
        return source.empty() ? OmbString::literal("#equatorialRadius") : source;
    };
    if (effective(sphereRadiusSource_) != effective(other.sphereRadiusSource_)) return false;
    return sphereRadiusSource_ != OmbString::literal("#radiusFromArgument") || sphereRadius_ == other.sphereRadius_;
}

// --- the base ---------------------------------------------------------------------

OmbProjection::OmbProjection(bool cyclicX, bool cyclicY) : cyclicX_(cyclicX), cyclicY_(cyclicY) {
    if (cyclicX && cyclicY) OMB_THROW(InternalError, "Programming error: cyclicX && cyclicY");
}

const OmbRef<OmbLengthUnit>& OmbProjection::lengthUnit() const {
    if (lengthUnit_) return lengthUnit_;
    // The predefined metre, or one of our own while the runtime is down.
    static const OmbRef<OmbLengthUnit> metre(new OmbLengthUnit(1.0));
    return OmbLengthUnit::meter() ? OmbLengthUnit::meter() : metre;
}

OmbProjCachedNumbers* OmbProjection::init(const OmbGeodeticDatum& datum) const {
    return new OmbProjCachedNumbers(datum, metersPerProjUnit());
}

bool OmbProjection::project(const OmbRect& in, const OmbProjCachedNumbers* cached, OmbRect& out) const {
    OmbEdgeSearch search([&](OmbPoint& p) { project(p, cached); });
    // Extremes of x and y along a parallel lie at the central meridian or the
    // antimeridian, and the equator separates the hemispheres' behaviour.
    search.splitX(centralLongitude_);
    search.splitX(wrapLongitude(centralLongitude_ + 180));
    search.splitX(wrapLongitude(centralLongitude_ + 180) - 360);
    search.splitY(0);
    return search.bounds(in, out);
}

void OmbProjection::project(OmbPointArray& points, const OmbProjCachedNumbers* cached) const {
    for (OmbPoint& p : points) project(p, cached);
}

bool OmbProjection::unproject(const OmbRect& in, const OmbProjCachedNumbers* cached, OmbRect& out) const {
    OmbEdgeSearch search([&](OmbPoint& p) { unproject(p, cached); });
    const OmbPoint origin = projectedOrigin(cached);
    search.splitX(origin.x);
    search.splitY(origin.y);
    OmbRect found;
    if (!search.bounds(in, found)) return false;
    // The inverse is singular at a pole's image: a rectangle around it
    // reaches the pole and every longitude, inside its edges.
    for (const double pole : {-90.0, 90.0}) {
        OmbPoint image(centralLongitude_, pole);
        if (!isValid(image, cached)) continue;
        try {
            project(image, cached);
        } catch (const OmbException&) {
            continue;
        }
        if (!in.strictlyInside(image)) continue;
        found.include({-180, pole});
        found.include({180, pole});
    }
    out = found;
    return true;
}

void OmbProjection::unproject(OmbPointArray& points, const OmbProjCachedNumbers* cached) const {
    for (OmbPoint& p : points) unproject(p, cached);
}

bool OmbProjection::metersXY(const OmbPoint& p, const OmbProjCachedNumbers* cached, double& mx, double& my) const {
    if (!isValidProjectedPoint(p, cached)) return false;
    return metersXYInternal(p, cached, mx, my);
}

OmbPoint OmbProjection::safePointForMetersXY(const OmbPoint& p, const OmbProjCachedNumbers* cached) const {
    return isValidProjectedPoint(p, cached) ? p : projectedOrigin(cached);
}

bool OmbProjection::metersXYInternal(const OmbPoint& p, const OmbProjCachedNumbers* cached, double& mx,
                                     double& my) const {
    // Central differences of unproject over about a metre, weighed by the
    // ellipsoid's radii of curvature.
    double nominalX, nominalY;
    nominalMetersXY(cached, nominalX, nominalY);
    auto groundPerUnit = [&](double dx, double dy) {
        OmbPoint a(p.x - dx / 2, p.y - dy / 2), b(p.x + dx / 2, p.y + dy / 2);
        unproject(a, cached);
        unproject(b, cached);
        const double lat = (a.y + b.y) / 2 * radiansPerDegree;
        const double s = std::sin(lat);
        const double north = (b.y - a.y) * radiansPerDegree * cached->meridianRadius(s);
        const double east =
            wrapLongitude(b.x - a.x) * radiansPerDegree * cached->primeVerticalRadius(s) * std::cos(lat);
        return std::hypot(north, east) / std::hypot(dx, dy);
    };
    mx = groundPerUnit(1 / nominalX, 0);
    my = groundPerUnit(0, 1 / nominalY);
    return std::isfinite(mx) && std::isfinite(my);
}

double OmbProjection::angle(const OmbPoint& p, double azimuth, const OmbProjCachedNumbers* cached) const {
    OmbPoint lola = p;
    unproject(lola, cached);
    const double lat = lola.y * radiansPerDegree;
    const double s = std::sin(lat);
    const double az = azimuth * radiansPerDegree;
    // Half a metre either way along the azimuth.
    const double dLat = 0.5 * std::cos(az) / cached->meridianRadius(s) * degreesPerRadian;
    const double dLon =
        0.5 * std::sin(az) / (cached->primeVerticalRadius(s) * std::max(std::cos(lat), 1e-12)) * degreesPerRadian;
    OmbPoint a(lola.x - dLon, lola.y - dLat), b(lola.x + dLon, lola.y + dLat);
    project(a, cached);
    project(b, cached);
    return std::atan2(b.y - a.y, b.x - a.x) * degreesPerRadian;
}

double OmbProjection::azimuth(const OmbPoint& p, double angle, const OmbProjCachedNumbers* cached) const {
    double nominalX, nominalY;
    nominalMetersXY(cached, nominalX, nominalY);
    const double an = angle * radiansPerDegree;
    const double dx = 0.5 * std::cos(an) / nominalX, dy = 0.5 * std::sin(an) / nominalY;
    OmbPoint a(p.x - dx, p.y - dy), b(p.x + dx, p.y + dy);
    unproject(a, cached);
    unproject(b, cached);
    const double lat = (a.y + b.y) / 2 * radiansPerDegree;
    const double s = std::sin(lat);
    const double north = (b.y - a.y) * cached->meridianRadius(s);
    const double east = wrapLongitude(b.x - a.x) * cached->primeVerticalRadius(s) * std::cos(lat);
    const double az = std::atan2(east, north) * degreesPerRadian;
    return az < 0 ? az + 360 : az;
}

void OmbProjection::adjustRect(OmbRect& rect, const OmbProjCachedNumbers* cached) const {
    if (!cyclicX_) return;
    OmbPoint centre(centralLongitude_, 0), quarter(centralLongitude_ + 90, 0);
    project(centre, cached);
    project(quarter, cached);
    const double width = 4 * (quarter.x - centre.x);
    const double west = centre.x - width / 2;
    // A left edge on the world's edge, give or take rounding, stays there.
    rect.offset(-std::floor((rect.xmin - west) / width + 1e-12) * width, 0);
}

OmbRect OmbProjection::getValidArea(const OmbProjCachedNumbers*) const { return {-180, -90, 180, 90}; }

bool OmbProjection::isValid(const OmbPoint& lola, const OmbProjCachedNumbers*) const {
    return finite(lola) && std::fabs(lola.y) <= 90;
}

bool OmbProjection::continuousValidity(const OmbPoint& lola, const OmbProjCachedNumbers* cached) const {
    return isValid(lola, cached);
}

bool OmbProjection::isValidProjectedPoint(const OmbPoint& p, const OmbProjCachedNumbers* cached) const {
    if (!finite(p)) return false;
    OmbPoint lola = p;
    try {
        unproject(lola, cached);
        if (!isValid(lola, cached)) return false;
        OmbPoint back = lola;
        project(back, cached);
        // A point outside the projected world unprojects to one whose image
        // lies elsewhere.
        const double tolerance = 1e-6 * std::max({1.0, std::fabs(p.x), std::fabs(p.y)});
        return std::fabs(back.x - p.x) <= tolerance && std::fabs(back.y - p.y) <= tolerance;
    } catch (const OmbException&) {
        return false;
    }
}

OmbPointArray OmbProjection::worldPerimeter(const OmbProjCachedNumbers* cached) const {
    const OmbRect area = getValidArea(cached);
    OmbPointArray outline;
    auto walk = [&](OmbPoint from, OmbPoint to) {
        constexpr int steps = 180;
        for (int i = 0; i < steps; ++i) {
            const double t = double(i) / steps;
            OmbPoint p(from.x + t * (to.x - from.x), from.y + t * (to.y - from.y));
            try {
                project(p, cached);
                if (finite(p)) outline.push_back(p);
            } catch (const OmbException&) {
            }
        }
    };
    walk({area.xmin, area.ymin}, {area.xmax, area.ymin});
    walk({area.xmax, area.ymin}, {area.xmax, area.ymax});
    walk({area.xmax, area.ymax}, {area.xmin, area.ymax});
    walk({area.xmin, area.ymax}, {area.xmin, area.ymin});
    if (!outline.empty()) outline.push_back(outline.front());
    return outline;
}

OmbPoint OmbProjection::projectedOrigin(const OmbProjCachedNumbers* cached) const {
    OmbPoint origin(centralLongitude_, centralLatitude_);
    project(origin, cached);
    return origin;
}

void OmbProjection::snapToWorld(OmbPoint& lola) const {
    lola.x = wrapLongitude(lola.x);
    lola.y = std::clamp(lola.y, -90.0, 90.0);
}

bool OmbProjection::sameParameters(const OmbProjection& other) const {
    return myRuntimeClass() == other.myRuntimeClass() && centralLongitude_ == other.centralLongitude_ &&
           centralLatitude_ == other.centralLatitude_ && falseEasting_ == other.falseEasting_ &&
           falseNorthing_ == other.falseNorthing_ && scaleFactor_ == other.scaleFactor_ &&
           lengthUnit()->equivalent(*other.lengthUnit());
}

bool OmbProjection::shiftedByWholeWorlds(const OmbProjection& other, double worldWidth) const {
    const double offset =
        (other.falseEasting_ - falseEasting_) - (other.centralLongitude_ - centralLongitude_) * worldWidth / 360;
    const double turns = offset / worldWidth;
    return std::fabs(turns - std::round(turns)) * worldWidth <= 1e-5;
}

void OmbProjection::projectionError(const OmbPoint& p, const char* what) const {
    OmbStringBuilder where;
    where << "point (" << OmbFormat::real(p.x) << ", " << OmbFormat::real(p.y) << "): " << what;
    OMB_THROW(ProjectionError, name().empty() ? OmbString(myRuntimeClassName()) : name(), where.str());
}

double OmbProjection::asinSafe(double x) const {
    if (std::fabs(x) <= 1) return std::asin(x);
    if (std::fabs(x) <= 1.00000000000001) return x > 0 ? M_PI / 2 : -M_PI / 2;
    OmbStringBuilder value;
    value << OmbFormat::real(x);
    OMB_THROW(RangeError,
              "argument to asinSafe in map projection formula for " +
                  (name().empty() ? OmbString::literal(" (UNKNOWN PROJECTION)") : name()),
              value.str(), "in [-1, 1]");
}
