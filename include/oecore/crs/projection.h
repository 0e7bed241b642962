// OmbProjection: maps long/lat in degrees, on the ellipsoid of a datum, to
// planar x/y in the projection's length unit, and back.
//
// A projection holds only its parameters. Every constant that depends on the
// ellipsoid lives in the OmbProjCachedNumbers block that init(datum) makes,
// which the caller keeps (one per coordinate system) and passes to every
// call. Projections and cached numbers are read-only during conversion and
// may be shared between threads.
#pragma once

#include <oecore/crs/geodeticdatum.h>
#include <oecore/crs/units.h>

// The ellipsoid constants every method needs, and the unit conversion.
class OmbProjCachedNumbers {
public:
    OmbProjCachedNumbers(const OmbGeodeticDatum& datum, double metersPerUnit);
    virtual ~OmbProjCachedNumbers() = default;
    OmbProjCachedNumbers(const OmbProjCachedNumbers&) = delete;
    OmbProjCachedNumbers& operator=(const OmbProjCachedNumbers&) = delete;

    double a;    // equatorial radius, metres
    double f;    // flattening
    double b;    // polar radius
    double e2;   // first eccentricity squared
    double e;    // first eccentricity
    double ep2;  // second eccentricity squared
    double n;    // third flattening, f / (2 - f)
    double metersPerUnit;
    double unitsPerMeter;

    // Radii of curvature in the meridian and in the prime vertical at a
    // latitude given by its sine.
    double meridianRadius(double sinLat) const;
    double primeVerticalRadius(double sinLat) const;
    // The radius of the sphere a spherical variant uses, in metres, by its
    // source: "#equatorialRadius" (also when empty), "#equalArea" (the
    // authalic radius), "#meanRadiusOfCurvatureAtCentralLatitude" or
    // "...AtStandardParallel" (sqrt(M N) at latitude, in degrees), or
    // "#radiusFromArgument". OmbXArgument for another source.
    double sphereRadius(const OmbString& source, double argument, double latitude) const;
};

// Adds the meridian arc length M(lat), the distance from the equator along
// a meridian, and M0 at the projection's central latitude.
class OmbMeriDistProjCachedNumbers : public OmbProjCachedNumbers {
public:
    OmbMeriDistProjCachedNumbers(const OmbGeodeticDatum& datum, double metersPerUnit, double centralLatitude);

    // M in metres; lat in radians with its sine and cosine.
    double meridianDistance(double lat, double sinLat, double cosLat) const {
        const double s2 = sinLat * sinLat;
        return a * (en[0] * lat - sinLat * cosLat * (en[1] + s2 * (en[2] + s2 * (en[3] + s2 * en[4]))));
    }
    double meridianDistance(double lat) const;
    // The latitude in radians whose M is the given distance in metres.
    double latitudeFromMeridianDistance(double m) const;

    double en[5];
    double m0;
};

// Which hemisphere a UTM zone lies in.
enum class OmbUTMHemisphere { North = 0, South = 1 };
OMB_DESCRIBE_ENUM(OmbUTMHemisphere, "UTMHemisphere", {{"North", 0}, {"South", 1}})

// Whether a method works on the datum's ellipsoid or on a sphere.
enum class OmbEarthShape { Sphere = 0, Ellipsoid = 1 };
OMB_DESCRIBE_ENUM(OmbEarthShape, "EarthShape", {{"Sphere", 0}, {"Ellipsoid", 1}})

// The shape a method with a spherical variant works on: the datum's
// ellipsoid, or a sphere whose radius comes from a source.
class OmbEarthShapeParameters {
public:
    OmbEarthShape shape() const noexcept { return shape_; }
    void shape(OmbEarthShape shape) { shape_ = shape; }
    // In metres, used with "#radiusFromArgument".
    double sphereRadius() const noexcept { return sphereRadius_; }
    void sphereRadius(double metres) { sphereRadius_ = metres; }
    // One of the sources OmbProjCachedNumbers::sphereRadius takes.
    const OmbString& sphereRadiusSource() const noexcept { return sphereRadiusSource_; }
    void sphereRadiusSource(const OmbString& source) { sphereRadiusSource_ = source; }

    // The sphere's radius on cached's ellipsoid (the mean radius of
    // curvature at latitude where the source asks for it).
    double sphereRadiusFor(const OmbProjCachedNumbers& cached, double latitude) const {
        return cached.sphereRadius(sphereRadiusSource_, sphereRadius_, latitude);
    }
    // The same shape; for spheres the same radius source (an empty one is
    // the equatorial radius) and, where it counts, the same radius.
    bool sameEarthShape(const OmbEarthShapeParameters& other) const;

protected:
    explicit OmbEarthShapeParameters(OmbEarthShape shape) : shape_(shape) {}

private:
    OmbEarthShape shape_;
    double sphereRadius_ = 0;
    OmbString sphereRadiusSource_;
};

// Every predefined projection: registered name, accessor.
// clang-format off
#define OMB_PREDEFINED_PROJECTIONS(X) \
    X(TM2_5gonWStockholm, tm2_5gonWStockholm) \
    X(screenProjection, screenProjection) \
    X(LongLat, longLat) \
    X(TM7_5gonWStockholm, tm7_5gonWStockholm) \
    X(TM_2_5gonW_SWEREF99, tm2_5gonWSweref99) \
    X(mercatorMeter, mercatorMeter) \
    X(mercator1SP, mercator1SP) \
    X(mercator1SP_ellipsoid, mercator1SPEllipsoid) \
    X(mercator1SP_web, mercator1SPWeb) \
    X(miller1SP, miller1SP) \
    X(UPS_North, upsNorth) \
    X(UPS_South, upsSouth) \
    X(EuropeConformal2001, europeConformal2001)
// clang-format on

class OmbProjection : public OmbResourceObject {
    OMB_DECLARE_ENGINE_CLASS()

public:
    // The constants for datum's ellipsoid; the caller owns the block.
    virtual OmbProjCachedNumbers* init(const OmbGeodeticDatum& datum) const;
    // The bounds of the projected rectangle (from extreme-value searches
    // along its edges); false, with out untouched, when no point of the
    // edges projects.
    virtual bool project(const OmbRect& in, const OmbProjCachedNumbers* cached, OmbRect& out) const;
    virtual void project(OmbPointArray& points, const OmbProjCachedNumbers* cached) const;
    // In place; z is kept. OmbXProjectionError where the formula fails.
    virtual void project(OmbPoint& p, const OmbProjCachedNumbers* cached) const = 0;
    virtual bool unproject(const OmbRect& in, const OmbProjCachedNumbers* cached, OmbRect& out) const;
    virtual void unproject(OmbPointArray& points, const OmbProjCachedNumbers* cached) const;
    virtual void unproject(OmbPoint& p, const OmbProjCachedNumbers* cached) const = 0;
    // Metres on the ground per projected unit along x and y at a projected
    // point; false where the point is not valid.
    virtual bool metersXY(const OmbPoint& p, const OmbProjCachedNumbers* cached, double& mx, double& my) const;
    // A valid projected point near p, where metersXY can be measured.
    virtual OmbPoint safePointForMetersXY(const OmbPoint& p, const OmbProjCachedNumbers* cached) const;
    // Metres per unit independent of position (at the projected origin).
    virtual void nominalMetersXY(const OmbProjCachedNumbers* cached, double& mx, double& my) const = 0;
    // At a projected point: the direction in the plane (degrees counter-
    // clockwise from the x axis) of a ground azimuth (degrees clockwise from
    // north), and back.
    virtual double angle(const OmbPoint& p, double azimuth, const OmbProjCachedNumbers* cached) const;
    virtual double azimuth(const OmbPoint& p, double angle, const OmbProjCachedNumbers* cached) const;
    // Moves a projected rectangle of a world that wraps around in x by whole
    // world widths so that its left edge lies in the world.
    virtual void adjustRect(OmbRect& rect, const OmbProjCachedNumbers* cached) const;
    virtual bool cyclicOblique() const { return false; }
    // False for screen and non-georeferenced projections.
    virtual bool georeferenced() const { return true; }
    // The long/lat rectangle where the projection is defined.
    virtual OmbRect getValidArea(const OmbProjCachedNumbers* cached) const;
    virtual bool isValid(const OmbPoint& lola, const OmbProjCachedNumbers* cached) const;
    // Valid and away from a cut where neighbouring points jump apart.
    virtual bool continuousValidity(const OmbPoint& lola, const OmbProjCachedNumbers* cached) const;
    // Every long/lat point projects.
    virtual bool isValidGlobally() const { return true; }
    virtual bool isValidProjectedPoint(const OmbPoint& p, const OmbProjCachedNumbers* cached) const;
    virtual bool operator==(const OmbProjection& other) const { return this == &other || equivalent(other); }
    // The outline of the projected valid area, closed.
    virtual OmbPointArray worldPerimeter(const OmbProjCachedNumbers* cached) const;
    // The projected central longitude and latitude.
    virtual OmbPoint projectedOrigin(const OmbProjCachedNumbers* cached) const;
    // The same class with the same parameters.
    virtual bool equivalent(const OmbProjection& other) const = 0;

    bool cyclicX() const noexcept { return cyclicX_; }
    bool cyclicY() const noexcept { return cyclicY_; }

    const OmbString& authority() const noexcept { return authority_; }
    void authority(const OmbString& a) { authority_ = a; }
    const OmbString& authorityCode() const noexcept { return authorityCode_; }
    void authorityCode(const OmbString& c) { authorityCode_ = c; }

    // The parameters most methods share; each class's configuration lists
    // those it uses. Setters are for building from a configuration: a
    // projection in use does not change.
    double centralLongitude() const noexcept { return centralLongitude_; }
    void centralLongitude(double degrees) { centralLongitude_ = degrees; }
    double centralLatitude() const noexcept { return centralLatitude_; }
    void centralLatitude(double degrees) { centralLatitude_ = degrees; }
    double falseEasting() const noexcept { return falseEasting_; }
    void falseEasting(double units) { falseEasting_ = units; }
    double falseNorthing() const noexcept { return falseNorthing_; }
    void falseNorthing(double units) { falseNorthing_ = units; }
    double scaleFactor() const noexcept { return scaleFactor_; }
    void scaleFactor(double k) { scaleFactor_ = k; }
    // Metres unless set ("LengthUnits.Meter").
    const OmbRef<OmbLengthUnit>& lengthUnit() const;
    void lengthUnit(const OmbRef<OmbLengthUnit>& unit) { lengthUnit_ = unit; }
    // The unit as configured: null for the default.
    const OmbRef<OmbLengthUnit>& configuredLengthUnit() const noexcept { return lengthUnit_; }
    double metersPerProjUnit() const { return lengthUnit()->inMeters(); }

    // The projection of a UTM zone (1..60) on the hemisphere, shared by all
    // callers; OmbXRangeError for another zone.
    static OmbRef<OmbProjection> utm(int zone, OmbUTMHemisphere hemisphere);

    // The predefined projections, while the runtime is initialised
    // (registered as "Projections." + name).
#define OMB_PROJECTION_ACCESSOR(NAME, ACCESSOR) static const OmbRef<OmbProjection>& ACCESSOR();
    OMB_PREDEFINED_PROJECTIONS(OMB_PROJECTION_ACCESSOR)
#undef OMB_PROJECTION_ACCESSOR
    static void createPredefined();
    static void destroyPredefined();

protected:
    OmbProjection(bool cyclicX = false, bool cyclicY = false);

    // Metres per unit at a long/lat point, by the ellipsoid's radii of
    // curvature and the derivatives of unproject.
    virtual bool metersXYInternal(const OmbPoint& p, const OmbProjCachedNumbers* cached, double& mx, double& my) const;
    // Brings a long/lat point into the valid area.
    virtual void snapToWorld(OmbPoint& lola) const;

    // The shared parameters, the length unit and the authority agree.
    bool sameParameters(const OmbProjection& other) const;
    // For cylindrical worlds worldWidth units wide: other's x differ from
    // this projection's by whole world widths (through central longitude and
    // false easting), within 1e-5 units.
    bool shiftedByWholeWorlds(const OmbProjection& other, double worldWidth) const;
    // Raises OmbXProjectionError for a point the formula cannot take.
    [[noreturn]] void projectionError(const OmbPoint& p, const char* what) const;
    // Arcsine for formula arguments that rounding may take just past +-1;
    // OmbXRangeError for arguments clearly outside.
    double asinSafe(double x) const;

private:
    bool cyclicX_;
    bool cyclicY_;
    OmbString authority_;
    OmbString authorityCode_;
    double centralLongitude_ = 0;
    double centralLatitude_ = 0;
    double falseEasting_ = 0;
    double falseNorthing_ = 0;
    double scaleFactor_ = 1;
    OmbRef<OmbLengthUnit> lengthUnit_;
};
