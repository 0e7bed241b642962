// Geodesics on an ellipsoid by Vincenty's formulas: distances and azimuths
// between two points (the inverse problem) and the point at a distance and
// azimuth (the direct problem). Points are long/lat in degrees; distances
// in metres; azimuths in degrees clockwise from north, in [0, 360).
#pragma once

#include <oecore/crs/ellipsoid.h>
#include <oecore/linalg/point.h>

struct OmbGeodesicInverse {
    double distance = 0;
    // At the start towards the end, and at the end back towards the start.
    double azimuth = 0;
    double backAzimuth = 180;
    // False for nearly antipodal points, where the iteration does not settle.
    bool converged = true;
};

// Latitudes are clamped to +-89.999999999; the iteration stops when the
// auxiliary longitude changes by at most 5e-14 or after 30 rounds.
OmbGeodesicInverse Omb_distanceAndAzimuthsVincenty(const OmbEllipsoid& ellipsoid, const OmbPoint& from,
                                                   const OmbPoint& to);
// The inverse problem by root finding on the direct one: for nearly
// antipodal points, where Vincenty's iteration need not settle. It serves
// all other pairs too, at the cost of a few thousand line evaluations.
OmbGeodesicInverse Omb_distanceAndAzimuthsExact(const OmbEllipsoid& ellipsoid, const OmbPoint& from,
                                                const OmbPoint& to);
OmbPoint Omb_pointPlusDirectedDistance(const OmbEllipsoid& ellipsoid, const OmbPoint& from, double azimuth,
                                       double distance);
