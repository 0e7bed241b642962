// OmbCrs: a coordinate reference system, a projection on a geodetic datum
// with an optional authority and code ("EPSG" / "4326"). Every conversion
// between two systems goes through projectTo: unproject with the source's
// projection, change datum when the datums differ, project with the
// target's projection.
//
// Rectangles that straddle a cyclic target's border: projectTo unprojects
// the source rectangle into a long/lat box; when that box's longitudes wrap
// around 180 degrees (the source area crosses the antimeridian), the box
// becomes the full -180..180 width, so the result covers the area on both
// sides of the target's border rather than the gap between them.
//
// Immutable once constructed and shared between threads. The one write
// after construction, the auxiliary constants that rhumb-line measurement
// uses, happens once under a once-flag.
#pragma once

#include <oecore/attr/atoms.h>
#include <oecore/core/vec.h>
#include <oecore/crs/datumshiftinfo.h>
#include <oecore/crs/geodesic.h>
#include <oecore/crs/projection.h>

#include <memory>
#include <mutex>
#include <vector>

enum class OmbCrsLineType { GreatCircle = 0, GreatCircleApprox = 1, RhumbLine = 2 };
enum class OmbWellKnownTextFlavor { OgrWellKnownText = 0, EsriWellKnownText = 1 };
// Where a catalogue system's axis points: geographic axes north, south,
// east and west; projected axes along the grid.
enum class OmbCrsAxisDirection {
    North = 0,
    South = 1,
    East = 2,
    West = 3,
    Up = 4,
    Down = 5,
    GridNorth = 6,
    GridSouth = 7,
    GridEast = 8,
    GridWest = 9,
    UnknownDirection = 10
};
OMB_DESCRIBE_ENUM(OmbCrsLineType, "CrsLineType", {{"GreatCircle", 0}, {"GreatCircleApprox", 1}, {"RhumbLine", 2}})

class OmbCrs : public OmbResourceObject {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    // For the reader, which completes the system once its properties are
    // read (see construct()).
    OmbCrs();
    OmbCrs(const OmbRef<OmbProjection>& projection, const OmbRef<OmbGeodeticDatum>& geodeticDatum);
    // Authoritative codes: equality may decide on the codes alone.
    OmbCrs(const OmbString& authority, const OmbString& authorityCode, const OmbRef<OmbProjection>& projection,
           const OmbRef<OmbGeodeticDatum>& geodeticDatum,
           OmbDatumShiftChoice choice = OmbDatumShiftChoice::Conservative);
    // Codes attached as labels next to an explicit projection and datum.
    OmbCrs(const OmbRef<OmbProjection>& projection, const OmbRef<OmbGeodeticDatum>& geodeticDatum,
           const OmbString& authority, const OmbString& authorityCode);
    // A system fitted to a long/lat area (recommendedProjection), in metres.
    OmbCrs(const OmbPoint& lowerLeft, const OmbPoint& upperRight, const OmbRef<OmbGeodeticDatum>& geodeticDatum);
    OmbCrs(const OmbCrs& other);
    ~OmbCrs() override;
    OmbCrs* clone() const override { return new OmbCrs(*this); }

    // The reader's constructor: with both projection and datum given, the
    // codes are labels; with neither, they come from fromAuthorityAndCode;
    // otherwise OmbXCrsNullValue, OmbXCrsNullValues or
    // OmbXCrsNullValueVariant.
    void construct();

    const OmbRef<OmbProjection>& projection() const noexcept { return projection_; }
    const OmbRef<OmbGeodeticDatum>& geodeticDatum() const noexcept { return datum_; }
    const OmbRef<OmbLengthUnit>& lengthUnit() const { return projection_->lengthUnit(); }
    const OmbString& authority() const noexcept { return authority_; }
    const OmbString& authorityCode() const noexcept { return authorityCode_; }
    bool codeIsLabelOnly() const noexcept { return codeIsLabelOnly_; }
    // 0 without a code; OmbXCrsIdError for a code that is no number.
    int id() const;
    // The projection's constants on this datum, for the projection's calls.
    const OmbProjCachedNumbers* cachedNumbers() const noexcept { return cached_.get(); }
    // The long/lat area where the projection is defined, and its projected
    // bounds.
    OmbRect getValidArea() const { return projection_->getValidArea(cached_.get()); }
    OmbRect bounds() const;
    OmbPoint projectedOrigin() const { return projection_->projectedOrigin(cached_.get()); }

    // For the reader; a system in use does not change.
    void projection(const OmbRef<OmbProjection>& p) { projection_ = p; }
    void geodeticDatum(const OmbRef<OmbGeodeticDatum>& d) { datum_ = d; }
    void authority(const OmbString& a) { authority_ = a; }
    void authorityCode(const OmbString& c) { authorityCode_ = c; }

    // Long/lat degrees on this datum to projected, and back; z is kept.
    void project(OmbPoint& p) const { projection_->project(p, cached_.get()); }
    void project(OmbPointArray& points) const { projection_->project(points, cached_.get()); }
    void unproject(OmbPoint& p) const { projection_->unproject(p, cached_.get()); }
    void unproject(OmbPointArray& points) const { projection_->unproject(points, cached_.get()); }
    // From this system into target: unproject, change datum, project. A
    // failure leaves the point partly converted.
    void projectTo(const OmbCrs& target, OmbPoint& p) const;
    void projectTo(const OmbCrs& target, OmbPointArray& points) const;
    // The bounds of the rectangle's image in target (see the rule above);
    // false, with out untouched, when a step fails.
    bool projectTo(const OmbCrs& target, const OmbRect& in, OmbRect& out) const;
    // Long/lat on this datum to another datum.
    void changeDatumTo(const OmbGeodeticDatum& datum, OmbPoint& p) const { datum_->changeDatumTo(datum, p); }
    void changeDatumTo(const OmbGeodeticDatum& datum, OmbPointArray& points) const {
        datum_->changeDatumTo(datum, points);
    }
    // Projected to geocentric X, Y, Z on this datum's ellipsoid (metres),
    // and back.
    OmbPoint unprojectToGeocentricXYZ(const OmbPoint& p) const;
    OmbPoint projectFromGeocentricXYZ(const OmbPoint& xyz) const;
    // The outline of the projected world, closed.
    OmbPointArray boundary() const { return projection_->worldPerimeter(cached_.get()); }
    bool isValid(const OmbPoint& lola) const { return projection_->isValid(lola, cached_.get()); }
    // Flags (or continuity) per long/lat point; the number of valid points.
    int checkValidity(const OmbPointArray& lola, std::vector<bool>& flags) const;
    int checkContinuousValidity(const OmbPointArray& lola, std::vector<bool>& values) const;
    bool isValidProjectedPoint(const OmbPoint& p) const { return projection_->isValidProjectedPoint(p, cached_.get()); }
    bool continuousValidity(const OmbPoint& lola) const { return projection_->continuousValidity(lola, cached_.get()); }

    // Metres per projected unit at a projected point; false where the point
    // is not valid. Nominal: independent of position.
    bool metersXY(const OmbPoint& p, double& mx, double& my) const;
    double metersX(const OmbPoint& p) const;
    double metersY(const OmbPoint& p) const;
    void nominalMetersXY(double& mx, double& my) const { projection_->nominalMetersXY(cached_.get(), mx, my); }
    double metersFromCrsUnitsNominally(double units) const;
    double crsUnitsFromMetersNominally(double meters) const;
    // At a projected point: the plane direction of a ground azimuth, and back
    // (degrees; see OmbProjection).
    double angle(const OmbPoint& p, double azimuth) const { return projection_->angle(p, azimuth, cached_.get()); }
    double azimuth(const OmbPoint& p, double angle) const { return projection_->azimuth(p, angle, cached_.get()); }
    // Geodesic measurement between projected points, on the datum's
    // ellipsoid: metres, and azimuths in degrees.
    double distance(const OmbPoint& a, const OmbPoint& b) const;
    OmbGeodesicInverse distanceAndAzimuths(const OmbPoint& a, const OmbPoint& b) const;
    // The projected point at a ground distance and azimuth from p.
    OmbPoint pointPlusDirectedDistance(const OmbPoint& p, double azimuth, double distance) const;
    // The length in metres of a projected line (closed: back to the start)
    // along geodesics or rhumb lines between its points.
    double length2d(const OmbPointArray& points, OmbCrsLineType lineType, bool closed) const;
    // The line from a to b (projected) as nodes no more than
    // maxSegmentLength metres apart along a geodesic or a rhumb line.
    // GreatCircleApprox raises OmbXGreatCircleApproxRouteNotImplemented.
    OmbPointArray route(const OmbPoint& a, const OmbPoint& b, OmbCrsLineType lineType, double maxSegmentLength) const;
    OmbPointArray greatCircleRoute(const OmbPoint& a, const OmbPoint& b, double maxSegmentLength) const {
        return route(a, b, OmbCrsLineType::GreatCircle, maxSegmentLength);
    }
    // The catalogue's well-known text for a system with an EPSG or "crs"
    // code, else one built from the projection and datum (with the Helmert
    // shift as TOWGS84); OmbXUnsupportedProjection for a projection the
    // text has no method for.
    OmbString toWellKnownText(bool pretty,
                              OmbWellKnownTextFlavor flavor = OmbWellKnownTextFlavor::OgrWellKnownText) const;

    // On long/lat degrees of this datum, without projecting: the exact
    // geodesic (root finding, safe for nearly antipodal points), and the
    // point a distance along it.
    OmbGeodesicInverse distanceAndAzimuthsExactLoLaDeg(const OmbPoint& from, const OmbPoint& to) const {
        return Omb_distanceAndAzimuthsExact(*datum_->ellipsoid(), from, to);
    }
    OmbPoint pointAlongRay2dExactLoLaDeg(const OmbPoint& from, double azimuth, double distance) const {
        return Omb_pointPlusDirectedDistance(*datum_->ellipsoid(), from, azimuth, distance);
    }
    // A projected rectangle grown on each side by a ground distance, in
    // units measured at its centre (see metersXY).
    OmbRect expandRect(const OmbRect& rect, double meters) const;
    // The projected point a ground distance (metres) from p in the azimuth
    // (degrees), along a geodesic or a rhumb line.
    OmbPoint pointAlongRay2d(const OmbPoint& p, double azimuth, double distance, OmbCrsLineType lineType) const;
    // The projected point a fraction (0 to 1) of the way from a to b.
    OmbPoint partway(const OmbPoint& a, const OmbPoint& b, double fraction, OmbCrsLineType lineType) const;
    // In the plane of the projection: the point of a polyline nearest to p
    // (with the index of its segment), and where two segments cross (false
    // when they do not).
    OmbPoint nearestPointOnLine2d(const OmbPointArray& line, const OmbPoint& p, std::size_t& segment) const;
    bool intersectLineSegments(const OmbPoint& a1, const OmbPoint& a2, const OmbPoint& b1, const OmbPoint& b2,
                               OmbPoint& crossing) const;
    // On the ellipsoid: where two circles of ground radii (metres) about
    // projected centres cross, and where the geodesic from a to b crosses
    // a circle (nearest a first); the number of points, 0 to 2.
    int intersectCircles(const OmbPoint& c1, double r1, const OmbPoint& c2, double r2, OmbPoint& p1,
                         OmbPoint& p2) const;
    int intersectLineSegmentAndCircle(const OmbPoint& a, const OmbPoint& b, const OmbPoint& centre, double radius,
                                      OmbPoint& p1, OmbPoint& p2) const;

    // Moves a projected rectangle or point of a cyclic world by whole world
    // widths into the world; an easting likewise.
    void adjustRect(OmbRect& rect) const { projection_->adjustRect(rect, cached_.get()); }
    void adjustPoint(OmbPoint& p) const;
    double normalizeCyclicEasting(double x) const;

    // Same object; or both with authoritative codes whose atoms agree; or
    // equal datums and equal projections.
    bool operator==(const OmbCrs& other) const;
    bool operator!=(const OmbCrs& other) const { return !(*this == other); }
    // Equal, or the same cylindrical family on the same datum differing only
    // by where the world starts in x (rasters and tiles can be shared).
    bool compatibleWith(const OmbRef<OmbCrs>& other) const;

    // --- factories -------------------------------------------------------------
    // "crs" codes 84, 83 and 27; EPSG and ESRI codes (the predefined systems
    // where there is one, otherwise from the catalogue in GDAL); OmbXRangeError
    // for codes outside an authority's ranges, OmbXUnrecognizedAuthority for
    // another authority.
    static OmbRef<OmbCrs> fromAuthorityAndCode(const OmbString& authority, const OmbString& code,
                                               OmbDatumShiftChoice choice = OmbDatumShiftChoice::Conservative);
    // From OGC (WKT1, WKT2) or ESRI well-known text.
    static OmbRef<OmbCrs> fromWellKnownText(const OmbString& wkt,
                                            OmbWellKnownTextFlavor flavor = OmbWellKnownTextFlavor::OgrWellKnownText,
                                            OmbDatumShiftChoice choice = OmbDatumShiftChoice::Conservative);
    // "EPSG:4326" or "urn:ogc:def:crs:EPSG::4326" (OGC:CRS84 as crs:84).
    static OmbRef<OmbCrs> fromUrn(const OmbString& urn, OmbDatumShiftChoice choice = OmbDatumShiftChoice::Conservative);
    // The predefined WGS 84 UTM system of a zone; OmbXRangeError outside
    // 1..60.
    static const OmbRef<OmbCrs>& wgs84Utm(int zone, OmbUTMHemisphere hemisphere);
    // The WGS 84 UTM system whose zone holds the long/lat point.
    static const OmbRef<OmbCrs>& fromUtmProjectionForPoint(const OmbPoint& lola);
    // A predefined system by EPSG code; null when there is none.
    static OmbRef<OmbCrs> findPredefinedInstance(int epsgCode);
    // A system fitted to a long/lat area (degrees) on the datum.
    static OmbRef<OmbCrs> fromArea(const OmbPoint& lowerLeft, const OmbPoint& upperRight,
                                   const OmbRef<OmbGeodeticDatum>& datum);
    static OmbRef<OmbCrs> createCrsForArea(const OmbPoint& lowerLeft, const OmbPoint& upperRight,
                                           const OmbRef<OmbGeodeticDatum>& datum) {
        return fromArea(lowerLeft, upperRight, datum);
    }
    // Polar stereographic near the poles, Mercator near the equator,
    // Lambert conformal conic elsewhere; in metres.
    static OmbRef<OmbProjection> recommendedProjection(const OmbPoint& lowerLeft, const OmbPoint& upperRight);
    // This system with its projection moved so that the longitude (on the
    // projected origin's parallel) projects to (0, 0); named "...Recentered".
    OmbRef<OmbCrs> recenteredClone(double longitude) const;

    // --- degrees, minutes and seconds as text ----------------------------------
    // The components of a latitude or longitude: degrees, minutes (with the
    // decimals in the DM form), seconds (with the decimals), and the
    // hemisphere letter N, S, E or W. Rounded once at the last component,
    // so no component reaches 60.
    static OmbRef<OmbVec<OmbString>> formatLatitudeAsDegreesMinutes(double value, int decimals);
    static OmbRef<OmbVec<OmbString>> formatLatitudeAsDegreesMinutesSeconds(double value, int decimals);
    static OmbRef<OmbVec<OmbString>> formatLongitudeAsDegreesMinutes(double value, int decimals);
    static OmbRef<OmbVec<OmbString>> formatLongitudeAsDegreesMinutesSeconds(double value, int decimals);
    // Degrees from components as typed: degrees 1 to 3 digits, minutes and
    // seconds 1 to 2 digits before an optional decimal point or comma (only
    // in the last component); the hemisphere N/S (E/W for longitudes), or
    // empty with an optional minus on the degrees. Each fault has its own
    // OmbX...DegMinSecComponent error; values out of range an OmbXRangeError.
    static double parseLatitude(const OmbString& degrees, const OmbString& minutes, const OmbString& hemisphere);
    static double parseLatitude(const OmbString& degrees, const OmbString& minutes, const OmbString& seconds,
                                const OmbString& hemisphere);
    static double parseLongitude(const OmbString& degrees, const OmbString& minutes, const OmbString& hemisphere);
    static double parseLongitude(const OmbString& degrees, const OmbString& minutes, const OmbString& seconds,
                                 const OmbString& hemisphere);

    // --- the catalogue ------------------------------------------------------------
    // What the EPSG catalogue says of a system: its name, the direction and
    // abbreviation of an axis (0 or 1), its area of use. OmbXUnsupportedAuthority
    // for an authority other than EPSG or CRS, OmbXEpsgCrsCodeOutOfRange for a
    // code outside 1024..32767, and the "not found" error of each look-up.
    static OmbString authoritativeName(const OmbString& authority, const OmbString& code);
    static OmbCrsAxisDirection authoritativeAxisDirection(const OmbString& authority, const OmbString& code, int axis);
    static OmbString authoritativeAxisAbbreviation(const OmbString& authority, const OmbString& code, int axis);
    static OmbString authoritativeAreaOfUseDescription(const OmbString& authority, const OmbString& code);
    // West, south, east, north in degrees; east below west across 180.
    static OmbRect authoritativeAreaOfUseBounds(const OmbString& authority, const OmbString& code);
    // The version of the EPSG catalogue in use.
    static OmbString epsgVersion();

    static bool reasonableEpsgCode(int code);
    static bool reasonableEsriCode(int code);
    // Longitudes strictly within (-999.5, 999.5), latitudes within
    // (-90.0000001, 90.0000001).
    static bool insideValidRange(double value, bool isLongitude);

    // --- predefined systems (while the runtime is initialised) -----------------
    static const OmbRef<OmbCrs>& wgs84LongLat();
    static const OmbRef<OmbCrs>& screenCoordinateSystem();
    static const OmbRef<OmbCrs>& nonGeoreferenced();
    static const OmbRef<OmbCrs>& SWEREF99TM();
    static const OmbRef<OmbCrs>& SWEREF99_2_5gonW();
    static const OmbRef<OmbCrs>& wgs84MercatorEllipsoid();
    static const OmbRef<OmbCrs>& wgs84MercatorWeb();
    static const OmbRef<OmbCrs>& wgs84UpsNorth();
    static const OmbRef<OmbCrs>& wgs84UpsSouth();
    static const OmbRef<OmbCrs>& etrsLcc();
    static void createPredefined();
    static void destroyPredefined();

private:
    void finish();
    // What rhumb-line measurement needs on this datum, made once: the
    // shared auxiliary Mercator's constants, its x per degree, and the
    // meridian arcs.
    struct AuxNumbers {
        std::unique_ptr<OmbProjCachedNumbers> mercator;
        std::unique_ptr<OmbMeriDistProjCachedNumbers> arcs;
        double xPerDegree = 0;
    };
    const AuxNumbers& aux() const;
    // Projected to long/lat on this datum; OmbXInvalidOperation naming the
    // operation for a system that is not georeferenced.
    OmbPoint lola(const OmbPoint& p, const char* operation) const;
    // The geodesic between long/lat points (exact near antipodes).
    OmbGeodesicInverse geodesic(const OmbPoint& from, const OmbPoint& to) const;
    OmbPoint movedOnGround(const OmbPoint& lola, double east, double north) const;
    // Metres along the rhumb line between two long/lat points, and its
    // course in degrees.
    double rhumbLength(const OmbPoint& from, const OmbPoint& to, double* course = nullptr) const;
    // The long/lat point a distance along the rhumb line of a course.
    OmbPoint alongRhumbLine(const OmbPoint& from, double course, double distance) const;
    // A long/lat point's y on the auxiliary Mercator plane (x keeps the
    // longitude).
    OmbPoint onMercatorPlane(const OmbPoint& lola) const;

    OmbString authority_;
    OmbString authorityCode_;
    OmbAtom authorityAtom_ = 0;
    OmbAtom codeAtom_ = 0;
    bool codeIsLabelOnly_ = false;
    OmbRef<OmbProjection> projection_;
    OmbRef<OmbGeodeticDatum> datum_;
    std::unique_ptr<OmbProjCachedNumbers> cached_;
    mutable std::once_flag auxOnce_;
    mutable AuxNumbers aux_;
};
