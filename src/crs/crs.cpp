#include "crscatalogue.h"
#include "projections/projectionmath.h"

#include <oecore/core/exception.h>
#include <oecore/core/stringbuilder.h>
#include <oecore/crs/crs.h>
#include <oecore/crs/projections/azimuthal.h>
#include <oecore/crs/projections/equidistantcylindrical.h>
#include <oecore/crs/projections/identity.h>
#include <oecore/crs/projections/lambertconformalconic.h>
#include <oecore/crs/projections/mercator.h>
#include <oecore/crs/projections/wrappedprojections.h>

#include <cmath>
#include <cstdlib>

using namespace OmbProjectionMath;

OMB_DEFINE_ENGINE_CLASS(OmbCrs, OmbResourceObject, "Crs", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbCrs)

OMB_DESCRIBE_CLASS(OmbCrs) {
    d.object<OmbProjection>(
        "Projection", [](const OmbCrs& c) { return c.projection(); },
        [](OmbCrs& c, const OmbRef<OmbProjection>& v) { c.projection(v); });
    d.object<OmbGeodeticDatum>(
        "GeodeticDatum", [](const OmbCrs& c) { return c.geodeticDatum(); },
        [](OmbCrs& c, const OmbRef<OmbGeodeticDatum>& v) { c.geodeticDatum(v); });
    Omb_describeAuthority(d);
    d.afterRead([](OmbCrs& c) { c.construct(); });
}

namespace {

OmbString crsName(const OmbCrs& crs) { return crs.name().empty() ? OmbString::literal("Crs") : crs.name(); }

// The x extent of a cylindrical projection's world on its constants.
double worldWidth(const OmbProjection& projection, const OmbProjCachedNumbers* cached) {
    OmbPoint centre(projection.centralLongitude(), 0), quarter(projection.centralLongitude() + 90, 0);
    projection.project(centre, cached);
    projection.project(quarter, cached);
    return 4 * std::fabs(quarter.x - centre.x);
}

}  // namespace

// --- construction -----------------------------------------------------------------

OmbCrs::OmbCrs() = default;

OmbCrs::OmbCrs(const OmbRef<OmbProjection>& projection, const OmbRef<OmbGeodeticDatum>& geodeticDatum)
    : projection_(projection), datum_(geodeticDatum) {
    finish();
}

OmbCrs::OmbCrs(const OmbString& authority, const OmbString& authorityCode, const OmbRef<OmbProjection>& projection,
               const OmbRef<OmbGeodeticDatum>& geodeticDatum, OmbDatumShiftChoice)
    : authority_(authority), authorityCode_(authorityCode), projection_(projection), datum_(geodeticDatum) {
    finish();
}

OmbCrs::OmbCrs(const OmbRef<OmbProjection>& projection, const OmbRef<OmbGeodeticDatum>& geodeticDatum,
               const OmbString& authority, const OmbString& authorityCode)
    : authority_(authority),
      authorityCode_(authorityCode),
      codeIsLabelOnly_(true),
      projection_(projection),
      datum_(geodeticDatum) {
    finish();
}

OmbCrs::OmbCrs(const OmbPoint& lowerLeft, const OmbPoint& upperRight, const OmbRef<OmbGeodeticDatum>& geodeticDatum)
    : projection_(recommendedProjection(lowerLeft, upperRight)), datum_(geodeticDatum) {
    finish();
}

OmbCrs::OmbCrs(const OmbCrs& other)
    : OmbResourceObject(other),
      authority_(other.authority_),
      authorityCode_(other.authorityCode_),
      codeIsLabelOnly_(other.codeIsLabelOnly_),
      projection_(other.projection_),
      datum_(other.datum_) {
    if (projection_ && datum_) finish();
}

OmbCrs::~OmbCrs() = default;

void OmbCrs::construct() {
    const bool hasCode = !authorityCode_.empty();
    if (projection_ && datum_) {
        codeIsLabelOnly_ = hasCode;
    } else if (!projection_ && !datum_) {
        if (!hasCode) OMB_THROW(CrsNullValues, "projection", "geodeticDatum", crsName(*this));
        const OmbRef<OmbCrs> catalogued = fromAuthorityAndCode(authority_, authorityCode_);
        projection_ = catalogued->projection_;
        datum_ = catalogued->datum_;
        codeIsLabelOnly_ = false;
    } else {
        const char* missing = projection_ ? "geodeticDatum" : "projection";
        const char* present = projection_ ? "projection" : "geodeticDatum";
        if (hasCode) OMB_THROW(CrsNullValueVariant, missing, present, crsName(*this));
        OMB_THROW(CrsNullValue, missing, crsName(*this));
    }
    finish();
}

void OmbCrs::finish() {
    if (!projection_) OMB_THROW(NullValue, "projection", crsName(*this));
    if (!datum_) OMB_THROW(NullValue, "geodeticDatum", crsName(*this));
    authorityAtom_ = authority_.empty() ? 0 : OmbAtoms::atom(authority_.toLower());
    codeAtom_ = authorityCode_.empty() ? 0 : OmbAtoms::atom(authorityCode_.toLower());
    cached_.reset(projection_->init(*datum_));
}

int OmbCrs::id() const {
    if (authorityCode_.empty() || authorityCode_ == OmbString::literal("0")) return 0;
    const std::string code(authorityCode_);
    char* end = nullptr;
    const long value = std::strtol(code.c_str(), &end, 10);
    if (end == code.c_str() || *end != '\0' || value <= 0 || value > 0x7fffffff)
        OMB_THROW(CrsIdError, crsName(*this), authorityCode_);
    return int(value);
}

OmbRect OmbCrs::bounds() const {
    OmbRect out = OmbRect::infinite();
    projection_->project(getValidArea(), cached_.get(), out);
    return out;
}

// --- conversion -------------------------------------------------------------------

void OmbCrs::projectTo(const OmbCrs& target, OmbPoint& p) const {
    if (&target == this || target == *this) return;
    unproject(p);
    if (!(*datum_ == *target.datum_)) datum_->changeDatumTo(*target.datum_, p);
    target.project(p);
}

void OmbCrs::projectTo(const OmbCrs& target, OmbPointArray& points) const {
    if (&target == this || target == *this) return;
    unproject(points);
    if (!(*datum_ == *target.datum_)) datum_->changeDatumTo(*target.datum_, points);
    target.project(points);
}

bool OmbCrs::projectTo(const OmbCrs& target, const OmbRect& in, OmbRect& out) const {
    if (&target == this || target == *this) {
        out = in;
        return true;
    }
    OmbRect lola;
    try {
        if (!projection_->unproject(in, cached_.get(), lola)) return false;
        // A box whose longitudes wrapped covers the whole width.
        if (lola.xmax - lola.xmin > 180 && projection_->georeferenced() && !in.isEmpty()) {
            OmbPoint west(in.xmin, (in.ymin + in.ymax) / 2), east(in.xmax, west.y);
            unproject(west);
            unproject(east);
            if (east.x < west.x) lola.xmin = -180, lola.xmax = 180;
        }
        if (!lola.clipBy({-180, -90, 180, 90})) return false;
        OmbRect shifted = lola;
        if (!(*datum_ == *target.datum_) && !datum_->changeDatumTo(*target.datum_, lola, shifted)) return false;
        OmbRect projected;
        if (!target.projection_->project(shifted, target.cached_.get(), projected)) return false;
        const OmbRect world = target.bounds();
        if (!world.isInvalid() && !projected.clipBy(world)) return false;
        out = projected;
        return true;
    } catch (const OmbException&) {
        return false;
    }
}

OmbPoint OmbCrs::unprojectToGeocentricXYZ(const OmbPoint& p) const {
    OmbPoint q = p;
    unproject(q);
    datum_->ellipsoid()->geodeticToGeocentricXYZ(q.x, q.y, q.z);
    return q;
}

OmbPoint OmbCrs::projectFromGeocentricXYZ(const OmbPoint& xyz) const {
    OmbPoint q = xyz;
    datum_->ellipsoid()->geocentricXYZToGeodetic(q.x, q.y, q.z);
    project(q);
    return q;
}

int OmbCrs::checkValidity(const OmbPointArray& lola, std::vector<bool>& flags) const {
    flags.assign(lola.size(), false);
    int valid = 0;
    for (std::size_t i = 0; i < lola.size(); ++i) valid += (flags[i] = isValid(lola[i])) ? 1 : 0;
    return valid;
}

int OmbCrs::checkContinuousValidity(const OmbPointArray& lola, std::vector<bool>& values) const {
    values.assign(lola.size(), false);
    int valid = 0;
    for (std::size_t i = 0; i < lola.size(); ++i) valid += (values[i] = continuousValidity(lola[i])) ? 1 : 0;
    return valid;
}

// --- measurement ------------------------------------------------------------------

bool OmbCrs::metersXY(const OmbPoint& p, double& mx, double& my) const {
    return projection_->metersXY(p, cached_.get(), mx, my);
}

double OmbCrs::metersX(const OmbPoint& p) const {
    double mx = 0, my = 0;
    metersXY(p, mx, my);
    return mx;
}

double OmbCrs::metersY(const OmbPoint& p) const {
    double mx = 0, my = 0;
    metersXY(p, mx, my);
    return my;
}

double OmbCrs::metersFromCrsUnitsNominally(double units) const {
    double mx, my;
    nominalMetersXY(mx, my);
    return units * (mx + my) / 2;
}

double OmbCrs::crsUnitsFromMetersNominally(double meters) const {
    double mx, my;
    nominalMetersXY(mx, my);
    return meters / ((mx + my) / 2);
}

OmbPoint OmbCrs::lola(const OmbPoint& p, const char* operation) const {
    if (!projection_->georeferenced())
        OMB_THROW(InvalidOperation, OmbString(operation) + OmbString::literal(" with non-georeferenced projection."));
    OmbPoint q = p;
    unproject(q);
    return q;
}

OmbGeodesicInverse OmbCrs::geodesic(const OmbPoint& from, const OmbPoint& to) const {
    const OmbEllipsoid& ellipsoid = *datum_->ellipsoid();
    OmbGeodesicInverse g = Omb_distanceAndAzimuthsVincenty(ellipsoid, from, to);
    return g.converged ? g : Omb_distanceAndAzimuthsExact(ellipsoid, from, to);
}

OmbGeodesicInverse OmbCrs::distanceAndAzimuths(const OmbPoint& a, const OmbPoint& b) const {
    return geodesic(lola(a, "Crs.Distance()"), lola(b, "Crs.Distance()"));
}

double OmbCrs::distance(const OmbPoint& a, const OmbPoint& b) const { return distanceAndAzimuths(a, b).distance; }

OmbPoint OmbCrs::pointPlusDirectedDistance(const OmbPoint& p, double azimuth, double distance) const {
    OmbPoint q = Omb_pointPlusDirectedDistance(*datum_->ellipsoid(), lola(p, "Crs.PointPlusDirectedDistance()"),
                                               azimuth, distance);
    project(q);
    return q;
}

const OmbCrs::AuxNumbers& OmbCrs::aux() const {
    std::call_once(auxOnce_, [this] {
        const OmbRef<OmbProjection>& mercator = OmbProjection::mercator1SPEllipsoid();
        aux_.mercator.reset(mercator->init(*datum_));
        aux_.arcs = std::make_unique<OmbMeriDistProjCachedNumbers>(*datum_, 1, 0);
        OmbPoint degree(1, 0);
        mercator->project(degree, aux_.mercator.get());
        aux_.xPerDegree = degree.x;
    });
    return aux_;
}

OmbPoint OmbCrs::onMercatorPlane(const OmbPoint& lola) const {
    OmbPoint p(0, lola.y);
    OmbProjection::mercator1SPEllipsoid()->project(p, aux().mercator.get());
    return {lola.x, p.y};
}

double OmbCrs::rhumbLength(const OmbPoint& from, const OmbPoint& to, double* course) const {
    // Straight on the Mercator plane: the meridian arc between the
    // latitudes over the cosine of the course, or the parallel's arc.
    const double dLon = wrapLongitude(to.x - from.x);
    const double heading = std::atan2(dLon * aux().xPerDegree, onMercatorPlane(to).y - onMercatorPlane(from).y);
    if (course) *course = heading * degreesPerRadian;
    const OmbMeriDistProjCachedNumbers& arcs = *aux().arcs;
    const double lat1 = from.y * radiansPerDegree, lat2 = to.y * radiansPerDegree;
    if (std::fabs(lat2 - lat1) < 1e-12)
        return std::fabs(dLon) * radiansPerDegree * arcs.primeVerticalRadius(std::sin(lat1)) * std::cos(lat1);
    return std::fabs((arcs.meridianDistance(lat2) - arcs.meridianDistance(lat1)) / std::cos(heading));
}

OmbPoint OmbCrs::alongRhumbLine(const OmbPoint& from, double course, double distance) const {
    const double c = course * radiansPerDegree;
    const OmbMeriDistProjCachedNumbers& arcs = *aux().arcs;
    const double lat1 = from.y * radiansPerDegree;
    if (std::fabs(std::cos(c)) < 1e-12) {
        // Along the parallel.
        const double radius = arcs.primeVerticalRadius(std::sin(lat1)) * std::cos(lat1);
        return {wrapLongitude(from.x + std::sin(c) * distance / radius * degreesPerRadian), from.y, from.z};
    }
    const double lat2 = arcs.latitudeFromMeridianDistance(arcs.meridianDistance(lat1) + distance * std::cos(c));
    const double dy = onMercatorPlane({0, lat2 * degreesPerRadian}).y - onMercatorPlane(from).y;
    return {wrapLongitude(from.x + std::tan(c) * dy / aux().xPerDegree), lat2 * degreesPerRadian, from.z};
}

double OmbCrs::length2d(const OmbPointArray& points, OmbCrsLineType lineType, bool closed) const {
    double length = 0;
    const std::size_t n = points.size();
    for (std::size_t i = 0; n > 1 && i < (closed ? n : n - 1); ++i) {
        const OmbPoint& a = points[i];
        const OmbPoint& b = points[(i + 1) % n];
        length += lineType == OmbCrsLineType::RhumbLine
                      ? rhumbLength(lola(a, "Crs.Length2d()"), lola(b, "Crs.Length2d()"))
                      : distance(a, b);
    }
    return length;
}

OmbPointArray OmbCrs::route(const OmbPoint& a, const OmbPoint& b, OmbCrsLineType lineType,
                            double maxSegmentLength) const {
    if (lineType == OmbCrsLineType::GreatCircleApprox) OMB_THROW(GreatCircleApproxRouteNotImplemented, crsName(*this));
    OmbPointArray nodes;
    if (lineType == OmbCrsLineType::GreatCircle) {
        nodes =
            Omb_geodesicRoute(*datum_->ellipsoid(), lola(a, "Crs.Route()"), lola(b, "Crs.Route()"), maxSegmentLength);
    } else {
        // Equal steps along the straight line on the Mercator plane, the
        // shorter way round in longitude.
        const OmbPoint from = lola(a, "Crs.Route()"), to = lola(b, "Crs.Route()");
        const double length = rhumbLength(from, to);
        if (!(maxSegmentLength > 0) || !(length / maxSegmentLength < 1e6))
            OMB_THROW(Argument, "route (maxSegmentLength must be positive)");
        const std::size_t segments = std::max<std::size_t>(1, std::size_t(std::ceil(length / maxSegmentLength)));
        const double dLon = wrapLongitude(to.x - from.x);
        const double y1 = onMercatorPlane(from).y, y2 = onMercatorPlane(to).y;
        for (std::size_t k = 0; k <= segments; ++k) {
            const double t = double(k) / double(segments);
            OmbPoint node(0, y1 + t * (y2 - y1), from.z + t * (to.z - from.z));
            OmbProjection::mercator1SPEllipsoid()->unproject(node, aux().mercator.get());
            node.x = wrapLongitude(from.x + t * dLon);
            nodes.push_back(node);
        }
    }
    project(nodes);
    nodes[0] = a, nodes[nodes.size() - 1] = b;
    return nodes;
}

OmbString OmbCrs::toWellKnownText(bool pretty, OmbWellKnownTextFlavor flavor) const {
    const OmbString kind = authority_.toLower();
    int code = 0;
    if (kind == OmbString::literal("epsg") && !codeIsLabelOnly_) code = id();
    if (kind == OmbString::literal("crs") &&
        (authorityCode_ == OmbString::literal("84") || authorityCode_ == OmbString::literal("83")))
        code = 4326;
    const bool esri = flavor == OmbWellKnownTextFlavor::EsriWellKnownText;
    OmbString wkt = code ? Omb_catalogueWellKnownText(code, pretty, esri) : OmbString();
    if (wkt.empty()) wkt = Omb_wellKnownTextOf(*this, pretty, esri);
    if (wkt.empty()) OMB_THROW(UnsupportedProjection);
    return wkt;
}

OmbPoint OmbCrs::pointAlongRay2d(const OmbPoint& p, double azimuth, double distance, OmbCrsLineType lineType) const {
    if (lineType != OmbCrsLineType::RhumbLine) return pointPlusDirectedDistance(p, azimuth, distance);
    OmbPoint q = alongRhumbLine(lola(p, "Crs.PointAlongRay2d()"), azimuth, distance);
    project(q);
    return q;
}

OmbPoint OmbCrs::partway(const OmbPoint& a, const OmbPoint& b, double fraction, OmbCrsLineType lineType) const {
    if (lineType != OmbCrsLineType::RhumbLine) {
        const OmbGeodesicInverse g = distanceAndAzimuths(a, b);
        return pointPlusDirectedDistance(a, g.azimuth, fraction * g.distance);
    }
    double course = 0;
    const OmbPoint from = lola(a, "Crs.Partway()");
    const double length = rhumbLength(from, lola(b, "Crs.Partway()"), &course);
    OmbPoint q = alongRhumbLine(from, course, fraction * length);
    project(q);
    return q;
}

OmbPoint OmbCrs::nearestPointOnLine2d(const OmbPointArray& line, const OmbPoint& p, std::size_t& segment) const {
    if (line.empty()) OMB_THROW(Argument, "Crs.nearestPointOnLine2d (the line has no points)");
    OmbPoint nearest = line[0];
    segment = 0;
    double best = p.distanceTo(nearest);
    for (std::size_t i = 0; i + 1 < line.size(); ++i) {
        const OmbPoint d = line[i + 1] - line[i];
        const double length2 = d.dot2(d);
        const double t = length2 > 0 ? std::clamp((p - line[i]).dot2(d) / length2, 0.0, 1.0) : 0;
        const OmbPoint q = line[i] + d * t;
        if (p.distanceTo(q) < best) best = p.distanceTo(q), nearest = q, segment = i;
    }
    return nearest;
}

bool OmbCrs::intersectLineSegments(const OmbPoint& a1, const OmbPoint& a2, const OmbPoint& b1, const OmbPoint& b2,
                                   OmbPoint& crossing) const {
    const OmbPoint r = a2 - a1, s = b2 - b1, w = b1 - a1;
    const double denominator = r.x * s.y - r.y * s.x;
    if (denominator == 0) return false;  // parallel
    const double t = (w.x * s.y - w.y * s.x) / denominator, u = (w.x * r.y - w.y * r.x) / denominator;
    if (t < 0 || t > 1 || u < 0 || u > 1) return false;
    crossing = a1 + r * t;
    return true;
}

// Moves a long/lat point by metres east and north.
OmbPoint OmbCrs::movedOnGround(const OmbPoint& lola, double east, double north) const {
    const double lat = lola.y * radiansPerDegree, s = std::sin(lat);
    const OmbProjCachedNumbers& c = *cached_;
    return {
        wrapLongitude(lola.x + east / (c.primeVerticalRadius(s) * std::max(std::cos(lat), 1e-12)) * degreesPerRadian),
        lola.y + north / c.meridianRadius(s) * degreesPerRadian, lola.z};
}

int OmbCrs::intersectCircles(const OmbPoint& c1, double r1, const OmbPoint& c2, double r2, OmbPoint& p1,
                             OmbPoint& p2) const {
    const OmbPoint centre1 = lola(c1, "Crs.IntersectCircles()"), centre2 = lola(c2, "Crs.IntersectCircles()");
    // First on the sphere of the equatorial radius: x . u1 = cos(r1 / R),
    // x . u2 = cos(r2 / R), |x| = 1.
    const auto unit = [](const OmbPoint& p) {
        const double lon = p.x * radiansPerDegree, lat = p.y * radiansPerDegree;
        return OmbPoint(std::cos(lat) * std::cos(lon), std::cos(lat) * std::sin(lon), std::sin(lat));
    };
    const double R = datum_->ellipsoid()->equatorialRadius();
    const OmbPoint u1 = unit(centre1), u2 = unit(centre2);
    const double cosD = std::clamp(u1.dot3(u2), -1.0, 1.0), sin2D = 1 - cosD * cosD;
    if (sin2D < 1e-24) return 0;  // concentric or antipodal
    const double k1 = std::cos(r1 / R), k2 = std::cos(r2 / R);
    const double a = (k1 - k2 * cosD) / sin2D, b = (k2 - k1 * cosD) / sin2D;
    const double c2Squared = (1 - (a * a + b * b + 2 * a * b * cosD)) / sin2D;
    if (c2Squared < -1e-12) return 0;
    const double c = std::sqrt(std::max(c2Squared, 0.0));
    const OmbPoint normal = u1.cross(u2);
    int found = 0;
    for (const double sign : {1.0, -1.0}) {
        if (found && c == 0) break;  // touching: one point
        const OmbPoint x = u1 * a + u2 * b + normal * (sign * c);
        OmbPoint p(std::atan2(x.y, x.x) * degreesPerRadian, std::atan2(x.z, std::hypot(x.x, x.y)) * degreesPerRadian);
        // Then Newton's method on the ellipsoid's geodesic distances, whose
        // gradients point along the arrival azimuths.
        for (int step = 0; step < 20; ++step) {
            const OmbGeodesicInverse g1 = geodesic(centre1, p), g2 = geodesic(centre2, p);
            const double f1 = g1.distance - r1, f2 = g2.distance - r2;
            if (std::fabs(f1) < 1e-7 && std::fabs(f2) < 1e-7) break;
            const double a1 = (g1.backAzimuth - 180) * radiansPerDegree, a2 = (g2.backAzimuth - 180) * radiansPerDegree;
            const double determinant = std::sin(a1) * std::cos(a2) - std::cos(a1) * std::sin(a2);
            if (std::fabs(determinant) < 1e-12) break;
            const double east = (-f1 * std::cos(a2) + f2 * std::cos(a1)) / determinant;
            const double north = (-f2 * std::sin(a1) + f1 * std::sin(a2)) / determinant;
            p = movedOnGround(p, east, north);
        }
        project(p);
        (found++ ? p2 : p1) = p;
    }
    return found;
}

int OmbCrs::intersectLineSegmentAndCircle(const OmbPoint& a, const OmbPoint& b, const OmbPoint& centre, double radius,
                                          OmbPoint& p1, OmbPoint& p2) const {
    const char* operation = "Crs.IntersectLineSegmentAndCircle()";
    const OmbPoint from = lola(a, operation), to = lola(b, operation), middle = lola(centre, operation);
    const OmbGeodesicInverse line = geodesic(from, to);
    const auto at = [&](double t) {
        return Omb_pointPlusDirectedDistance(*datum_->ellipsoid(), from, line.azimuth, t * line.distance);
    };
    const auto miss = [&](double t) { return geodesic(middle, at(t)).distance - radius; };
    // A geodesic meets a geodesic circle at most twice: find the sign
    // changes between samples, then bisect each.
    constexpr int samples = 64;
    int found = 0;
    double previous = miss(0);
    for (int i = 1; i <= samples && found < 2; ++i) {
        double lo = double(i - 1) / samples, hi = double(i) / samples;
        const double current = miss(hi);
        if ((previous < 0) != (current < 0) || current == 0) {
            double fLo = previous;
            for (int k = 0; k < 60 && hi - lo > 1e-15; ++k) {
                const double mid = (lo + hi) / 2, fMid = miss(mid);
                if ((fLo < 0) == (fMid < 0))
                    lo = mid, fLo = fMid;
                else
                    hi = mid;
            }
            OmbPoint p = at((lo + hi) / 2);
            project(p);
            (found++ ? p2 : p1) = p;
        }
        previous = current;
    }
    return found;
}

OmbRect OmbCrs::expandRect(const OmbRect& rect, double meters) const {
    const OmbPoint centre =
        projection_->safePointForMetersXY({(rect.xmin + rect.xmax) / 2, (rect.ymin + rect.ymax) / 2}, cached_.get());
    double mx, my;
    if (!metersXY(centre, mx, my)) nominalMetersXY(mx, my);
    return rect.extendCopy(meters / mx, meters / my);
}

double OmbCrs::normalizeCyclicEasting(double x) const {
    OmbRect r(x, 0, x, 0);
    adjustRect(r);
    return r.xmin;
}

void OmbCrs::adjustPoint(OmbPoint& p) const { p.x = normalizeCyclicEasting(p.x); }

// --- comparison -------------------------------------------------------------------

bool OmbCrs::operator==(const OmbCrs& other) const {
    if (this == &other) return true;
    if (!codeIsLabelOnly_ && !other.codeIsLabelOnly_ && authorityAtom_ && codeAtom_ &&
        authorityAtom_ == other.authorityAtom_ && codeAtom_ == other.codeAtom_)
        return true;
    return *datum_ == *other.datum_ && *projection_ == *other.projection_;
}

bool OmbCrs::compatibleWith(const OmbRef<OmbCrs>& other) const {
    if (!other) return false;
    if (*this == *other) return true;
    if (!(*datum_ == *other->datum_)) return false;
    const double width = worldWidth(*other->projection_, other->cached_.get());
    if (const auto* m = dynamic_cast<const OmbMercator*>(projection_.get()))
        if (const auto* n = dynamic_cast<const OmbMercator*>(other->projection_.get()))
            return m->compatibleWith(*n, width);
    if (const auto* e = dynamic_cast<const OmbEquidistantCylindrical*>(projection_.get()))
        if (const auto* f = dynamic_cast<const OmbEquidistantCylindrical*>(other->projection_.get()))
            return e->compatibleWith(*f, width);
    // Long/lat counts as the angular family in degrees.
    const auto angular = [](const OmbRef<OmbProjection>& p) -> OmbRef<OmbEquidistantCylindricalAngularProjection> {
        if (dynamic_cast<const OmbLoLa*>(p.get()))
            return OmbRef<OmbEquidistantCylindricalAngularProjection>(new OmbEquidistantCylindricalAngularProjection);
        return omb_dynamic_cast<OmbEquidistantCylindricalAngularProjection>(p);
    };
    const auto a = angular(projection_), b = angular(other->projection_);
    return a && b && a->compatibleWith(*b, width);
}

// --- factories --------------------------------------------------------------------

bool OmbCrs::reasonableEpsgCode(int code) {
    return (code >= 2000 && code <= 5999) || (code >= 7000 && code <= 7999) || (code >= 20000 && code <= 32767);
}

bool OmbCrs::reasonableEsriCode(int code) {
    return (code >= 37000 && code <= 37999) || (code >= 53000 && code <= 54999) || (code >= 65000 && code <= 65999) ||
           (code >= 102000 && code <= 104999);
}

bool OmbCrs::insideValidRange(double value, bool isLongitude) {
    return isLongitude ? value > -999.5 && value < 999.5 : value > -90.0000001 && value < 90.0000001;
}

OmbRef<OmbCrs> OmbCrs::fromUrn(const OmbString& urn, OmbDatumShiftChoice choice) {
    std::vector<std::string> parts;
    const std::string text(urn);
    for (std::size_t start = 0;;) {
        const std::size_t colon = text.find(':', start);
        parts.push_back(text.substr(start, colon - start));
        if (colon == std::string::npos) break;
        start = colon + 1;
    }
    std::string authority, code;
    if (parts.size() == 2) {
        authority = parts[0], code = parts[1];
    } else if (parts.size() >= 6) {
        authority = parts[4], code = parts.back();
        if (OmbString(authority).toLower() == OmbString::literal("ogc") && code.size() >= 3 &&
            OmbString(code.substr(0, 3)).toLower() == OmbString::literal("crs"))
            authority = "CRS", code = code.substr(3);
    } else {
        OMB_THROW(Argument, "Crs.fromUrn (\"" + urn + "\" is neither AUTHORITY:CODE nor an OGC URN)");
    }
    return fromAuthorityAndCode(OmbString(authority), OmbString(code), choice);
}

OmbRef<OmbProjection> OmbCrs::recommendedProjection(const OmbPoint& lowerLeft, const OmbPoint& upperRight) {
    const double west = lowerLeft.x, east = upperRight.x, south = lowerLeft.y, north = upperRight.y;
    double centreLongitude = (west + east + (east < west ? 360 : 0)) / 2;
    while (centreLongitude > 180) centreLongitude -= 360;
    while (centreLongitude < -180) centreLongitude += 360;
    const double centreLatitude = (south + north) / 2;
    if (centreLatitude >= 85 || north >= 90 || centreLatitude <= -85 || south <= -90) {
        OmbRef<OmbPolarStereographic> polar(new OmbPolarStereographic(centreLatitude > 0));
        polar->centralLongitude(centreLongitude);
        return OmbRef<OmbProjection>(polar);
    }
    if (std::fabs(centreLatitude) < 5) {
        OmbRef<OmbMercator> mercator(new OmbMercator);
        mercator->shape(OmbEarthShape::Ellipsoid);
        mercator->centralLongitude(centreLongitude);
        return OmbRef<OmbProjection>(mercator);
    }
    return OmbRef<OmbProjection>(new OmbLambertConformalConic2SP(centreLongitude, centreLatitude,
                                                                 (3 * south + north) / 4, (3 * north + south) / 4));
}

OmbRef<OmbCrs> OmbCrs::fromArea(const OmbPoint& lowerLeft, const OmbPoint& upperRight,
                                const OmbRef<OmbGeodeticDatum>& datum) {
    return OmbRef<OmbCrs>(new OmbCrs(lowerLeft, upperRight, datum));
}

OmbRef<OmbCrs> OmbCrs::recenteredClone(double longitude) const {
    const OmbPoint origin(longitude, projection_->centralLatitude());
    OmbRef<OmbCrs> clone(
        new OmbCrs(OmbRef<OmbProjection>(new OmbProjectionWithNewOrigin(projection_, origin)), datum_));
    clone->name(name() + OmbString::literal("Recentered"));
    return clone;
}
