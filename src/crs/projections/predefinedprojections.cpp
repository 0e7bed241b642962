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

enum PredefinedProjection {
#define OMB_PROJECTION_INDEX(NAME, ACCESSOR) Projection##NAME,
    OMB_PREDEFINED_PROJECTIONS(OMB_PROJECTION_INDEX)
#undef OMB_PROJECTION_INDEX
        ProjectionCount
};

OmbRef<OmbProjection> predefined[ProjectionCount];

// The UTM zones handed out by OmbProjection::utm, made on first request.
std::mutex utmMutex;
OmbRef<OmbProjection> utmZones[2][60];

// A sphere on which one degree is 60 nautical miles.
constexpr double nauticalMileSphereRadius = 6366707.019493707;

template <class P>
void add(PredefinedProjection which, P* projection, const char* name, const char* authority = "",
         const char* code = "") {
    OmbRef<OmbProjection> ref(projection);
    projection->name(OmbString(name));
    projection->authority(OmbString(authority));
    projection->authorityCode(OmbString(code));
    OmbRuntime::registerPredefined(OmbString::literal("Projections.") + OmbString(name), OmbRef<OmbEngineObject>(ref));
    predefined[which] = ref;
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
    add(ProjectionTM2_5gonWStockholm, stockholmTM(15.80827776, 1500000, 0, 1.0), "TM2_5gonWStockholm", "epsg", "19929");
    add(ProjectionscreenProjection, new OmbRectangularProjection, "screenProjection", "ombravel", "50001");
    add(ProjectionLongLat, new OmbLoLa(OmbLoLa::Predefined{}), "LongLat");
    add(ProjectionTM7_5gonWStockholm, stockholmTM(11.308277777777779, 1500000, 0, 1.0), "TM7_5gonWStockholm", "epsg",
        "17334");
    add(ProjectionTM_2_5gonW_SWEREF99, stockholmTM(15.806284529444445, 1500064.274, -667.711, 1.00000561024),
        "TM_2_5gonW_SWEREF99");
    add(ProjectionmercatorMeter, sphericalMercator("#radiusFromArgument", nauticalMileSphereRadius), "mercatorMeter");
    add(Projectionmercator1SP, sphericalMercator("#radiusFromArgument", nauticalMileSphereRadius), "mercator1SP");
    auto* ellipsoidal = new OmbMercator;
    ellipsoidal->shape(OmbEarthShape::Ellipsoid);
    add(Projectionmercator1SP_ellipsoid, ellipsoidal, "mercator1SP_ellipsoid", "epsg", "19883");
    add(Projectionmercator1SP_web, sphericalMercator("#equatorialRadius"), "mercator1SP_web", "epsg", "3856");
    auto* miller = new OmbMiller(0.8);
    miller->sphereRadiusSource(OmbString::literal("#radiusFromArgument"));
    miller->sphereRadius(nauticalMileSphereRadius);
    add(Projectionmiller1SP, miller, "miller1SP");
    add(ProjectionUPS_North, ups(true), "UPS_North", "epsg", "16061");
    add(ProjectionUPS_South, ups(false), "UPS_South", "epsg", "16161");
    add(ProjectionEuropeConformal2001, new OmbLambertConformalConic2SP(10, 52, 35, 65, 4000000, 2800000),
        "EuropeConformal2001", "epsg", "19985");
}

void OmbProjection::destroyPredefined() {
    for (OmbRef<OmbProjection>& p : predefined) p.reset();
    std::lock_guard<std::mutex> lock(utmMutex);
    for (auto& hemisphere : utmZones)
        for (OmbRef<OmbProjection>& zone : hemisphere) zone.reset();
}

#define OMB_PROJECTION_ACCESSOR(NAME, ACCESSOR) \
    const OmbRef<OmbProjection>& OmbProjection::ACCESSOR() { return predefined[Projection##NAME]; }
OMB_PREDEFINED_PROJECTIONS(OMB_PROJECTION_ACCESSOR)
#undef OMB_PROJECTION_ACCESSOR

OmbRef<OmbProjection> OmbProjection::utm(int zone, OmbUTMHemisphere hemisphere) {
    if (zone < 1 || zone > 60) OMB_THROW(RangeError, "zone", "utm( zone, hemisphere)", "1, 2, 3, ..., or 60");
    std::lock_guard<std::mutex> lock(utmMutex);
    OmbRef<OmbProjection>& slot = utmZones[int(hemisphere)][zone - 1];
    if (!slot) slot = OmbRef<OmbProjection>(new OmbUTM(zone, hemisphere));
    return slot;
}
