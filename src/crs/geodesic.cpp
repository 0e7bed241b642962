// Vincenty, T. (1975): Direct and inverse solutions of geodesics on the
// ellipsoid with application of nested equations. Survey Review 23(176),
// 88-93 (equations 1-6 and 10-18 as numbered there). Accurate to about
// 0.1 mm away from nearly antipodal points, where the inverse iteration
// need not converge.
#include <oecore/crs/geodesic.h>

#include <algorithm>
#include <cmath>

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

OmbPoint Omb_pointPlusDirectedDistance(const OmbEllipsoid& ellipsoid, const OmbPoint& from, double azimuth,
                                       double distance) {
    const double a = ellipsoid.equatorialRadius();
    const double b = ellipsoid.polarRadius();
    const double f = ellipsoid.flattening();
    const double alpha1 = azimuth * toRadians;
    const double sinAlpha1 = std::sin(alpha1), cosAlpha1 = std::cos(alpha1);
    const double tanU1 = (1 - f) * std::tan(from.y * toRadians);
    const double cosU1 = 1 / std::sqrt(1 + tanU1 * tanU1), sinU1 = tanU1 * cosU1;
    const double sigma1 = std::atan2(tanU1, cosAlpha1);
    const double sinAlpha = cosU1 * sinAlpha1;
    const double cos2Alpha = 1 - sinAlpha * sinAlpha;
    const Series series(cos2Alpha * (a * a - b * b) / (b * b));
    double sigma = distance / (b * series.a);
    double cos2SigmaM = 0, sinSigma = 0, cosSigma = 0;
    for (int round = 0; round < 100; ++round) {
        cos2SigmaM = std::cos(2 * sigma1 + sigma);
        sinSigma = std::sin(sigma);
        cosSigma = std::cos(sigma);
        const double next = distance / (b * series.a) + series.deltaSigma(sinSigma, cosSigma, cos2SigmaM);
        const bool settled = std::fabs(next - sigma) <= 1e-12;
        sigma = next;
        if (settled) break;
    }
    sinSigma = std::sin(sigma);
    cosSigma = std::cos(sigma);
    cos2SigmaM = std::cos(2 * sigma1 + sigma);
    const double x = sinU1 * sinSigma - cosU1 * cosSigma * cosAlpha1;
    const double lat2 = std::atan2(sinU1 * cosSigma + cosU1 * sinSigma * cosAlpha1, (1 - f) * std::hypot(sinAlpha, x));
    const double lambda = std::atan2(sinSigma * sinAlpha1, cosU1 * cosSigma - sinU1 * sinSigma * cosAlpha1);
    const double c = f / 16 * cos2Alpha * (4 + f * (4 - 3 * cos2Alpha));
    const double l =
        lambda - (1 - c) * f * sinAlpha *
                     (sigma + c * sinSigma * (cos2SigmaM + c * cosSigma * (-1 + 2 * cos2SigmaM * cos2SigmaM)));
    double lon2 = from.x + l / toRadians;
    lon2 = std::remainder(lon2, 360.0);
    return {lon2, lat2 / toRadians, from.z};
}
