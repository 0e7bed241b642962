// Small NTv2 and CTABLE V2 grid files, written the way the two formats
// store them, for tests of grid-file datum shifts.
#pragma once

#include <cmath>
#include <cstring>
#include <functional>
#include <string>
#include <utility>

constexpr double arcSecond = 1.0 / 3600;
constexpr double radiansPerDegree = M_PI / 180;

// Arc-second shifts at a grid node: longitude (positive west) and latitude.
using NodeShift = std::function<std::pair<double, double>(int lon, int lat)>;

template <class T>
inline void append(std::string& file, const T& value) {
    file.append(reinterpret_cast<const char*>(&value), sizeof value);
}

// Grids over [west, west + 2] x [50, 52] degrees in 1 degree steps, written
// the way the two formats store them.

// CTABLE V2: radians, rows from the south, columns from the west.
inline std::string ctable2(const NodeShift& shift, int west = 10) {
    std::string file(160, '\0');
    std::memcpy(file.data(), "CTABLE V2.0", 11);
    const double corner[4] = {west * radiansPerDegree, 50 * radiansPerDegree, radiansPerDegree, radiansPerDegree};
    const int size[2] = {3, 3};
    std::memcpy(file.data() + 96, corner, sizeof corner);
    std::memcpy(file.data() + 128, size, sizeof size);
    for (int lat = 50; lat <= 52; ++lat)
        for (int lon = west; lon <= west + 2; ++lon) {
            const auto [dLon, dLat] = shift(lon, lat);
            append(file, float(dLon * arcSecond * radiansPerDegree));
            append(file, float(dLat * arcSecond * radiansPerDegree));
        }
    return file;
}

// NTv2: 16-byte records of an 8-byte key and a value, arc-seconds with
// longitudes positive west, rows from the south, columns from the east.
inline std::string ntv2(const NodeShift& shift) {
    std::string file;
    const auto key = [&](const char* name) {
        std::string k(name);
        k.resize(8, ' ');
        file += k;
    };
    const auto integer = [&](const char* name, int v) {
        key(name);
        append(file, v);
        append(file, 0);
    };
    const auto real = [&](const char* name, double v) {
        key(name);
        append(file, v);
    };
    const auto text = [&](const char* name, const char* v) {
        key(name);
        std::string t(v);
        t.resize(8, ' ');
        file += t;
    };
    integer("NUM_OREC", 11);
    integer("NUM_SREC", 11);
    integer("NUM_FILE", 1);
    text("GS_TYPE", "SECONDS");
    text("VERSION", "NTv2.0");
    text("SYSTEM_F", "LOCAL");
    text("SYSTEM_T", "WGS84");
    for (const char* axis : {"MAJOR_F", "MINOR_F", "MAJOR_T", "MINOR_T"}) real(axis, 6378137);
    text("SUB_NAME", "TEST");
    text("PARENT", "NONE");
    text("CREATED", "");
    text("UPDATED", "");
    real("S_LAT", 50 * 3600);
    real("N_LAT", 52 * 3600);
    real("E_LONG", -12 * 3600);
    real("W_LONG", -10 * 3600);
    real("LAT_INC", 3600);
    real("LONG_INC", 3600);
    integer("GS_COUNT", 9);
    for (int lat = 50; lat <= 52; ++lat)
        for (int lon = 12; lon >= 10; --lon) {
            const auto [dLon, dLat] = shift(lon, lat);
            for (const float v : {float(dLat), float(dLon), 0.f, 0.f}) append(file, v);
        }
    key("END");
    append(file, 0.0);
    return file;
}
