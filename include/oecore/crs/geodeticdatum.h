// OmbGeodeticDatum: an ellipsoid, a prime meridian and the shift that leads
// to a better-known datum. All datums form a tree whose root, the pivot, is
// WGS 84 (the datum without a shift).
//
// Immutable once read; shared between threads.
#pragma once

#include <oecore/crs/datumshift.h>
#include <oecore/crs/ellipsoid.h>
#include <oecore/crs/primemeridian.h>
#include <oecore/linalg/pointarray.h>
#include <oecore/linalg/rect.h>

class OmbGeodeticDatum : public OmbResourceObject {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    OmbGeodeticDatum();
    OmbGeodeticDatum(const OmbRef<OmbEllipsoid>& ellipsoid, const OmbRef<OmbPrimeMeridian>& primeMeridian,
                     const OmbRef<OmbDatumShift>& datumShift);
    OmbGeodeticDatum* clone() const override { return new OmbGeodeticDatum(*this); }

    const OmbString& authority() const noexcept { return authority_; }
    void authority(const OmbString& a) { authority_ = a; }
    const OmbString& authorityCode() const noexcept { return authorityCode_; }
    void authorityCode(const OmbString& c) { authorityCode_ = c; }
    const OmbRef<OmbEllipsoid>& ellipsoid() const noexcept { return ellipsoid_; }
    void ellipsoid(const OmbRef<OmbEllipsoid>& e) { ellipsoid_ = e; }
    const OmbRef<OmbPrimeMeridian>& primeMeridian() const noexcept { return primeMeridian_; }
    void primeMeridian(const OmbRef<OmbPrimeMeridian>& m) { primeMeridian_ = m; }
    // Null only for the pivot. The shift becomes this datum's (it cannot
    // belong to two): OmbXSharingViolation otherwise.
    const OmbRef<OmbDatumShift>& datumShift() const noexcept { return datumShift_; }
    void datumShift(const OmbRef<OmbDatumShift>& shift);

    // Other known shifts of this datum, described (null when none), and
    // those whose area of use meets a long/lat rectangle.
    const OmbRef<OmbDatumShiftInfoVec>& alternativeDatumShifts() const noexcept { return alternatives_; }
    void alternativeDatumShifts(const OmbRef<OmbDatumShiftInfoVec>& alternatives) { alternatives_ = alternatives; }
    OmbRef<OmbDatumShiftInfoVec> alternativeDatumShiftsForArea(const OmbRect& lola) const;

    // The prime meridian in degrees east of Greenwich.
    double primeMeridianDegrees() const { return primeMeridian_ ? primeMeridian_->longitudeFromGreenwich() : 0; }

    // Same ellipsoid and meridian as WGS 84, and either EPSG 6326 or a shift
    // to WGS 84 that changes nothing.
    bool isWgs84Equivalent() const;
    // The same object; or equivalent ellipsoids and meridians with equal
    // shifts to equal known datums (or both equivalent to WGS 84).
    bool operator==(const OmbGeodeticDatum& other) const;

    // Converts p (long/lat in degrees, height in metres) from this datum to
    // target, walking both to the pivot; OmbXUnconnectedDatums when their
    // pivots differ.
    void changeDatumTo(const OmbGeodeticDatum& target, OmbPoint& p) const;
    // Every point of the array, along one route.
    void changeDatumTo(const OmbGeodeticDatum& target, OmbPointArray& points) const;
    // The bounds of the rectangle's corners and of points along its edges,
    // converted; false, with out untouched, when any of them fails.
    bool changeDatumTo(const OmbGeodeticDatum& target, const OmbRect& in, OmbRect& out) const;

    // The WGS 84 pivot, while the runtime is initialised ("Datums.Wgs84").
    static const OmbRef<OmbGeodeticDatum>& wgs84();
    static void createPredefined();
    static void destroyPredefined();

private:
    OmbString authority_;
    OmbString authorityCode_;
    OmbRef<OmbEllipsoid> ellipsoid_;
    OmbRef<OmbPrimeMeridian> primeMeridian_;
    OmbRef<OmbDatumShift> datumShift_;
    OmbRef<OmbDatumShiftInfoVec> alternatives_;
};
