#include <oecore/core/exception.h>
#include <oecore/core/runtime.h>
#include <oecore/crs/geodeticdatum.h>

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

void OmbGeodeticDatum::changeDatumTo(const OmbGeodeticDatum& target, OmbPoint& p) const {
    if (this == &target) return;
    const std::vector<const OmbGeodeticDatum*> from = chainToPivot(*this);
    const std::vector<const OmbGeodeticDatum*> to = chainToPivot(target);
    if (!endsAtPivot(from) || !endsAtPivot(to) || from.back() != to.back())
        OMB_THROW(UnconnectedDatums, name(), target.name());

    // Two Helmert shifts to one known datum: one geocentric map.
    const auto* sourceShift = dynamic_cast<const OmbHelmertDatumShift*>(datumShift_.get());
    const auto* targetShift = dynamic_cast<const OmbHelmertDatumShift*>(target.datumShift_.get());
    if (sourceShift && targetShift && sourceShift->knownDatum() == targetShift->knownDatum()) {
        const OmbGeocentricTransform map = targetShift->fromKnown().after(sourceShift->toKnown());
        ellipsoid_->geodeticToGeocentricXYZ(p.x, p.y, p.z);
        map.apply(p.x, p.y, p.z);
        target.ellipsoid_->geocentricXYZToGeodetic(p.x, p.y, p.z);
        return;
    }
    for (std::size_t i = 0; i + 1 < from.size(); ++i) from[i]->datumShift_->changeDatumToKnownDatum(*from[i], p);
    for (std::size_t i = to.size() - 1; i-- > 0;) to[i]->datumShift_->changeDatumFromKnownDatum(*to[i], p);
}

bool OmbGeodeticDatum::changeDatumTo(const OmbGeodeticDatum& target, const OmbRect& in, OmbRect& out) const {
    // Datum shifts bend edges only slightly; eight pieces per edge follow them.
    constexpr int piecesPerEdge = 8;
    OmbRect converted = OmbRect::invalid();
    try {
        for (int i = 0; i < piecesPerEdge; ++i) {
            const double t = double(i) / piecesPerEdge;
            const double x = in.xmin + t * in.width(), y = in.ymin + t * in.height();
            for (OmbPoint p : {OmbPoint(x, in.ymin), OmbPoint(in.xmax - (x - in.xmin), in.ymax),
                               OmbPoint(in.xmin, in.ymax - (y - in.ymin)), OmbPoint(in.xmax, y)}) {
                changeDatumTo(target, p);
                converted.include(p);
            }
        }
    } catch (const OmbException&) {
        return false;
    }
    out = converted;
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
