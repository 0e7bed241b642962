// Small formulas several projection methods share.
#pragma once

#include <cmath>

namespace OmbProjectionMath {

constexpr double radiansPerDegree = 0.017453292519943295;
constexpr double degreesPerRadian = 57.29577951308232;

// Degrees into (-180, 180].
inline double wrapLongitude(double degrees) {
    if (degrees > -180 && degrees <= 180) return degrees;
    degrees -= std::floor((degrees + 180) / 360) * 360;
    return degrees <= -180 ? degrees + 360 : degrees;
}

// Snyder's t (eq. 15-9), the exponential of minus the isometric latitude:
// tan(pi/4 - lat/2) / ((1 - e sin lat) / (1 + e sin lat))^(e/2).
inline double isometricExp(double lat, double e) {
    const double es = e * std::sin(lat);
    return std::tan(M_PI / 4 - lat / 2) / std::pow((1 - es) / (1 + es), e / 2);
}

// The latitude (radians) of a t by Snyder's eq. 7-9, iterated until two
// values agree within 1e-12 rad; false when 30 rounds do not settle.
inline bool latitudeFromIsometricExp(double t, double e, double& lat) {
    lat = M_PI / 2 - 2 * std::atan(t);
    for (int i = 0; i < 30; ++i) {
        const double es = e * std::sin(lat);
        const double next = M_PI / 2 - 2 * std::atan(t * std::pow((1 - es) / (1 + es), e / 2));
        const bool settled = std::fabs(next - lat) <= 1e-12;
        lat = next;
        if (settled) return true;
    }
    return false;
}

// One Newton step that moves lon/lat (degrees) so that
// forward(lon, lat, x, y) reaches the target x, y, with the Jacobian from
// differences of 1e-6 degrees; false, with lon/lat untouched, where forward
// fails or the Jacobian is singular. Makes an inverse that is not quite the
// forward mapping's inverse undo it.
template <class Forward>
bool newtonStep(const Forward& forward, double x, double y, double& lon, double& lat) {
    constexpr double h = 1e-6;
    double x0, y0, xLon, yLon, xLat, yLat;
    if (!forward(lon, lat, x0, y0) || !forward(lon + h, lat, xLon, yLon) || !forward(lon, lat + h, xLat, yLat))
        return false;
    const double a = (xLon - x0) / h, b = (xLat - x0) / h, c = (yLon - y0) / h, d = (yLat - y0) / h;
    const double determinant = a * d - b * c;
    if (determinant == 0 || !std::isfinite(determinant)) return false;
    const double rx = x - x0, ry = y - y0;
    lon += (d * rx - b * ry) / determinant;
    lat += (a * ry - c * rx) / determinant;
    return true;
}

}  // namespace OmbProjectionMath
