// Coordinate systems read from the catalogues and from well-known text
// through GDAL, which stays private to the library.
#pragma once

#include <oecore/crs/crs.h>

// The system of an EPSG or ESRI code (not the predefined ones, which the
// caller has looked for): OmbXEpsgCrsCodeNotFound or OmbXEsriCodeFailed when
// the catalogue has no such code, OmbXUnsupportedProjectionType for a method
// we have no class for, and the "no datum shift" error when the datum has
// no known shift and the choice is Conservative.
OmbRef<OmbCrs> Omb_crsFromCatalogue(const OmbString& authority, int code, OmbDatumShiftChoice choice);
// The system of an OGC (WKT1 or WKT2) or ESRI well-known text;
// OmbXGDALFailedToReadReferenceSystem when GDAL cannot read it.
OmbRef<OmbCrs> Omb_crsFromWellKnownText(const OmbString& wkt, bool esri, OmbDatumShiftChoice choice);
// The catalogue's best Helmert-family transformation from a geographic
// system (EPSG code) to WGS 84; null when it has none.
OmbRef<OmbDatumShift> Omb_catalogueShiftToWgs84(int geographicCode);
