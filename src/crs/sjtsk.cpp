// The S-JTSK family of the Czech Republic and Slovakia, built here rather
// than from the catalogue: both datums (S-JTSK and S-JTSK/05) with their
// shifts to WGS 84, on Greenwich or Ferro, under Krovak in either
// orientation.
#include "crscatalogue.h"

#include <oecore/crs/projections/krovak.h>

#include <string>

namespace {

struct Member {
    const char* authority;
    int code;
    const char* name;
    bool jtsk05;  // S-JTSK/05 rather than S-JTSK
    bool ferro;
    bool eastNorth;
};

constexpr Member members[] = {
    {"epsg", 2065, "S_JTSK_Ferro__Krovak", false, true, false},
    {"epsg", 5221, "S_JTSK_Ferro__Krovak_East_North", false, true, true},
    {"epsg", 5513, "S_JTSK_Krovak", false, false, false},
    {"epsg", 5514, "S_JTSK_Krovak_East_North", false, false, true},
    {"epsg", 5224, "S_JTSK_05_Ferro__Krovak", true, true, false},
    {"epsg", 5225, "S_JTSK_05_Ferro__Krovak_East_North", true, true, true},
    {"epsg", 5515, "S_JTSK_05__Krovak", true, false, false},
    {"epsg", 5516, "S_JTSK_05__Krovak_East_North", true, false, true},
    {"esri", 102065, "S_JTSK_Krovak", false, false, false},
    {"esri", 102066, "S_JTSK_Ferro_Krovak_East_North", false, true, true},
    {"esri", 102067, "S_JTSK_Krovak_East_North", false, false, true},
};

OmbRef<OmbDatumShift> shiftToWgs84(bool jtsk05) {
    OmbHelmertDatumShift::Parameters p;
    if (jtsk05) {
        p.dx = 572.213, p.dy = 85.334, p.dz = 461.94;
        p.rx = -4.9732, p.ry = -1.529, p.rz = -5.2484;
        p.scaleDifference = 3.5378;
        p.convention = OmbRotationSignConvention::CoordinateFrameRotation;
    } else {
        p.dx = 527.9, p.dy = 127.6, p.dz = 473.35;
        p.rx = 6.392, p.ry = 2.9925, p.rz = 4.682;
        p.scaleDifference = 1.78;
        p.convention = OmbRotationSignConvention::PositionVectorTransform;
    }
    OmbRef<OmbHelmertDatumShift> shift(new OmbHelmertDatumShift);
    shift->parameters(p);
    shift->name(OmbString(jtsk05 ? "S_JTSK_05_to_Wgs84" : "S_JTSK_to_Wgs84"));
    shift->authority(OmbString(jtsk05 ? "epsg" : "ombravel"));
    shift->authorityCode(OmbString(jtsk05 ? "5227" : "51055"));
    return OmbRef<OmbDatumShift>(shift);
}

OmbRef<OmbGeodeticDatum> datum(bool jtsk05, bool ferro) {
    OmbRef<OmbGeodeticDatum> greenwich(
        new OmbGeodeticDatum(OmbEllipsoid::bessel1841(), OmbPrimeMeridian::greenwich(), shiftToWgs84(jtsk05)));
    greenwich->name(OmbString(jtsk05 ? "S_JTSK_05" : "S_JTSK"));
    greenwich->authority(OmbString::literal("epsg"));
    greenwich->authorityCode(OmbString(jtsk05 ? "1052" : "6156"));
    if (!ferro) return greenwich;
    OmbRef<OmbDatumShift> meridian(new OmbChangedPrimeMeridianDatumShift);
    meridian->knownDatum(greenwich);
    OmbRef<OmbGeodeticDatum> onFerro(
        new OmbGeodeticDatum(OmbEllipsoid::bessel1841(), OmbPrimeMeridian::ferroRounded(), meridian));
    onFerro->name(OmbString(jtsk05 ? "S_JTSK_05_Ferro" : "S_JTSK_Ferro"));
    onFerro->authority(OmbString::literal("epsg"));
    onFerro->authorityCode(OmbString(jtsk05 ? "1055" : "6818"));
    return onFerro;
}

}  // namespace

OmbRef<OmbCrs> Omb_sjtskCrs(const OmbString& authority, int code) {
    for (const Member& m : members) {
        if (code != m.code || authority != OmbString(m.authority)) continue;
        OmbRef<OmbKrovak> krovak(new OmbKrovak);
        krovak->centralLatitude(49.5);
        // 24 deg 50' east of Greenwich is 42 deg 30' east of Ferro.
        krovak->centralLongitude(m.ferro ? 42.5 : 24.833333333333333);
        krovak->colatitudeConeAxis(30.28813972222222);
        krovak->pseudoStandardParallel(78.5);
        krovak->northOriented(m.eastNorth);
        krovak->name(OmbString(m.name));
        OmbRef<OmbCrs> crs(new OmbCrs(authority, OmbString(std::to_string(code)), OmbRef<OmbProjection>(krovak),
                                      datum(m.jtsk05, m.ferro)));
        crs->name(OmbString(m.name));
        return crs;
    }
    return {};
}
