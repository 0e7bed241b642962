// Geodesics on an ellipsoid by Vincenty's formulas: distances and azimuths
// between two points (the inverse problem) and the point at a distance and
// azimuth (the direct problem). Points are long/lat in degrees; distances
// in metres; azimuths in degrees clockwise from north, in [0, 360).
#pragma once

#include <oecore/crs/ellipsoid.h>
#include <oecore/linalg/pointarray.h>

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

// The geodesic from one point to another as nodes no more than
// maxSegmentLength metres apart along it, equally spaced, both ends
// included; heights are interpolated. OmbXArgument for a length that is not
// positive or that would need more than a million nodes.
OmbPointArray Omb_geodesicRoute(const OmbEllipsoid& ellipsoid, const OmbPoint& from, const OmbPoint& to,
                                double maxSegmentLength);
// The great circle on the sphere through two long/lat points, as nodes no
// more than maxSegmentDegrees of arc apart; the same conditions, and
// OmbXArgument for antipodal points, which many great circles join.
OmbPointArray Omb_greatCircleRoute(const OmbPoint& from, const OmbPoint& to, double maxSegmentDegrees);
