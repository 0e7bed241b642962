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
// The catalogue's well-known text of an EPSG code ("crs" 84 and 83 as
// EPSG 4326); empty when the catalogue lacks the code.
OmbString Omb_catalogueWellKnownText(int epsgCode, bool pretty, bool esri);
// A system of the S-JTSK family (EPSG 2065, 5221, 5224, 5225, 5513 to 5516,
// ESRI 102065 to 102067; authority in lower case), or null.
OmbRef<OmbCrs> Omb_sjtskCrs(const OmbString& authority, int code);
// The well-known text of any system GDAL has the methods for, built from
// its parameters; empty for the others (rotated, recentred, polynomial,
// dynamic local, Miller, angular and south-west Krovak planes).
OmbString Omb_wellKnownTextOf(const OmbCrs& crs, bool pretty, bool esri);
