#include <oecore/core/exception.h>
#include <oecore/core/runtime.h>
#include <oecore/crs/geodeticdatum.h>

#include <optional>
#include <utility>
#include <vector>

OMB_DEFINE_ENGINE_CLASS(OmbGeodeticDatum, OmbResourceObject, "GeodeticDatum", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbGeodeticDatum)

OMB_DESCRIBE_CLASS(OmbGeodeticDatum) {
    using D = OmbGeodeticDatum;
    Omb_describeAuthority(d);
    d.object<OmbEllipsoid>(
         "Ellipsoid", [](const D& x) { return x.ellipsoid(); },
         [](D& x, const OmbRef<OmbEllipsoid>& v) { x.ellipsoid(v); })
        .required();
    d.object<OmbPrimeMeridian>(
        "PrimeMeridian", [](const D& x) { return x.primeMeridian(); },
        [](D& x, const OmbRef<OmbPrimeMeridian>& v) { x.primeMeridian(v); });
    d.object<OmbDatumShift>(
        "DatumShift", [](const D& x) { return x.datumShift(); },
        [](D& x, const OmbRef<OmbDatumShift>& v) { x.datumShift(v); });
    d.collection<OmbDatumShiftInfoVec>(
        "AlternativeDatumShifts", "DatumShiftInfoCollection", [](const D& x) { return x.alternativeDatumShifts(); },
        [](D& x, const OmbRef<OmbDatumShiftInfoVec>& v) { x.alternativeDatumShifts(v); });
}

namespace {

OmbRef<OmbGeodeticDatum> wgs84Datum;

[[maybe_unused]] const bool registered =
    (OmbRuntime::registerPredefinedClass(OmbRuntime::PredefinedClass::GeodeticDatums,
                                         OmbGeodeticDatum::createPredefined, OmbGeodeticDatum::destroyPredefined),
     true);

// A datum and the datums its shifts lead to, ending with its pivot. A chain
// longer than any real one means the shifts form a loop.
std::vector<const OmbGeodeticDatum*> chainToPivot(const OmbGeodeticDatum& datum) {
    constexpr std::size_t longest = 64;
    std::vector<const OmbGeodeticDatum*> chain{&datum};
    while (chain.back()->datumShift() && chain.back()->datumShift()->knownDatum() && chain.size() <= longest)
        chain.push_back(chain.back()->datumShift()->knownDatum().get());
    return chain;
}

bool endsAtPivot(const std::vector<const OmbGeodeticDatum*>& chain) { return !chain.back()->datumShift(); }

}  // namespace

OmbGeodeticDatum::OmbGeodeticDatum()
    : ellipsoid_(OmbEllipsoid::wgs84() ? OmbEllipsoid::wgs84() : OmbRef<OmbEllipsoid>(new OmbEllipsoid)),
      primeMeridian_(OmbPrimeMeridian::greenwich() ? OmbPrimeMeridian::greenwich()
                                                   : OmbRef<OmbPrimeMeridian>(new OmbPrimeMeridian)) {}

OmbGeodeticDatum::OmbGeodeticDatum(const OmbRef<OmbEllipsoid>& ellipsoid, const OmbRef<OmbPrimeMeridian>& primeMeridian,
                                   const OmbRef<OmbDatumShift>& datumShift)
    : ellipsoid_(ellipsoid), primeMeridian_(primeMeridian) {
    this->datumShift(datumShift);
}

void OmbGeodeticDatum::datumShift(const OmbRef<OmbDatumShift>& shift) {
    if (shift == datumShift_) return;
    if (shift && !shift->takeOwnership()) OMB_THROW(SharingViolation, OmbString::literal("DatumShift"));
    if (datumShift_) datumShift_->releaseOwnership();
    datumShift_ = shift;
}

bool OmbGeodeticDatum::isWgs84Equivalent() const {
    const OmbRef<OmbGeodeticDatum>& wgs84 = OmbGeodeticDatum::wgs84();
    if (!wgs84 || this == wgs84.get()) return this == wgs84.get();
    if (!ellipsoid_->equivalent(*wgs84->ellipsoid()) || primeMeridianDegrees() != wgs84->primeMeridianDegrees())
        return false;
    if (authority_ == OmbString::literal("epsg") && authorityCode_ == OmbString::literal("6326")) return true;
    return datumShift_ && datumShift_->knownDatum() == wgs84 && datumShift_->zeroShifts();
}

namespace {

// How points travel from one datum to another, worked out once for all the
// points of a call: up the source's chain of shifts to the pivot and down
// the target's, or one geocentric map when both datums have Helmert shifts
// to the same datum.
class DatumRoute {
public:
    DatumRoute(const OmbGeodeticDatum& source, const OmbGeodeticDatum& target)
        : source_(source), target_(target), up_(chainToPivot(source)), down_(chainToPivot(target)) {
        if (!endsAtPivot(up_) || !endsAtPivot(down_) || up_.back() != down_.back())
            OMB_THROW(UnconnectedDatums, source.name(), target.name());
        const auto* from = dynamic_cast<const OmbHelmertDatumShift*>(source.datumShift().get());
        const auto* to = dynamic_cast<const OmbHelmertDatumShift*>(target.datumShift().get());
        if (from && to && from->knownDatum() == to->knownDatum()) helmert_ = to->fromKnown().after(from->toKnown());
    }

    void apply(OmbPoint& p) const {
        if (helmert_) {
            source_.ellipsoid()->geodeticToGeocentricXYZ(p.x, p.y, p.z);
            helmert_->apply(p.x, p.y, p.z);
            target_.ellipsoid()->geocentricXYZToGeodetic(p.x, p.y, p.z);
            return;
        }
        for (std::size_t i = 0; i + 1 < up_.size(); ++i) up_[i]->datumShift()->changeDatumToKnownDatum(*up_[i], p);
        for (std::size_t i = down_.size() - 1; i-- > 0;)
            down_[i]->datumShift()->changeDatumFromKnownDatum(*down_[i], p);
    }

private:
    const OmbGeodeticDatum& source_;
    const OmbGeodeticDatum& target_;
    std::vector<const OmbGeodeticDatum*> up_, down_;
    std::optional<OmbGeocentricTransform> helmert_;
};

}  // namespace

void OmbGeodeticDatum::changeDatumTo(const OmbGeodeticDatum& target, OmbPoint& p) const {
    if (this != &target) DatumRoute(*this, target).apply(p);
}

void OmbGeodeticDatum::changeDatumTo(const OmbGeodeticDatum& target, OmbPointArray& points) const {
    if (this == &target || points.empty()) return;
    const DatumRoute route(*this, target);
    for (OmbPoint& p : points) route.apply(p);
}

bool OmbGeodeticDatum::changeDatumTo(const OmbGeodeticDatum& target, const OmbRect& in, OmbRect& out) const {
    // Datum shifts bend edges only slightly; eight pieces per edge follow them.
    constexpr int piecesPerEdge = 8;
    OmbPointArray outline;
    outline.reserve(4 * piecesPerEdge);
    for (int i = 0; i < piecesPerEdge; ++i) {
        const double dx = i * in.width() / piecesPerEdge, dy = i * in.height() / piecesPerEdge;
        for (const OmbPoint& p : {OmbPoint(in.xmin + dx, in.ymin), OmbPoint(in.xmax, in.ymin + dy),
                                  OmbPoint(in.xmax - dx, in.ymax), OmbPoint(in.xmin, in.ymax - dy)})
            outline.push_back(p);
    }
    try {
        changeDatumTo(target, outline);
    } catch (const OmbException&) {
        return false;
    }
    out = OmbRect::invalid();
    for (const OmbPoint& p : std::as_const(outline)) out.include(p);
    return true;
}

const OmbRef<OmbGeodeticDatum>& OmbGeodeticDatum::wgs84() { return wgs84Datum; }

void OmbGeodeticDatum::createPredefined() {
    wgs84Datum = OmbRef<OmbGeodeticDatum>(
        new OmbGeodeticDatum(OmbEllipsoid::wgs84(), OmbPrimeMeridian::greenwich(), OmbRef<OmbDatumShift>()));
    wgs84Datum->name(OmbString::literal("Wgs84"));
    wgs84Datum->authority(OmbString::literal("epsg"));
    wgs84Datum->authorityCode(OmbString::literal("6326"));
    OmbRuntime::registerPredefined(OmbString::literal("Datums.Wgs84"), OmbRef<OmbEngineObject>(wgs84Datum));
}

void OmbGeodeticDatum::destroyPredefined() { wgs84Datum.reset(); }

OmbRef<OmbDatumShiftInfoVec> OmbGeodeticDatum::alternativeDatumShiftsForArea(const OmbRect& lola) const {
    OmbRef<OmbDatumShiftInfoVec> found(new OmbDatumShiftInfoVec);
    if (alternatives_)
        for (const OmbRef<OmbDatumShiftInfo>& info : *alternatives_)
            if (info && info->appliesTo(lola)) found->add(info);
    return found;
}

namespace {

// Datums compare along their chains of shifts; a chain that loops (which
// changeDatumTo refuses) stops the comparison as unequal.
bool sameDatum(const OmbGeodeticDatum& a, const OmbGeodeticDatum& b, int depth) {
    if (&a == &b) return true;
    if (depth > 64 || !a.ellipsoid() || !b.ellipsoid() || !a.ellipsoid()->equivalent(*b.ellipsoid())) return false;
    if (a.primeMeridianDegrees() != b.primeMeridianDegrees()) return false;
    if (a.isWgs84Equivalent() && b.isWgs84Equivalent()) return true;
    if (!a.datumShift() || !b.datumShift() || !(*a.datumShift() == *b.datumShift())) return false;
    const OmbRef<OmbGeodeticDatum>& knownA = a.datumShift()->knownDatum();
    const OmbRef<OmbGeodeticDatum>& knownB = b.datumShift()->knownDatum();
    return knownA && knownB && sameDatum(*knownA, *knownB, depth + 1);
}

}  // namespace

bool OmbGeodeticDatum::operator==(const OmbGeodeticDatum& other) const { return sameDatum(*this, other, 0); }
