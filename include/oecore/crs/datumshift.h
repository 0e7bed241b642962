// Datum shifts: how long/lat on one datum become long/lat on the datum the
// shift leads to (its known datum), and back. Points are long/lat in degrees
// with the ellipsoidal height in metres.
//
// Shifts are immutable once read and shared between threads; a Helmert
// shift guards its cached matrices itself.
#pragma once

#include <oecore/config/classdescription.h>
#include <oecore/core/refvec.h>
#include <oecore/core/resourceobject.h>
#include <oecore/crs/datumshiftinfo.h>
#include <oecore/linalg/point.h>

#include <array>
#include <atomic>
#include <memory>
#include <mutex>
#include <optional>

class OmbGeodeticDatum;

// 0 is success; 1: the shift does not cover the point.
using OmbDatumShiftStatus = int;

// The direction in which a shift's stored parameters apply.
enum class OmbDatumShiftDirection { ToKnownDatum = 0, FromKnownDatum = 1 };
OMB_DESCRIBE_ENUM(OmbDatumShiftDirection, "DatumShiftDirection", {{"ToKnownDatum", 0}, {"FromKnownDatum", 1}})

class OmbDatumShift : public OmbResourceObject {
    OMB_DECLARE_ENGINE_CLASS()

public:
    // datum is the datum that owns the shift. The throwing forms raise the
    // shift's error when it cannot convert the point.
    virtual OmbDatumShiftStatus changeDatumToKnownDatum(const OmbGeodeticDatum& datum, OmbPoint& p) const = 0;
    virtual OmbDatumShiftStatus changeDatumFromKnownDatum(const OmbGeodeticDatum& datum, OmbPoint& p) const = 0;
    virtual OmbDatumShiftStatus changeDatumToKnownDatumNoExceptions(const OmbGeodeticDatum& datum, OmbPoint& p) const;
    virtual OmbDatumShiftStatus changeDatumFromKnownDatumNoExceptions(const OmbGeodeticDatum& datum, OmbPoint& p) const;
    virtual bool operator==(const OmbDatumShift& other) const { return this == &other || equivalent(other); }
    // The same class with the same parameters.
    virtual bool equivalent(const OmbDatumShift& other) const = 0;
    // Whether the shift changes nothing.
    virtual bool zeroShifts() const = 0;
    // What is known about the shift; null when nothing is.
    virtual const OmbRef<OmbDatumShiftInfo>& info() const { return info_; }
    void info(const OmbRef<OmbDatumShiftInfo>& info) { info_ = info; }

    const OmbString& authority() const noexcept { return authority_; }
    void authority(const OmbString& a) { authority_ = a; }
    const OmbString& authorityCode() const noexcept { return authorityCode_; }
    void authorityCode(const OmbString& c) { authorityCode_ = c; }
    // The datum the shift leads to; WGS 84 unless set.
    const OmbRef<OmbGeodeticDatum>& knownDatum() const noexcept { return knownDatum_; }
    void knownDatum(const OmbRef<OmbGeodeticDatum>& datum) { knownDatum_ = datum; }

    // A shift built from what the EPSG catalogue (PROJ's database) holds
    // under info's code: a geocentric-translation, position-vector or
    // coordinate-frame transformation between a datum and WGS 84, applied in
    // the direction the catalogue states. The shift keeps info.
    // OmbXUnsupportedDatumShiftCode for another authority, an unknown code
    // or another method.
    static OmbRef<OmbDatumShift> fromInfo(const OmbRef<OmbDatumShiftInfo>& info);

    // One shift belongs to one datum.
    bool takeOwnership(int = 0) {
        bool expected = false;
        return owned_.compare_exchange_strong(expected, true);
    }
    void releaseOwnership() { owned_.store(false); }

protected:
    OmbDatumShift();
    OmbDatumShift(const OmbDatumShift& other);

private:
    OmbString authority_;
    OmbString authorityCode_;
    OmbRef<OmbGeodeticDatum> knownDatum_;
    OmbRef<OmbDatumShiftInfo> info_;
    std::atomic<bool> owned_{false};
};

// An affine map of geocentric coordinates: x' = m x + t.
struct OmbGeocentricTransform {
    std::array<double, 9> m{1, 0, 0, 0, 1, 0, 0, 0, 1};
    std::array<double, 3> t{0, 0, 0};

    void apply(double& x, double& y, double& z) const;
    // This after first.
    OmbGeocentricTransform after(const OmbGeocentricTransform& first) const;
};

enum class OmbRotationSignConvention { CoordinateFrameRotation = 0, PositionVectorTransform = 1 };
OMB_DESCRIBE_ENUM(OmbRotationSignConvention, "RotationSignConvention",
                  {{"CoordinateFrameRotation", 0}, {"PositionVectorTransform", 1}})

// The 7-parameter similarity transform of geocentric coordinates, with exact
// rotation matrices.
class OmbHelmertDatumShift : public OmbDatumShift {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    OmbHelmertDatumShift() = default;
    OmbHelmertDatumShift(const OmbHelmertDatumShift& other);
    OmbHelmertDatumShift* clone() const override { return new OmbHelmertDatumShift(*this); }

    OmbDatumShiftStatus changeDatumToKnownDatum(const OmbGeodeticDatum& datum, OmbPoint& p) const override;
    OmbDatumShiftStatus changeDatumFromKnownDatum(const OmbGeodeticDatum& datum, OmbPoint& p) const override;
    bool equivalent(const OmbDatumShift& other) const override;
    bool zeroShifts() const override;

    // dX, dY, dZ (m), rotations (arc-seconds), scale difference (ppm).
    struct Parameters {
        double dx = 0, dy = 0, dz = 0;
        double rx = 0, ry = 0, rz = 0;
        double scaleDifference = 0;
        OmbRotationSignConvention convention = OmbRotationSignConvention::PositionVectorTransform;
        OmbDatumShiftDirection direction = OmbDatumShiftDirection::ToKnownDatum;
        friend bool operator==(const Parameters&, const Parameters&) = default;
    };
    const Parameters& parameters() const noexcept { return parameters_; }
    void parameters(const Parameters& p);

    // The geocentric maps towards and from the known datum (cached).
    OmbGeocentricTransform toKnown() const;
    OmbGeocentricTransform fromKnown() const;

private:
    void build() const;

    Parameters parameters_;
    mutable std::mutex mutex_;
    mutable std::optional<std::pair<OmbGeocentricTransform, OmbGeocentricTransform>> cached_;
};

// Offsets added to long/lat.
class OmbLoLaOffsetsDatumShift : public OmbDatumShift {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    OmbLoLaOffsetsDatumShift* clone() const override { return new OmbLoLaOffsetsDatumShift(*this); }
    OmbDatumShiftStatus changeDatumToKnownDatum(const OmbGeodeticDatum& datum, OmbPoint& p) const override;
    OmbDatumShiftStatus changeDatumFromKnownDatum(const OmbGeodeticDatum& datum, OmbPoint& p) const override;
    bool equivalent(const OmbDatumShift& other) const override;
    bool zeroShifts() const override { return longitudeOffset == 0 && latitudeOffset == 0; }

    double longitudeOffset = 0;
    double latitudeOffset = 0;
    OmbDatumShiftDirection direction = OmbDatumShiftDirection::ToKnownDatum;
};

// The same datum counted from another prime meridian.
class OmbChangedPrimeMeridianDatumShift : public OmbDatumShift {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    OmbChangedPrimeMeridianDatumShift* clone() const override { return new OmbChangedPrimeMeridianDatumShift(*this); }
    OmbDatumShiftStatus changeDatumToKnownDatum(const OmbGeodeticDatum& datum, OmbPoint& p) const override;
    OmbDatumShiftStatus changeDatumFromKnownDatum(const OmbGeodeticDatum& datum, OmbPoint& p) const override;
    bool equivalent(const OmbDatumShift& other) const override;
    bool zeroShifts() const override { return false; }
};

// Horizontal shifts interpolated in grid files (NTv2, NTv1, CTABLE, CTABLE
// V2); the height is left as it is. The files are the ones in path whose
// names match fileName ("*" and "?" wildcards); where grids overlap, the
// first in the list wins.
class OmbGridFileDatumShift : public OmbDatumShift {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    OmbGridFileDatumShift();
    OmbGridFileDatumShift(const OmbGridFileDatumShift& other);
    ~OmbGridFileDatumShift() override;
    OmbGridFileDatumShift* clone() const override { return new OmbGridFileDatumShift(*this); }

    OmbDatumShiftStatus changeDatumToKnownDatum(const OmbGeodeticDatum& datum, OmbPoint& p) const override;
    OmbDatumShiftStatus changeDatumFromKnownDatum(const OmbGeodeticDatum& datum, OmbPoint& p) const override;
    // These still throw when the grid files cannot be found or opened.
    OmbDatumShiftStatus changeDatumToKnownDatumNoExceptions(const OmbGeodeticDatum& datum, OmbPoint& p) const override;
    OmbDatumShiftStatus changeDatumFromKnownDatumNoExceptions(const OmbGeodeticDatum& datum,
                                                              OmbPoint& p) const override;
    bool equivalent(const OmbDatumShift& other) const override;
    bool zeroShifts() const override { return false; }

    // Finds the grid files and opens them; the first conversion does this
    // when nobody did before. Throws when no file matches.
    void construct() const;
    // The full names of the grid files in the order they are tried, joined
    // with ",".
    OmbString gridList() const;

    OmbString path;
    OmbString fileName;
    bool searchSubdirectories = false;
    OmbDatumShiftDirection direction = OmbDatumShiftDirection::ToKnownDatum;

private:
    struct Grids;
    OmbDatumShiftStatus convert(OmbPoint& p, bool forward) const;
    void throwOutside(const OmbPoint& p) const;
    Grids& grids() const;

    mutable std::mutex mutex_;
    mutable std::unique_ptr<Grids> grids_;
};

// Declares two datums the same.
class OmbIdentityDatumShift : public OmbDatumShift {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    OmbIdentityDatumShift* clone() const override { return new OmbIdentityDatumShift(*this); }
    OmbDatumShiftStatus changeDatumToKnownDatum(const OmbGeodeticDatum&, OmbPoint&) const override { return 0; }
    OmbDatumShiftStatus changeDatumFromKnownDatum(const OmbGeodeticDatum&, OmbPoint&) const override { return 0; }
    bool equivalent(const OmbDatumShift& other) const override;
    bool zeroShifts() const override { return true; }
};

// The first of its alternatives that covers the point.
class OmbFallbackDatumShift : public OmbDatumShift {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    using Alternatives = OmbRefVec<OmbDatumShift>;

    OmbFallbackDatumShift* clone() const override { return new OmbFallbackDatumShift(*this); }
    OmbDatumShiftStatus changeDatumToKnownDatum(const OmbGeodeticDatum& datum, OmbPoint& p) const override;
    OmbDatumShiftStatus changeDatumFromKnownDatum(const OmbGeodeticDatum& datum, OmbPoint& p) const override;
    OmbDatumShiftStatus changeDatumToKnownDatumNoExceptions(const OmbGeodeticDatum& datum, OmbPoint& p) const override;
    OmbDatumShiftStatus changeDatumFromKnownDatumNoExceptions(const OmbGeodeticDatum& datum,
                                                              OmbPoint& p) const override;
    bool equivalent(const OmbDatumShift& other) const override;
    bool zeroShifts() const override { return false; }

    const OmbRef<Alternatives>& alternatives() const noexcept { return alternatives_; }
    // At least two, all leading to the same known datum, which becomes this
    // shift's; otherwise the construction errors.
    void alternatives(const OmbRef<Alternatives>& alternatives);

private:
    OmbRef<Alternatives> alternatives_;
};
