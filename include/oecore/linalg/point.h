// OmbPoint: three coordinates, the value type of every geometry and of
// coordinate transformation (long/lat in degrees with the height in metres,
// or projected x, y, z).
#pragma once

#include <cmath>
#include <cstddef>

struct OmbPoint {
    double x = 0;
    double y = 0;
    double z = 0;

    constexpr OmbPoint() = default;
    constexpr OmbPoint(double px, double py, double pz = 0) : x(px), y(py), z(pz) {}

    // x, y, z for 0, 1, 2; OmbXIndexOutOfBounds for any other index.
    double& operator[](std::size_t i);
    double operator[](std::size_t i) const;

    friend constexpr bool operator==(const OmbPoint& a, const OmbPoint& b) {
        return a.x == b.x && a.y == b.y && a.z == b.z;
    }
    // Every coordinate strictly within eps of p's.
    bool approxEqual(const OmbPoint& p, double eps) const {
        return std::fabs(x - p.x) < eps && std::fabs(y - p.y) < eps && std::fabs(z - p.z) < eps;
    }
    // Componentwise: every coordinate strictly smaller.
    friend constexpr bool operator<(const OmbPoint& a, const OmbPoint& b) {
        return a.x < b.x && a.y < b.y && a.z < b.z;
    }

    friend constexpr OmbPoint operator+(const OmbPoint& a, const OmbPoint& b) {
        return {a.x + b.x, a.y + b.y, a.z + b.z};
    }
    friend constexpr OmbPoint operator-(const OmbPoint& a, const OmbPoint& b) {
        return {a.x - b.x, a.y - b.y, a.z - b.z};
    }
    friend constexpr OmbPoint operator*(const OmbPoint& a, const OmbPoint& b) {
        return {a.x * b.x, a.y * b.y, a.z * b.z};
    }
    friend constexpr OmbPoint operator*(const OmbPoint& a, double s) { return {a.x * s, a.y * s, a.z * s}; }
    OmbPoint& operator+=(const OmbPoint& p) { return *this = *this + p; }
    OmbPoint& operator-=(const OmbPoint& p) { return *this = *this - p; }
    OmbPoint& operator*=(double s) { return *this = *this * s; }

    double dot2(const OmbPoint& p) const { return x * p.x + y * p.y; }
    double dot3(const OmbPoint& p) const { return x * p.x + y * p.y + z * p.z; }
    OmbPoint cross(const OmbPoint& p) const { return {y * p.z - z * p.y, z * p.x - x * p.z, x * p.y - y * p.x}; }
    double length2() const { return std::hypot(x, y); }
    double length3() const { return std::sqrt(x * x + y * y + z * z); }
    // The 2D distance.
    double distanceTo(const OmbPoint& p) const { return std::hypot(p.x - x, p.y - y); }
};
