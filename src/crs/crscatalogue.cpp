// Coordinate systems from the EPSG and ESRI catalogues and from well-known
// text, through GDAL's spatial references: the definition's projection
// method becomes one of our projection classes, its datum ours with the
// shift to WGS 84 the catalogue knows (or the datum-shift choice allows).
#include "crscatalogue.h"

#include <oecore/core/exception.h>
#include <oecore/core/stringbuilder.h>
#include <oecore/crs/projections/azimuthal.h>
#include <oecore/crs/projections/equidistantcylindrical.h>
#include <oecore/crs/projections/identity.h>
#include <oecore/crs/projections/krovak.h>
#include <oecore/crs/projections/lambertconformalconic.h>
#include <oecore/crs/projections/mercator.h>
#include <oecore/crs/projections/orthographic.h>
#include <oecore/crs/projections/projlibprojections.h>
#include <oecore/crs/projections/rosenmund.h>
#include <oecore/crs/projections/transversemercator.h>
#include <oecore/crs/projections/wrappedprojections.h>

#include <cpl_error.h>
#include <ogr_spatialref.h>

#include <algorithm>
#include <cctype>
#include <cmath>
#include <cstring>
#include <string>

namespace {

// Lower case without spaces, underscores, hyphens and parentheses, so that
// "WGS_1984", "WGS 84" and "wgs84" compare alike.
std::string squeezed(const char* name) {
    std::string out;
    for (const char* c = name ? name : ""; *c; ++c)
        if (std::isalnum(static_cast<unsigned char>(*c))) out += char(std::tolower(static_cast<unsigned char>(*c)));
    return out;
}

bool startsWith(const std::string& text, const char* prefix) { return text.rfind(prefix, 0) == 0; }

// A datum tied to WGS 84 by an identity shift that says why.
OmbRef<OmbDatumShift> identityShift(const char* name, const char* remarks) {
    OmbRef<OmbDatumShiftInfo> info(new OmbDatumShiftInfo);
    info->name(OmbString(name));
    info->remarks = OmbString(remarks);
    OmbRef<OmbIdentityDatumShift> shift(new OmbIdentityDatumShift);
    shift->info(info);
    return OmbRef<OmbDatumShift>(shift);
}

// The shift for a datum the catalogue has no shift for, by choice.
OmbRef<OmbDatumShift> assumedShift(bool greenwich, bool sphere) {
    OmbRef<OmbDatumShiftInfo> info(new OmbDatumShiftInfo);
    info->name(OmbString(greenwich ? "Assume identical to Wgs84."
                                   : "Assume identical to Wgs84 after changing prime meridian."));
    info->authority = OmbString::literal("ombravel");
    info->authorityCode = OmbString(greenwich ? "51048" : "51049");
    info->remarks = OmbString(sphere ? "The latitudes are taken as spherical latitudes of meteorological data on the "
                                       "WGS 84 ellipsoid; errors may reach 20 km."
                                     : "Unknown accuracy, but errors are probably less than 1000 m.");
    info->scope = OmbString::literal("Ombravel knows nothing about how this datum is related to Wgs84.");
    info->datumShiftChoice = OmbDatumShiftChoice::Lenient;
    OmbRef<OmbDatumShift> shift(greenwich ? static_cast<OmbDatumShift*>(new OmbIdentityDatumShift)
                                          : static_cast<OmbDatumShift*>(new OmbChangedPrimeMeridianDatumShift));
    shift->info(info);
    return shift;
}

// The shift a datum name stands for when it is WGS 84 itself or a frame
// that coincides with it within a metre; null otherwise.
OmbRef<OmbDatumShift> shiftForKnownName(const std::string& name) {
    const bool itrf = startsWith(name, "itrf19") || startsWith(name, "itrf20") ||
                      startsWith(name, "internationalterrestrialreferenceframe19") ||
                      startsWith(name, "internationalterrestrialreferenceframe20") ||
                      startsWith(name, "internationalterrestrialreferencesystem19") ||
                      startsWith(name, "internationalterrestrialreferencesystem20");
    if (itrf) return identityShift("The source datum is an ITRF variant.", "Same as Wgs84.");
    if (startsWith(name, "europeanterrestrialreferencesystem1989") || startsWith(name, "etrs1989") ||
        startsWith(name, "etrs89") || startsWith(name, "euref89"))
        return identityShift("ETRS89 taken as Wgs84.", "Same as Wgs84.");
    if (startsWith(name, "northamericandatum1983") || startsWith(name, "nad83"))
        return identityShift("NAD83 taken as Wgs84.",
                             "Accuracy 1 meter when transforming to Wgs84, but exact if transforming to NAD83(HARN).");
    return {};
}

bool isWgs84Name(const std::string& name) {
    return name == "wgs84" || name == "wgs1984" || name == "worldgeodeticsystem1984" || name == "dwgs1984" ||
           startsWith(name, "worldgeodeticsystem1984ensemble") || name == "wgs84ensemble";
}

OmbString text(double value) {
    OmbStringBuilder b;
    b << OmbFormat::real(value);
    return b.str();
}

class Converter {
public:
    Converter(OGRSpatialReference& srs, const OmbString& source, OmbDatumShiftChoice choice)
        : srs_(srs), source_(source), choice_(choice) {}

    OmbRef<OmbCrs> crs() {
        if (srs_.IsLocal()) return OmbCrs::nonGeoreferenced();
        if (!srs_.IsGeographic() && !srs_.IsProjected())
            OMB_THROW(UnsupportedCrsType, OmbString(srs_.GetName() ? srs_.GetName() : "?"), source_);
        const char* authority = srs_.GetAuthorityName(nullptr);
        const char* code = srs_.GetAuthorityCode(nullptr);
        if (authority && code && squeezed(authority) == "epsg")
            if (OmbRef<OmbCrs> known = OmbCrs::findPredefinedInstance(std::atoi(code))) return known;
        const OmbRef<OmbGeodeticDatum> datum = this->datum();
        const OmbRef<OmbProjection> projection = srs_.IsProjected() ? this->projection() : OmbProjection::longLat();
        OmbRef<OmbCrs> crs(new OmbCrs(OmbString(authority ? squeezed(authority) : std::string()),
                                      OmbString(code ? code : ""), projection, datum));
        crs->name(OmbString(srs_.GetName() && *srs_.GetName() ? srs_.GetName() : "__GDAL_generated_crs"));
        return crs;
    }

private:
    double parameter(const char* name, double fallback = 0) const { return srs_.GetNormProjParm(name, fallback); }

    OmbRef<OmbLengthUnit> lengthUnit() const {
        const double metres = srs_.GetLinearUnits(static_cast<const char**>(nullptr));
        for (const OmbRef<OmbLengthUnit>& unit :
             {OmbLengthUnit::meter(), OmbLengthUnit::foot(), OmbLengthUnit::usSurveyFoot()})
            if (unit && std::fabs(unit->inMeters() - metres) < 1e-12) return unit;
        return OmbRef<OmbLengthUnit>(new OmbLengthUnit(metres));
    }

    template <class P>
    OmbRef<OmbProjection> named(P* projection, const char* prefix) const {
        const char* code = srs_.GetAuthorityCode(nullptr);
        projection->name(OmbString(std::string(prefix) + (code ? code : "0")));
        if (!projection->configuredLengthUnit()) projection->lengthUnit(lengthUnit());
        return OmbRef<OmbProjection>(projection);
    }

    OmbRef<OmbProjection> projection() const;
    OmbRef<OmbGeodeticDatum> datum();
    // 0 for a sphere.
    double inverseFlatteningOf() const { return srs_.GetInvFlattening(); }
    // Whether the first axis points east or north (not south or west).
    bool northOriented() const {
        OGRAxisOrientation orientation = OAO_East;
        srs_.GetAxis("PROJCS", 0, &orientation);
        return orientation == OAO_East || orientation == OAO_North || orientation == OAO_Other;
    }

    OGRSpatialReference& srs_;
    OmbString source_;
    OmbDatumShiftChoice choice_;
};

OmbRef<OmbGeodeticDatum> Converter::datum() {
    const std::string datumName = squeezed(srs_.GetAttrValue("DATUM"));
    const double semiMajor = srs_.GetSemiMajor(), inverseFlattening = srs_.GetInvFlattening();
    const double primeMeridian = srs_.GetPrimeMeridian(static_cast<const char**>(nullptr));
    const OmbRef<OmbEllipsoid> ellipsoid(new OmbEllipsoid(semiMajor, inverseFlattening));
    const bool greenwich = primeMeridian == 0;
    if (greenwich && isWgs84Name(datumName) && ellipsoid->equivalent(*OmbEllipsoid::wgs84()))
        return OmbGeodeticDatum::wgs84();
    OmbRef<OmbDatumShift> shift = greenwich ? shiftForKnownName(datumName) : OmbRef<OmbDatumShift>();
    if (!shift) {
        // The definition's TOWGS84, or the one GDAL can guess when the
        // catalogue has a single Helmert transformation, or the best of
        // several found through PROJ.
        double towgs84[7] = {};
        const bool hasTowgs84 = srs_.GetTOWGS84(towgs84) == OGRERR_NONE ||
                                (srs_.AddGuessedTOWGS84() == OGRERR_NONE && srs_.GetTOWGS84(towgs84) == OGRERR_NONE);
        const char* geographic = srs_.GetAuthorityCode("GEOGCS");
        if (hasTowgs84) {
            // GDAL's TOWGS84 rotates in the position-vector sense.
            OmbHelmertDatumShift::Parameters p;
            p.dx = towgs84[0], p.dy = towgs84[1], p.dz = towgs84[2];
            p.rx = towgs84[3], p.ry = towgs84[4], p.rz = towgs84[5];
            p.scaleDifference = towgs84[6];
            OmbRef<OmbHelmertDatumShift> helmert(new OmbHelmertDatumShift);
            helmert->parameters(p);
            shift = OmbRef<OmbDatumShift>(helmert);
        } else if (geographic) {
            shift = Omb_catalogueShiftToWgs84(std::atoi(geographic));
        }
    }
    const char* datumTitle = srs_.GetAttrValue("DATUM");
    if (!shift) {
        if (choice_ == OmbDatumShiftChoice::Conservative)
            OMB_THROW(GenericException, "Cannot construct the Crs " + source_ +
                                            ", because no datum shift for "
                                            "GeodeticDatum " +
                                            OmbString(datumTitle ? datumTitle : "?") +
                                            " was given, and Ombravel does not know any generally useful datum "
                                            "shift, and the DatumShiftChoice was Conservative");
        shift = assumedShift(greenwich, inverseFlattening == 0);
    }
    OmbRef<OmbPrimeMeridian> meridian(new OmbPrimeMeridian(primeMeridian));
    if (!greenwich && !dynamic_cast<OmbChangedPrimeMeridianDatumShift*>(shift.get())) {
        // Longitudes count from the datum's own meridian; the catalogue's
        // shift applies to Greenwich longitudes on the same ellipsoid.
        OmbRef<OmbGeodeticDatum> onGreenwich(new OmbGeodeticDatum(ellipsoid, OmbPrimeMeridian::greenwich(), shift));
        onGreenwich->name(OmbString(std::string(datumTitle ? datumTitle : "datum") + " (Greenwich)"));
        shift = OmbRef<OmbDatumShift>(new OmbChangedPrimeMeridianDatumShift);
        shift->knownDatum(onGreenwich);
    }
    OmbRef<OmbGeodeticDatum> datum(new OmbGeodeticDatum(ellipsoid, meridian, shift));
    datum->name(OmbString(datumTitle ? datumTitle : "with unknown name"));
    if (const char* code = srs_.GetAuthorityCode("DATUM")) {
        datum->authority(OmbString::literal("epsg"));
        datum->authorityCode(OmbString(code));
    }
    return datum;
}

OmbRef<OmbProjection> Converter::projection() const {
    const std::string method = srs_.GetAttrValue("PROJECTION") ? srs_.GetAttrValue("PROJECTION") : "";
    const double fe = parameter(SRS_PP_FALSE_EASTING), fn = parameter(SRS_PP_FALSE_NORTHING);
    const double k = parameter(SRS_PP_SCALE_FACTOR, 1.0);
    const double lon0 = parameter(SRS_PP_CENTRAL_MERIDIAN), lat0 = parameter(SRS_PP_LATITUDE_OF_ORIGIN);
    const double lonC = parameter(SRS_PP_LONGITUDE_OF_CENTER), latC = parameter(SRS_PP_LATITUDE_OF_CENTER);
    const double sp1 = parameter(SRS_PP_STANDARD_PARALLEL_1), sp2 = parameter(SRS_PP_STANDARD_PARALLEL_2);
    const OmbRef<OmbLengthUnit> unit = lengthUnit();
    // False easting and northing in projected units: GDAL's normalised
    // parameters are in metres.
    const double feUnits = fe / unit->inMeters(), fnUnits = fn / unit->inMeters();
    const auto origin = [&](OmbProjection& p, double lon, double lat) {
        p.centralLongitude(lon), p.centralLatitude(lat), p.falseEasting(feUnits), p.falseNorthing(fnUnits);
        p.lengthUnit(unit);
    };

    if (method == SRS_PT_TRANSVERSE_MERCATOR || method == "Transverse_Mercator_Complex" ||
        method == SRS_PT_TRANSVERSE_MERCATOR_SOUTH_ORIENTED) {
        auto* tm = new OmbTransverseMercator(lon0, lat0, feUnits, fnUnits, k, unit);
        if (method != SRS_PT_TRANSVERSE_MERCATOR_SOUTH_ORIENTED) return named(tm, "TMerc_EPSG_");
        // Westing and southing: the grid turned half round its origin.
        return named(new OmbRotatedProjection(OmbRef<OmbProjection>(tm), 180), "TMerc_EPSG_");
    }
    if (method == SRS_PT_MERCATOR_1SP || method == SRS_PT_MERCATOR_2SP) {
        auto* m = new OmbMercator;
        origin(*m, lon0, 0);
        m->shape(inverseFlatteningOf() == 0 ? OmbEarthShape::Sphere : OmbEarthShape::Ellipsoid);
        m->sphereRadiusSource(OmbString::literal("#equatorialRadius"));
        if (method == SRS_PT_MERCATOR_2SP)
            m->standardParallel(sp1);
        else
            m->scaleFactor(k);
        return named(m, "Merc_EPSG_");
    }
    if (method == SRS_PT_LAMBERT_CONFORMAL_CONIC_1SP)
        return named(new OmbLambertConformalConic2SP(lon0, lat0, lat0, lat0, feUnits, fnUnits, k), "LCC_EPSG_");
    if (method == SRS_PT_LAMBERT_CONFORMAL_CONIC_2SP)
        return named(new OmbLambertConformalConic2SP(lon0, lat0, sp1, sp2, feUnits, fnUnits), "LCC_EPSG_");
    if (method == SRS_PT_ALBERS_CONIC_EQUAL_AREA) {
        auto* a = new OmbAlbersEqualAreaConic;
        origin(*a, lonC, latC);
        a->standardParallel1(sp1), a->standardParallel2(sp2);
        return named(a, "Albers_EPSG_");
    }
    if (method == SRS_PT_LAMBERT_AZIMUTHAL_EQUAL_AREA) {
        auto* a = new OmbAzimuthalEqualArea;
        origin(*a, lonC, latC);
        if (inverseFlatteningOf() == 0) a->shape(OmbEarthShape::Sphere);
        return named(a, "AzimuthalEqualArea_EPSG_");
    }
    if (method == SRS_PT_AZIMUTHAL_EQUIDISTANT) {
        auto* a = new OmbAzimuthalEquidistant;
        origin(*a, lonC, latC);
        if (inverseFlatteningOf() == 0) a->shape(OmbEarthShape::Sphere);
        return named(a, "AzimuthalEqudistant_EPSG_");
    }
    if (method == SRS_PT_CASSINI_SOLDNER) {
        auto* c = new OmbCassiniSoldner;
        origin(*c, lon0, lat0);
        return named(c, "CassiniSoldner_EPSG_");
    }
    if (method == SRS_PT_HOTINE_OBLIQUE_MERCATOR || method == SRS_PT_HOTINE_OBLIQUE_MERCATOR_AZIMUTH_CENTER) {
        auto* h = new OmbHotineObliqueMercator;
        origin(*h, lonC, latC);
        h->azimuth(parameter(SRS_PP_AZIMUTH));
        h->rectifiedGridAngle(parameter(SRS_PP_RECTIFIED_GRID_ANGLE, parameter(SRS_PP_AZIMUTH)));
        h->scaleFactor(k);
        h->trueOrigin(method == SRS_PT_HOTINE_OBLIQUE_MERCATOR
                          ? OmbHotineObliqueMercatorTrueOrigin::HotineNaturalOriginNearEquator
                          : OmbHotineObliqueMercatorTrueOrigin::CentralPoint);
        return named(h, "Hotine_EPSG_");
    }
    if (method == SRS_PT_LABORDE_OBLIQUE_MERCATOR) {
        auto* l = new OmbLabordeObliqueMercator;
        origin(*l, lonC, latC);
        l->azimuth(parameter(SRS_PP_AZIMUTH));
        l->scaleFactor(k);
        return named(l, "Laborde_EPSG_");
    }
    if (method == SRS_PT_SWISS_OBLIQUE_CYLINDRICAL) {
        auto* r = new OmbRosenmundObliqueMercator;
        origin(*r, lonC, latC);
        return named(r, "Rosenmund_EPSG_");
    }
    if (method == SRS_PT_KROVAK) {
        auto* kr = new OmbKrovak;
        origin(*kr, lonC, latC);
        kr->colatitudeConeAxis(parameter(SRS_PP_AZIMUTH, 30.28813975277778));
        kr->pseudoStandardParallel(parameter(SRS_PP_PSEUDO_STD_PARALLEL_1, 78.5));
        kr->scaleFactor(k);
        kr->northOriented(northOriented());
        return named(kr, "Krovak_EPSG_");
    }
    if (method == SRS_PT_ORTHOGRAPHIC) return named(new OmbOrthographic(lon0, lat0, feUnits, fnUnits), "Ortho_EPSG_");
    if (method == SRS_PT_STEREOGRAPHIC || method == SRS_PT_OBLIQUE_STEREOGRAPHIC) {
        const auto variant = method == SRS_PT_OBLIQUE_STEREOGRAPHIC ? OmbStereographicVariant::International
                                                                    : OmbStereographicVariant::UnitedStates;
        return named(new OmbStereographic(lon0, lat0, k, variant, feUnits, fnUnits), "Stereogr_EPSG_");
    }
    if (method == SRS_PT_POLAR_STEREOGRAPHIC) {
        auto* p = new OmbPolarStereographic(lat0 > 0);
        origin(*p, lon0, lat0 > 0 ? 90 : -90);
        if (std::fabs(lat0) < 90)
            p->standardParallel(lat0);
        else
            p->scaleFactor(k);
        return named(p, "Stereogr_EPSG_");
    }
    if (method == SRS_PT_NEW_ZEALAND_MAP_GRID) return named(new OmbNewZealandMapGrid, "NZMG_EPSG_");
    if (method == SRS_PT_EQUIRECTANGULAR) {
        auto* e = new OmbEquidistantCylindrical;
        origin(*e, lon0, lat0);
        e->standardParallel(sp1);
        if (inverseFlatteningOf() == 0) e->shape(OmbEarthShape::Sphere);
        return named(e, "EquidistantCylindrical_EPSG_");
    }
    OMB_THROW(UnsupportedProjectionType, OmbString(method));
}

// GDAL's own error reports stay quiet while it reads for us: failures
// become our exceptions.
class QuietGdal {
public:
    QuietGdal() { CPLPushErrorHandler(CPLQuietErrorHandler); }
    ~QuietGdal() { CPLPopErrorHandler(); }
    QuietGdal(const QuietGdal&) = delete;
    QuietGdal& operator=(const QuietGdal&) = delete;
};

}  // namespace

OmbRef<OmbCrs> Omb_crsFromCatalogue(const OmbString& authority, int code, OmbDatumShiftChoice choice) {
    const QuietGdal quiet;
    OGRSpatialReference srs;
    OmbStringBuilder definition;
    definition << authority.toUpper() << ":" << code;
    const OGRErr error = squeezed(std::string(authority).c_str()) == "epsg"
                             ? srs.importFromEPSG(code)
                             : srs.SetFromUserInput(std::string(definition.str()).c_str());
    if (error != OGRERR_NONE) {
        if (squeezed(std::string(authority).c_str()) == "epsg") OMB_THROW(EpsgCrsCodeNotFound, text(code));
        OMB_THROW(EsriCodeFailed, text(code), OmbString::literal("not in the catalogue"));
    }
    OmbRef<OmbCrs> crs = Converter(srs, definition.str(), choice).crs();
    return crs;
}

OmbRef<OmbCrs> Omb_crsFromWellKnownText(const OmbString& wkt, bool esri, OmbDatumShiftChoice choice) {
    const QuietGdal quiet;
    OGRSpatialReference srs;
    const std::string text(wkt);
    OGRErr error;
    if (esri) {
        char* lines[] = {const_cast<char*>(text.c_str()), nullptr};
        error = srs.importFromESRI(lines);
    } else {
        error = srs.importFromWkt(text.c_str());
    }
    if (error != OGRERR_NONE)
        OMB_THROW(GDALFailedToReadReferenceSystem, wkt, OmbString::literal("not well-known text GDAL can read"));
    return Converter(srs, OmbString::literal("from well-known text"), choice).crs();
}

OmbString Omb_catalogueWellKnownText(int epsgCode, bool pretty, bool esri) {
    const QuietGdal quiet;
    OGRSpatialReference srs;
    if (srs.importFromEPSG(epsgCode) != OGRERR_NONE) return {};
    if (esri) srs.morphToESRI();
    const char* options[] = {pretty ? "MULTILINE=YES" : "MULTILINE=NO", esri ? "FORMAT=WKT1_ESRI" : "FORMAT=WKT1",
                             nullptr};
    char* text = nullptr;
    if (srs.exportToWkt(&text, options) != OGRERR_NONE || !text) {
        CPLFree(text);
        return {};
    }
    const OmbString wkt(text);
    CPLFree(text);
    return wkt;
}

namespace {

// GDAL's TOWGS84 for a datum whose shift is a Helmert shift to WGS 84.
void addTowgs84(OGRSpatialReference& srs, const OmbGeodeticDatum& datum) {
    const auto* helmert = dynamic_cast<const OmbHelmertDatumShift*>(datum.datumShift().get());
    if (!helmert || !helmert->knownDatum() || !helmert->knownDatum()->isWgs84Equivalent()) return;
    OmbHelmertDatumShift::Parameters p = helmert->parameters();
    double sign = p.convention == OmbRotationSignConvention::CoordinateFrameRotation ? -1 : 1;
    if (p.direction == OmbDatumShiftDirection::FromKnownDatum) {
        // TOWGS84 runs towards WGS 84: the small-angle inverse.
        p.dx = -p.dx, p.dy = -p.dy, p.dz = -p.dz, p.scaleDifference = -p.scaleDifference;
        sign = -sign;
    }
    srs.SetTOWGS84(p.dx, p.dy, p.dz, sign * p.rx, sign * p.ry, sign * p.rz, p.scaleDifference);
}

// The projection's definition in GDAL's terms; false for a class GDAL has
// no method for.
bool setProjection(OGRSpatialReference& srs, const OmbProjection& p) {
    const double lon = p.centralLongitude(), lat = p.centralLatitude(), fe = p.falseEasting(), fn = p.falseNorthing(),
                 k = p.scaleFactor();
    if (dynamic_cast<const OmbTransverseMercator*>(&p) || dynamic_cast<const OmbUTM*>(&p))
        return srs.SetTM(lat, lon, k, fe, fn) == OGRERR_NONE;
    if (dynamic_cast<const OmbMiller*>(&p)) return false;
    if (const auto* m = dynamic_cast<const OmbMercator*>(&p))
        return (m->standardParallel() != 0 ? srs.SetMercator2SP(m->standardParallel(), 0, lon, fe, fn)
                                           : srs.SetMercator(0, lon, k, fe, fn)) == OGRERR_NONE;
    if (const auto* l = dynamic_cast<const OmbLambertConformalConic2SP*>(&p))
        return (l->standardParallel1() == l->standardParallel2()
                    ? srs.SetLCC1SP(lat, lon, k, fe, fn)
                    : srs.SetLCC(l->standardParallel1(), l->standardParallel2(), lat, lon, fe, fn)) == OGRERR_NONE;
    if (const auto* a = dynamic_cast<const OmbAlbersEqualAreaConic*>(&p))
        return srs.SetACEA(a->standardParallel1(), a->standardParallel2(), lat, lon, fe, fn) == OGRERR_NONE;
    if (dynamic_cast<const OmbAzimuthalEqualArea*>(&p)) return srs.SetLAEA(lat, lon, fe, fn) == OGRERR_NONE;
    if (dynamic_cast<const OmbAzimuthalEquidistant*>(&p)) return srs.SetAE(lat, lon, fe, fn) == OGRERR_NONE;
    if (dynamic_cast<const OmbCassiniSoldner*>(&p)) return srs.SetCS(lat, lon, fe, fn) == OGRERR_NONE;
    if (const auto* h = dynamic_cast<const OmbHotineObliqueMercator*>(&p))
        return (h->trueOrigin() == OmbHotineObliqueMercatorTrueOrigin::CentralPoint
                    ? srs.SetHOMAC(lat, lon, h->azimuth(), h->rectifiedGridAngle(), k, fe, fn)
                    : srs.SetHOM(lat, lon, h->azimuth(), h->rectifiedGridAngle(), k, fe, fn)) == OGRERR_NONE;
    if (const auto* l = dynamic_cast<const OmbLabordeObliqueMercator*>(&p))
        return srs.SetLOM(lat, lon, l->azimuth(), k, fe, fn) == OGRERR_NONE;
    if (dynamic_cast<const OmbRosenmundObliqueMercator*>(&p)) return srs.SetSOC(lat, lon, fe, fn) == OGRERR_NONE;
    if (const auto* kr = dynamic_cast<const OmbKrovak*>(&p))
        return kr->northOriented() && srs.SetKrovak(lat, lon, kr->colatitudeConeAxis(), kr->pseudoStandardParallel(), k,
                                                    fe, fn) == OGRERR_NONE;
    if (dynamic_cast<const OmbOrthographic*>(&p)) return srs.SetOrthographic(lat, lon, fe, fn) == OGRERR_NONE;
    if (const auto* st = dynamic_cast<const OmbStereographic*>(&p))
        return (st->variant() == OmbStereographicVariant::International
                    ? srs.SetOS(lat, lon, k, fe, fn)
                    : srs.SetStereographic(lat, lon, k, fe, fn)) == OGRERR_NONE;
    if (const auto* ps = dynamic_cast<const OmbPolarStereographic*>(&p))
        return (ps->standardParallel() != 0 ? srs.SetPS(ps->standardParallel(), lon, 1, fe, fn)
                                            : srs.SetPS(ps->northPole() ? 90 : -90, lon, k, fe, fn)) == OGRERR_NONE;
    if (const auto* e = dynamic_cast<const OmbEquidistantCylindrical*>(&p))
        return srs.SetEquirectangular2(lat, lon, e->standardParallel(), fe, fn) == OGRERR_NONE;
    if (dynamic_cast<const OmbNewZealandMapGrid*>(&p)) return srs.SetNZMG(-41, 173, 2510000, 6023150) == OGRERR_NONE;
    return false;
}

}  // namespace

OmbString Omb_wellKnownTextOf(const OmbCrs& crs, bool pretty, bool esri) {
    const QuietGdal quiet;
    OGRSpatialReference srs;
    const OmbProjection& projection = *crs.projection();
    const OmbGeodeticDatum& datum = *crs.geodeticDatum();
    const std::string name(crs.name().empty() ? OmbString::literal("with unknown name") : crs.name());
    if (!projection.georeferenced()) {
        srs.SetLocalCS(name.c_str());
    } else {
        const bool longLat = dynamic_cast<const OmbLoLa*>(&projection) != nullptr;
        if (!longLat) {
            srs.SetProjCS(name.c_str());
            const OmbLengthUnit& unit = *projection.lengthUnit();
            srs.SetLinearUnits(
                unit.inMeters() == 1 ? "metre" : (unit.name().empty() ? "unit" : std::string(unit.name()).c_str()),
                unit.inMeters());
            if (!setProjection(srs, projection)) return {};
        }
        const std::string datumName(datum.name().empty() ? OmbString::literal("unknown") : datum.name());
        const std::string geographic = longLat ? name : datumName;
        const std::string meridian = datum.primeMeridianDegrees() == 0 ? "Greenwich" : "Reference meridian";
        srs.SetGeogCS(geographic.c_str(), datumName.c_str(), "ellipsoid", datum.ellipsoid()->equatorialRadius(),
                      datum.ellipsoid()->inverseFlattening(), meridian.c_str(), datum.primeMeridianDegrees());
        addTowgs84(srs, datum);
    }
    if (esri) srs.morphToESRI();
    const char* options[] = {pretty ? "MULTILINE=YES" : "MULTILINE=NO", esri ? "FORMAT=WKT1_ESRI" : "FORMAT=WKT1",
                             nullptr};
    char* text = nullptr;
    const bool written = srs.exportToWkt(&text, options) == OGRERR_NONE && text;
    const OmbString wkt(written ? text : "");
    CPLFree(text);
    return wkt;
}
