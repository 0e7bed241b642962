// The predefined coordinate systems and the factories that find them.
#include "crscatalogue.h"

#include <oecore/core/exception.h>
#include <oecore/core/runtime.h>
#include <oecore/crs/crs.h>
#include <oecore/crs/projections/identity.h>

#include <cmath>
#include <cstdlib>
#include <string>

namespace {

struct Predefined {
    OmbRef<OmbCrs> wgs84LongLat, screen, nonGeoreferenced, sweref99Tm, sweref99_2_5gonW, mercatorEllipsoid, mercatorWeb,
        upsNorth, upsSouth, etrsLcc;
    OmbRef<OmbCrs> utm[2][60];
};
Predefined predefined;

OmbRef<OmbCrs> make(const char* name, const OmbRef<OmbProjection>& projection, const char* authority = "",
                    const char* code = "") {
    OmbRef<OmbCrs> crs(new OmbCrs(OmbString(authority), OmbString(code), projection, OmbGeodeticDatum::wgs84()));
    crs->name(OmbString(name));
    return crs;
}

// Registered as "Crs." + its name.
OmbRef<OmbCrs> registered(OmbRef<OmbCrs> crs) {
    OmbRuntime::registerPredefined(OmbString::literal("Crs.") + crs->name(), OmbRef<OmbEngineObject>(crs));
    return crs;
}

// A code as a number; 0 when it is none.
int codeNumber(const OmbString& code) {
    const std::string digits(code);
    char* end = nullptr;
    const long value = std::strtol(digits.c_str(), &end, 10);
    return end != digits.c_str() && *end == '\0' && value > 0 && value < 1000000 ? int(value) : 0;
}

// NAD27 with the catalogue's shift for the contiguous United States (EPSG
// 1173), the one generally useful for "crs:27" data.
OmbRef<OmbGeodeticDatum> nad27ContiguousUs() {
    const OmbRef<OmbGeodeticDatum> catalogued =
        Omb_crsFromCatalogue(OmbString::literal("epsg"), 4267, OmbDatumShiftChoice::Lenient)->geodeticDatum();
    OmbRef<OmbDatumShiftInfo> info(new OmbDatumShiftInfo);
    info->authority = OmbString::literal("epsg");
    info->authorityCode = OmbString::literal("1173");
    OmbRef<OmbGeodeticDatum> datum(
        new OmbGeodeticDatum(catalogued->ellipsoid(), catalogued->primeMeridian(), OmbDatumShift::fromInfo(info)));
    datum->name(catalogued->name());
    datum->authority(catalogued->authority());
    datum->authorityCode(catalogued->authorityCode());
    return datum;
}

OmbRef<OmbCrs> longLatOn(const char* name, const OmbRef<OmbGeodeticDatum>& datum, const char* code) {
    OmbRef<OmbCrs> crs(new OmbCrs(OmbString::literal("crs"), OmbString(code), OmbProjection::longLat(), datum));
    crs->name(OmbString(name));
    return crs;
}

[[maybe_unused]] const bool registeredClass =
    (OmbRuntime::registerPredefinedClass(OmbRuntime::PredefinedClass::Crs, OmbCrs::createPredefined,
                                         OmbCrs::destroyPredefined),
     true);

}  // namespace

void OmbCrs::createPredefined() {
    Predefined& p = predefined;
    p.wgs84LongLat = registered(make("Wgs84LongLat", OmbProjection::longLat(), "epsg", "4326"));
    p.screen = registered(make("ScreenCoordinateSystem", OmbProjection::screenProjection()));
    p.nonGeoreferenced =
        registered(make("NonGeoreferenced", OmbRef<OmbProjection>(new OmbRectangularProjection), "ombravel", "51003"));
    p.sweref99Tm = make("SWEREF99TM", OmbProjection::utm(33, OmbUTMHemisphere::North), "epsg", "3006");
    p.sweref99_2_5gonW = make("SWEREF99_2_5gonW", OmbProjection::tm2_5gonWSweref99(), "epsg", "3847");
    p.mercatorEllipsoid =
        registered(make("Wgs84MercatorEllipsoid", OmbProjection::mercator1SPEllipsoid(), "epsg", "3395"));
    p.mercatorWeb = registered(make("Wgs84MercatorWeb", OmbProjection::mercator1SPWeb(), "epsg", "3857"));
    p.upsNorth = registered(make("Wgs84UpsNorth", OmbProjection::upsNorth(), "epsg", "5041"));
    p.upsSouth = registered(make("Wgs84UpsSouth", OmbProjection::upsSouth(), "epsg", "5042"));
    p.etrsLcc = registered(make("EtrsLcc", OmbProjection::europeConformal2001(), "epsg", "3034"));
    for (int zone = 1; zone <= 60; ++zone)
        for (const OmbUTMHemisphere hemisphere : {OmbUTMHemisphere::North, OmbUTMHemisphere::South}) {
            const OmbRef<OmbProjection> utm = OmbProjection::utm(zone, hemisphere);
            const int code = (hemisphere == OmbUTMHemisphere::North ? 32600 : 32700) + zone;
            const std::string name = "Wgs84" + std::string(utm->name());
            p.utm[int(hemisphere)][zone - 1] =
                registered(make(name.c_str(), utm, "epsg", std::to_string(code).c_str()));
        }
}

void OmbCrs::destroyPredefined() { predefined = Predefined(); }

const OmbRef<OmbCrs>& OmbCrs::wgs84LongLat() { return predefined.wgs84LongLat; }
const OmbRef<OmbCrs>& OmbCrs::screenCoordinateSystem() { return predefined.screen; }
const OmbRef<OmbCrs>& OmbCrs::nonGeoreferenced() { return predefined.nonGeoreferenced; }
const OmbRef<OmbCrs>& OmbCrs::SWEREF99TM() { return predefined.sweref99Tm; }
const OmbRef<OmbCrs>& OmbCrs::SWEREF99_2_5gonW() { return predefined.sweref99_2_5gonW; }
const OmbRef<OmbCrs>& OmbCrs::wgs84MercatorEllipsoid() { return predefined.mercatorEllipsoid; }
const OmbRef<OmbCrs>& OmbCrs::wgs84MercatorWeb() { return predefined.mercatorWeb; }
const OmbRef<OmbCrs>& OmbCrs::wgs84UpsNorth() { return predefined.upsNorth; }
const OmbRef<OmbCrs>& OmbCrs::wgs84UpsSouth() { return predefined.upsSouth; }
const OmbRef<OmbCrs>& OmbCrs::etrsLcc() { return predefined.etrsLcc; }

const OmbRef<OmbCrs>& OmbCrs::wgs84Utm(int zone, OmbUTMHemisphere hemisphere) {
    if (zone < 1 || zone > 60) OMB_THROW(RangeError, "zone", "wgs84Utm( zone, hemisphere)", "1, 2, 3, ..., or 60");
    return predefined.utm[int(hemisphere)][zone - 1];
}

const OmbRef<OmbCrs>& OmbCrs::fromUtmProjectionForPoint(const OmbPoint& lola) {
    const double lon = lola.x - std::floor((lola.x + 180) / 360) * 360;
    const int zone = std::clamp(int(std::floor((lon + 180) / 6)) + 1, 1, 60);
    return wgs84Utm(zone, lola.y < 0 ? OmbUTMHemisphere::South : OmbUTMHemisphere::North);
}

OmbRef<OmbCrs> OmbCrs::findPredefinedInstance(int code) {
    if (code >= 32601 && code <= 32660) return wgs84Utm(code - 32600, OmbUTMHemisphere::North);
    if (code >= 32701 && code <= 32760) return wgs84Utm(code - 32700, OmbUTMHemisphere::South);
    switch (code) {
        case 4326: return predefined.wgs84LongLat;
        case 3006: return predefined.sweref99Tm;
        case 3847: return predefined.sweref99_2_5gonW;
        case 3395: return predefined.mercatorEllipsoid;
        case 3857: return predefined.mercatorWeb;
        case 3034: return predefined.etrsLcc;
        case 5041:
        case 32661: return predefined.upsNorth;
        case 5042:
        case 32761: return predefined.upsSouth;
        default: return {};
    }
}

OmbRef<OmbCrs> OmbCrs::fromAuthorityAndCode(const OmbString& authority, const OmbString& code,
                                            OmbDatumShiftChoice choice) {
    const OmbString kind = authority.toLower();
    const int number = codeNumber(code);
    if (OmbRef<OmbCrs> sjtsk = Omb_sjtskCrs(kind, number)) return sjtsk;
    if (kind == OmbString::literal("epsg")) {
        if (!reasonableEpsgCode(number))
            OMB_THROW(RangeError, "authorityCode", "Crs.FromAuthorityAndCode( epsg, authorityCode)",
                      "between 2000 and 5999 or between 7000 and 7999 or between 20000 and 32767.");
        if (OmbRef<OmbCrs> known = findPredefinedInstance(number)) return known;
        return Omb_crsFromCatalogue(kind, number, choice);
    }
    if (kind == OmbString::literal("crs")) {
        if (number == 84) return longLatOn("Crs84LongLat", OmbGeodeticDatum::wgs84(), "84");
        if (number == 83) return longLatOn("Crs83LongLat", OmbGeodeticDatum::wgs84(), "83");
        if (number == 27) {
            if (choice == OmbDatumShiftChoice::Conservative) OMB_THROW(NoDatumShiftForNad27);
            return longLatOn("Crs27LongLat", nad27ContiguousUs(), "27");
        }
        OMB_THROW(RangeError, "authorityCode", "Crs.FromAuthorityAndCode( \"crs\", authorityCode)", "27, 83 or 84.");
    }
    if (kind == OmbString::literal("esri")) {
        if (!reasonableEsriCode(number))
            OMB_THROW(RangeError, "authorityCode", "Crs.FromAuthorityAndCode( \"esri\", authorityCode)",
                      "a five-digit number starting with 37, 53, 54 or 65, or a six-digit number starting with 102, "
                      "103 or 104.");
        return Omb_crsFromCatalogue(kind, number, choice);
    }
    OMB_THROW(UnrecognizedAuthority, authority, code);
}

OmbRef<OmbCrs> OmbCrs::fromWellKnownText(const OmbString& wkt, OmbWellKnownTextFlavor flavor,
                                         OmbDatumShiftChoice choice) {
    if (flavor != OmbWellKnownTextFlavor::OgrWellKnownText && flavor != OmbWellKnownTextFlavor::EsriWellKnownText)
        OMB_THROW(RangeError, "flavor", "Crs.fromWellKnownText(wkt, flavor, datumShiftChoice)",
                  "OgrWellKnownText or EsriWellKnownText");
    return Omb_crsFromWellKnownText(wkt, flavor == OmbWellKnownTextFlavor::EsriWellKnownText, choice);
}
