// The datum the coordinate tests lean on: OSGB 36 with its Helmert shift to
// WGS 84 (EPSG 1314, position vector).
#pragma once

#include <oecore/crs/geodeticdatum.h>

inline OmbHelmertDatumShift::Parameters osgb36Parameters() {
    OmbHelmertDatumShift::Parameters p;
    p.dx = 446.448, p.dy = -125.157, p.dz = 542.06;
    p.rx = 0.15, p.ry = 0.247, p.rz = 0.842;
    p.scaleDifference = -20.489;
    return p;
}

// A fresh datum (its shift's caches not yet built) on an ellipsoid.
inline OmbRef<OmbGeodeticDatum> helmertDatum(const OmbRef<OmbEllipsoid>& ellipsoid,
                                             const OmbHelmertDatumShift::Parameters& p, const char* name = "D") {
    OmbRef<OmbHelmertDatumShift> shift(new OmbHelmertDatumShift);
    shift->parameters(p);
    OmbRef<OmbGeodeticDatum> datum(new OmbGeodeticDatum(ellipsoid, OmbPrimeMeridian::greenwich(), shift));
    datum->name(OmbString(name));
    return datum;
}

inline OmbRef<OmbGeodeticDatum> osgb36() {
    return helmertDatum(OmbEllipsoid::airy1830(), osgb36Parameters(), "OSGB36");
}
