// Vincenty, T. (1975): Direct and inverse solutions of geodesics on the
// ellipsoid with application of nested equations. Survey Review 23(176),
// 88-93 (equations 1-6 and 10-18 as numbered there). Accurate to about
// 0.1 mm away from nearly antipodal points, where the inverse iteration
// need not converge.
#include <oecore/core/exception.h>
#include <oecore/crs/geodesic.h>

#include <algorithm>
#include <cmath>
#include <optional>
#include <utility>

namespace {

constexpr double pi = 3.14159265358979323846;
constexpr double toRadians = pi / 180;

double normalizedAzimuth(double radians) {
    double degrees = std::fmod(radians / toRadians, 360.0);
    if (degrees < 0) degrees += 360;
    return degrees >= 360 ? 0 : degrees;
}

// The series of equations 3, 4 and 6.
struct Series {
    double a, b;
    explicit Series(double u2)
        : a(1 + u2 / 16384 * (4096 + u2 * (-768 + u2 * (320 - 175 * u2)))),
          b(u2 / 1024 * (256 + u2 * (-128 + u2 * (74 - 47 * u2)))) {}
    double deltaSigma(double sinSigma, double cosSigma, double cos2SigmaM) const {
        const double c2 = cos2SigmaM * cos2SigmaM;
        return b * sinSigma *
               (cos2SigmaM +
                b / 4 *
                    (cosSigma * (-1 + 2 * c2) - b / 6 * cos2SigmaM * (-3 + 4 * sinSigma * sinSigma) * (-3 + 4 * c2)));
    }
};

// The geodesic leaving a point at a given azimuth, parameterised by its arc
// sigma on the auxiliary sphere (equations 1-2, 7-8, 10-13).
class GeodesicLine {
public:
    GeodesicLine(const OmbEllipsoid& ellipsoid, double lat1, double alpha1)
        : b_(ellipsoid.polarRadius()), f_(ellipsoid.flattening()) {
        const double a = ellipsoid.equatorialRadius();
        sinAlpha1_ = std::sin(alpha1), cosAlpha1_ = std::cos(alpha1);
        const double tanU1 = (1 - f_) * std::tan(lat1);
        cosU1_ = 1 / std::sqrt(1 + tanU1 * tanU1), sinU1_ = tanU1 * cosU1_;
        sigma1_ = std::atan2(tanU1, cosAlpha1_);
        sinAlpha_ = cosU1_ * sinAlpha1_;
        cos2Alpha_ = 1 - sinAlpha_ * sinAlpha_;
        series_ = Series(cos2Alpha_ * (a * a - b_ * b_) / (b_ * b_));
    }

    // The arc at which the line is the given distance long.
    double arcAt(double distance) const {
        double sigma = distance / (b_ * series_.a);
        for (int round = 0; round < 100; ++round) {
            const double next = distance / (b_ * series_.a) + deltaSigma(sigma);
            const bool settled = std::fabs(next - sigma) <= 1e-12;
            sigma = next;
            if (settled) break;
        }
        return sigma;
    }
    double distance(double sigma) const { return b_ * series_.a * (sigma - deltaSigma(sigma)); }
    double latitude(double sigma) const {
        const double sinSigma = std::sin(sigma), cosSigma = std::cos(sigma);
        const double x = sinU1_ * sinSigma - cosU1_ * cosSigma * cosAlpha1_;
        return std::atan2(sinU1_ * cosSigma + cosU1_ * sinSigma * cosAlpha1_, (1 - f_) * std::hypot(sinAlpha_, x));
    }
    // Longitude east of the start; eastbound lines grow it steadily from 0
    // to 2 pi over one circuit of the auxiliary sphere.
    double longitude(double sigma) const {
        const double sinSigma = std::sin(sigma), cosSigma = std::cos(sigma);
        double lambda = std::atan2(sinSigma * sinAlpha1_, cosU1_ * cosSigma - sinU1_ * sinSigma * cosAlpha1_);
        if (sinAlpha1_ > 0 && lambda < 0) lambda += 2 * pi;
        const double c = f_ / 16 * cos2Alpha_ * (4 + f_ * (4 - 3 * cos2Alpha_));
        const double cos2SigmaM = std::cos(2 * sigma1_ + sigma);
        return lambda - (1 - c) * f_ * sinAlpha_ *
                            (sigma + c * sinSigma * (cos2SigmaM + c * cosSigma * (-1 + 2 * cos2SigmaM * cos2SigmaM)));
    }
    double startAzimuth() const { return std::atan2(sinAlpha1_, cosAlpha1_); }
    // The azimuth in which the line continues at sigma.
    double azimuth(double sigma) const {
        return std::atan2(sinAlpha_, cosU1_ * std::cos(sigma) * cosAlpha1_ - sinU1_ * std::sin(sigma));
    }

private:
    double deltaSigma(double sigma) const {
        return series_.deltaSigma(std::sin(sigma), std::cos(sigma), std::cos(2 * sigma1_ + sigma));
    }

    double b_, f_;
    double sinAlpha1_, cosAlpha1_, sinU1_, cosU1_, sigma1_, sinAlpha_, cos2Alpha_;
    Series series_{0};
};

// Halves [low, high] while goesLow(middle) says the root lies above it.
template <class F>
double bisect(double low, double high, F goesLow) {
    for (int round = 0; round < 64; ++round) {
        const double middle = (low + high) / 2;
        if (middle == low || middle == high) break;
        (goesLow(middle) ? low : high) = middle;
    }
    return (low + high) / 2;
}

}  // namespace

OmbGeodesicInverse Omb_distanceAndAzimuthsVincenty(const OmbEllipsoid& ellipsoid, const OmbPoint& from,
                                                   const OmbPoint& to) {
    constexpr double limit = 89.999999999;
    const double a = ellipsoid.equatorialRadius();
    const double b = ellipsoid.polarRadius();
    const double f = ellipsoid.flattening();
    const double lat1 = std::clamp(from.y, -limit, limit) * toRadians;
    const double lat2 = std::clamp(to.y, -limit, limit) * toRadians;
    const double l = (to.x - from.x) * toRadians;
    const double u1 = std::atan((1 - f) * std::tan(lat1));
    const double u2 = std::atan((1 - f) * std::tan(lat2));
    const double sinU1 = std::sin(u1), cosU1 = std::cos(u1), sinU2 = std::sin(u2), cosU2 = std::cos(u2);

    OmbGeodesicInverse result;
    double lambda = l;
    double sinSigma = 0, cosSigma = 0, sigma = 0, cos2Alpha = 0, cos2SigmaM = 0;
    bool settled = false;
    for (int round = 0; round < 30 && !settled; ++round) {
        const double sinLambda = std::sin(lambda);
        const double cosLambda = std::cos(lambda);
        sinSigma = std::hypot(cosU2 * sinLambda, cosU1 * sinU2 - sinU1 * cosU2 * cosLambda);
        if (sinSigma == 0) return result;  // coincident points
        cosSigma = sinU1 * sinU2 + cosU1 * cosU2 * cosLambda;
        sigma = std::atan2(sinSigma, cosSigma);
        const double sinAlpha = cosU1 * cosU2 * sinLambda / sinSigma;
        cos2Alpha = 1 - sinAlpha * sinAlpha;
        // Along the equator cos^2 alpha is 0 and the term vanishes (eq. 17).
        cos2SigmaM = cos2Alpha != 0 ? cosSigma - 2 * sinU1 * sinU2 / cos2Alpha : 0;
        const double c = f / 16 * cos2Alpha * (4 + f * (4 - 3 * cos2Alpha));
        const double previous = lambda;
        lambda = l + (1 - c) * f * sinAlpha *
                         (sigma + c * sinSigma * (cos2SigmaM + c * cosSigma * (-1 + 2 * cos2SigmaM * cos2SigmaM)));
        settled = std::fabs(lambda - previous) <= 5e-14;
    }
    result.converged = settled;
    const Series series(cos2Alpha * (a * a - b * b) / (b * b));
    result.distance = b * series.a * (sigma - series.deltaSigma(sinSigma, cosSigma, cos2SigmaM));
    const double sinLambda = std::sin(lambda), cosLambda = std::cos(lambda);
    result.azimuth = normalizedAzimuth(std::atan2(cosU2 * sinLambda, cosU1 * sinU2 - sinU1 * cosU2 * cosLambda));
    const double arrival = std::atan2(cosU1 * sinLambda, -sinU1 * cosU2 + cosU1 * sinU2 * cosLambda);
    result.backAzimuth = normalizedAzimuth(arrival + pi);
    return result;
}

OmbGeodesicInverse Omb_distanceAndAzimuthsExact(const OmbEllipsoid& ellipsoid, const OmbPoint& from,
                                                const OmbPoint& to) {
    constexpr double limit = 89.999999999;
    const double lat1 = std::clamp(from.y, -limit, limit) * toRadians;
    const double lat2 = std::clamp(to.y, -limit, limit) * toRadians;
    const double east = std::remainder(to.x - from.x, 360.0);
    const double dLon = std::fabs(east) * toRadians;
    // Along a meridian no line crosses the target's meridian, and
    // Vincenty's iteration settles at once.
    if (dLon == 0) return Omb_distanceAndAzimuthsVincenty(ellipsoid, from, to);

    // Solved eastwards and mirrored for western targets. Every eastbound
    // line crosses the target's meridian once per circuit; the latitude of
    // that crossing falls as the start azimuth turns from north to south,
    // except near the equator, where either half may hold the answer.
    const auto arcToMeridian = [&](const GeodesicLine& line) {
        return bisect(0, 2 * pi, [&](double sigma) { return line.longitude(sigma) < dLon; });
    };
    const auto missBy = [&](const GeodesicLine& line, double sigma) { return line.latitude(sigma) - lat2; };
    std::optional<std::pair<GeodesicLine, double>> best;  // the line and the target's arc
    const auto consider = [&](const GeodesicLine& line, double sigma) {
        if (std::fabs(missBy(line, sigma)) > 1e-10) return;
        if (!best || line.distance(sigma) < best->first.distance(best->second)) best.emplace(line, sigma);
    };
    for (const auto& [low, high] : {std::pair(0.0, pi / 2), std::pair(pi / 2, pi)}) {
        const double alpha = bisect(low, high, [&](double alpha) {
            const GeodesicLine line(ellipsoid, lat1, alpha);
            return missBy(line, arcToMeridian(line)) > 0;
        });
        const GeodesicLine line(ellipsoid, lat1, alpha);
        consider(line, arcToMeridian(line));
    }
    if (dLon == pi) {  // straight over either pole
        const double u1 = std::atan((1 - ellipsoid.flattening()) * std::tan(lat1));
        const double u2 = std::atan((1 - ellipsoid.flattening()) * std::tan(lat2));
        consider(GeodesicLine(ellipsoid, lat1, 0), pi - u1 - u2);
        consider(GeodesicLine(ellipsoid, lat1, pi), pi + u1 + u2);
    }
    OmbGeodesicInverse result;
    if (!best) {
        result.converged = false;
        return result;
    }
    const auto& [line, sigma] = *best;
    result.distance = line.distance(sigma);
    const double mirror = east < 0 ? -1 : 1;
    result.azimuth = normalizedAzimuth(mirror * line.startAzimuth());
    result.backAzimuth = normalizedAzimuth(mirror * line.azimuth(sigma) + pi);
    return result;
}

OmbPoint Omb_pointPlusDirectedDistance(const OmbEllipsoid& ellipsoid, const OmbPoint& from, double azimuth,
                                       double distance) {
    const GeodesicLine line(ellipsoid, from.y * toRadians, azimuth * toRadians);
    const double sigma = line.arcAt(distance);
    const double lon2 = std::remainder(from.x + line.longitude(sigma) / toRadians, 360.0);
    return {lon2, line.latitude(sigma) / toRadians, from.z};
}

namespace {

// The number of equal segments of at most step in a length.
std::size_t segmentCount(double length, double step, const char* what) {
    constexpr double maxNodes = 1e6;
    if (!(step > 0) || !(length / step < maxNodes)) OMB_THROW(Argument, what);
    return std::max<std::size_t>(1, std::size_t(std::ceil(length / step)));
}

}  // namespace

OmbPointArray Omb_geodesicRoute(const OmbEllipsoid& ellipsoid, const OmbPoint& from, const OmbPoint& to,
                                double maxSegmentLength) {
    OmbGeodesicInverse inverse = Omb_distanceAndAzimuthsVincenty(ellipsoid, from, to);
    if (!inverse.converged) inverse = Omb_distanceAndAzimuthsExact(ellipsoid, from, to);
    const std::size_t segments =
        segmentCount(inverse.distance, maxSegmentLength, "geodesicRoute (maxSegmentLength must be positive)");
    const GeodesicLine line(ellipsoid, std::clamp(from.y, -89.999999999, 89.999999999) * toRadians,
                            inverse.azimuth * toRadians);
    OmbPointArray route(segments + 1);
    for (std::size_t k = 0; k < segments; ++k) {
        const double t = double(k) / double(segments);
        const double sigma = line.arcAt(t * inverse.distance);
        route[k] = {std::remainder(from.x + line.longitude(sigma) / toRadians, 360.0), line.latitude(sigma) / toRadians,
                    from.z + t * (to.z - from.z)};
    }
    route[segments] = to;
    return route;
}

OmbPointArray Omb_greatCircleRoute(const OmbPoint& from, const OmbPoint& to, double maxSegmentDegrees) {
    const auto unit = [](const OmbPoint& p) {
        const double lon = p.x * toRadians, lat = p.y * toRadians;
        return OmbPoint(std::cos(lat) * std::cos(lon), std::cos(lat) * std::sin(lon), std::sin(lat));
    };
    const OmbPoint a = unit(from), b = unit(to);
    const double angle = std::atan2(a.cross(b).length3(), a.dot3(b));
    if (angle > M_PI - 1e-12) OMB_THROW(Argument, "greatCircleRoute (antipodal points lie on many great circles)");
    const std::size_t segments =
        segmentCount(angle / toRadians, maxSegmentDegrees, "greatCircleRoute (maxSegmentDegrees must be positive)");
    OmbPointArray route(segments + 1);
    for (std::size_t k = 0; k < segments; ++k) {
        const double t = double(k) / double(segments);
        // Spherical interpolation; coincident points give the start.
        const double sinAngle = std::sin(angle);
        const OmbPoint v =
            sinAngle < 1e-15 ? a : a * (std::sin((1 - t) * angle) / sinAngle) + b * (std::sin(t * angle) / sinAngle);
        route[k] = {std::atan2(v.y, v.x) / toRadians, std::atan2(v.z, std::hypot(v.x, v.y)) / toRadians,
                    from.z + t * (to.z - from.z)};
    }
    route[segments] = to;
    return route;
}
