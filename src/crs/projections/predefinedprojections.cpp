// The predefined projections ("Projections." + name) and the shared UTM
// zones.
#include <oecore/core/runtime.h>
#include <oecore/crs/projections/azimuthal.h>
#include <oecore/crs/projections/identity.h>
#include <oecore/crs/projections/lambertconformalconic.h>
#include <oecore/crs/projections/mercator.h>
#include <oecore/crs/projections/transversemercator.h>

#include <mutex>

namespace {

struct Predefined {
    OmbRef<OmbProjection> longLat, screen, mercator1SP, mercator1SPEllipsoid, mercator1SPWeb, miller1SP;
};
Predefined predefined;

// The UTM zones handed out by OmbProjection::utm, made on first request.
std::mutex utmMutex;
OmbRef<OmbProjection> utmZones[2][60];

// A sphere on which one degree is 60 nautical miles.
constexpr double nauticalMileSphereRadius = 6366707.019493707;

template <class P>
OmbRef<OmbProjection> add(P* projection, const char* name, const char* authority = "", const char* code = "") {
    OmbRef<OmbProjection> ref(projection);
    projection->name(OmbString(name));
    projection->authority(OmbString(authority));
    projection->authorityCode(OmbString(code));
    OmbRuntime::registerPredefined(OmbString::literal("Projections.") + OmbString(name), OmbRef<OmbEngineObject>(ref));
    return ref;
}

OmbTransverseMercator* stockholmTM(double centralLongitude, double falseEasting, double falseNorthing, double scale) {
    return new OmbTransverseMercator(centralLongitude, 0, falseEasting, falseNorthing, scale);
}

OmbMercator* sphericalMercator(const char* radiusSource, double radius = 0) {
    auto* m = new OmbMercator;
    m->sphereRadiusSource(OmbString(radiusSource));
    m->sphereRadius(radius);
    return m;
}

// Universal polar stereographic about either pole.
OmbPolarStereographic* ups(bool north) {
    auto* p = new OmbPolarStereographic(north);
    p->scaleFactor(0.994);
    p->falseEasting(2000000);
    p->falseNorthing(2000000);
    return p;
}

[[maybe_unused]] const bool registered =
    (OmbRuntime::registerPredefinedClass(OmbRuntime::PredefinedClass::Projections, OmbProjection::createPredefined,
                                         OmbProjection::destroyPredefined),
     true);

}  // namespace

void OmbProjection::createPredefined() {
    add(stockholmTM(15.80827776, 1500000, 0, 1.0), "TM2_5gonWStockholm", "epsg", "19929");
    predefined.screen = add(new OmbRectangularProjection, "screenProjection", "ombravel", "50001");
    predefined.longLat = add(new OmbLoLa(OmbLoLa::Predefined{}), "LongLat");
    add(stockholmTM(11.308277777777779, 1500000, 0, 1.0), "TM7_5gonWStockholm", "epsg", "17334");
    add(stockholmTM(15.806284529444445, 1500064.274, -667.711, 1.00000561024), "TM_2_5gonW_SWEREF99");
    add(sphericalMercator("#radiusFromArgument", nauticalMileSphereRadius), "mercatorMeter");
    predefined.mercator1SP = add(sphericalMercator("#radiusFromArgument", nauticalMileSphereRadius), "mercator1SP");
    auto* ellipsoidal = new OmbMercator;
    ellipsoidal->shape(OmbEarthShape::Ellipsoid);
    predefined.mercator1SPEllipsoid = add(ellipsoidal, "mercator1SP_ellipsoid", "epsg", "19883");
    predefined.mercator1SPWeb = add(sphericalMercator("#equatorialRadius"), "mercator1SP_web", "epsg", "3856");
    auto* miller = new OmbMiller(0.8);
    miller->sphereRadiusSource(OmbString::literal("#radiusFromArgument"));
    miller->sphereRadius(nauticalMileSphereRadius);
    predefined.miller1SP = add(miller, "miller1SP");
    add(ups(true), "UPS_North", "epsg", "16061");
    add(ups(false), "UPS_South", "epsg", "16161");
    add(new OmbLambertConformalConic2SP(10, 52, 35, 65, 4000000, 2800000), "EuropeConformal2001", "epsg", "19985");
}

void OmbProjection::destroyPredefined() {
    predefined = Predefined();
    std::lock_guard<std::mutex> lock(utmMutex);
    for (auto& hemisphere : utmZones)
        for (OmbRef<OmbProjection>& zone : hemisphere) zone.reset();
}

const OmbRef<OmbProjection>& OmbProjection::longLat() { return predefined.longLat; }
const OmbRef<OmbProjection>& OmbProjection::screenProjection() { return predefined.screen; }
const OmbRef<OmbProjection>& OmbProjection::mercator1SP() { return predefined.mercator1SP; }
const OmbRef<OmbProjection>& OmbProjection::mercator1SPEllipsoid() { return predefined.mercator1SPEllipsoid; }
const OmbRef<OmbProjection>& OmbProjection::mercator1SPWeb() { return predefined.mercator1SPWeb; }
const OmbRef<OmbProjection>& OmbProjection::miller1SP() { return predefined.miller1SP; }

OmbRef<OmbProjection> OmbProjection::utm(int zone, OmbUTMHemisphere hemisphere) {
    if (zone < 1 || zone > 60) OMB_THROW(RangeError, "zone", "utm( zone, hemisphere)", "1, 2, 3, ..., or 60");
    std::lock_guard<std::mutex> lock(utmMutex);
    OmbRef<OmbProjection>& slot = utmZones[int(hemisphere)][zone - 1];
    if (!slot) slot = OmbRef<OmbProjection>(new OmbUTM(zone, hemisphere));
    return slot;
}
