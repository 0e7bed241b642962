// Helpers for projection tests: cached numbers bound to a projection,
// reproducible random points, and round-trip measurement.
#pragma once

#include <oecore/crs/projection.h>

#include <algorithm>
#include <cmath>
#include <memory>
#include <random>
#include <vector>

// A projection with its cached numbers for one datum (WGS 84 unless given).
struct BoundProjection {
    explicit BoundProjection(OmbRef<OmbProjection> p, const OmbRef<OmbGeodeticDatum>& datum = OmbGeodeticDatum::wgs84())
        : projection(std::move(p)), cached(projection->init(*datum)) {}

    OmbPoint project(OmbPoint p) const {
        projection->project(p, cached.get());
        return p;
    }
    OmbPoint unproject(OmbPoint p) const {
        projection->unproject(p, cached.get());
        return p;
    }
    // The largest difference in degrees, longitude scaled by cos(latitude),
    // between the points and their unprojected projections.
    double worstRoundTrip(const std::vector<OmbPoint>& points) const {
        double worst = 0;
        for (const OmbPoint& p : points) {
            const OmbPoint back = unproject(project(p));
            double dLon = std::remainder(back.x - p.x, 360.0) * std::cos(p.y * M_PI / 180);
            worst = std::max({worst, std::fabs(dLon), std::fabs(back.y - p.y)});
        }
        return worst;
    }

    OmbRef<OmbProjection> projection;
    std::unique_ptr<OmbProjCachedNumbers> cached;
};

inline std::vector<OmbPoint> randomPoints(unsigned seed, int count, double lon0, double lon1, double lat0,
                                          double lat1) {
    std::mt19937 random(seed);
    std::uniform_real_distribution<double> lon(lon0, lon1), lat(lat0, lat1);
    std::vector<OmbPoint> points;
    for (int i = 0; i < count; ++i) {
        const double x = lon(random);
        points.emplace_back(x, lat(random));
    }
    return points;
}
