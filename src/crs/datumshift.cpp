#include <oecore/core/exception.h>
#include <oecore/core/stringbuilder.h>
#include <oecore/core/stringutils.h>
#include <oecore/crs/geodeticdatum.h>

#include <proj.h>

#include <algorithm>
#include <cmath>
#include <filesystem>
#include <vector>

OMB_DEFINE_ENGINE_CLASS(OmbDatumShift, OmbResourceObject, "DatumShift", 0)
OMB_DEFINE_ENGINE_CLASS(OmbHelmertDatumShift, OmbDatumShift, "HelmertDatumShift", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbHelmertDatumShift)
OMB_DEFINE_ENGINE_CLASS(OmbGridFileDatumShift, OmbDatumShift, "GridFileDatumShift", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbGridFileDatumShift)
OMB_DEFINE_ENGINE_CLASS(OmbLoLaOffsetsDatumShift, OmbDatumShift, "LongLatOffsetDatumShift", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbLoLaOffsetsDatumShift)
OMB_DEFINE_ENGINE_CLASS(OmbChangedPrimeMeridianDatumShift, OmbDatumShift, "ChangedPrimeMeridianDatumShift", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbChangedPrimeMeridianDatumShift)
OMB_DEFINE_ENGINE_CLASS(OmbIdentityDatumShift, OmbDatumShift, "IdentityDatumShift", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbIdentityDatumShift)
OMB_DEFINE_ENGINE_CLASS(OmbFallbackDatumShift, OmbDatumShift, "FallbackDatumShift", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbFallbackDatumShift)

// --- configuration ---------------------------------------------------------------

OMB_DESCRIBE_CLASS(OmbDatumShift) {
    Omb_describeAuthority(d);
    d.object<OmbGeodeticDatum>(
        "KnownDatum", [](const OmbDatumShift& s) { return s.knownDatum(); },
        [](OmbDatumShift& s, const OmbRef<OmbGeodeticDatum>& v) { s.knownDatum(v); });
    d.object<OmbDatumShiftInfo>(
        "Info", [](const OmbDatumShift& s) { return s.info(); },
        [](OmbDatumShift& s, const OmbRef<OmbDatumShiftInfo>& v) { s.info(v); });
}

namespace {

// A Helmert parameter read and written through the parameter record.
template <class V>
void helmert(OmbDescriptionBuilder<OmbHelmertDatumShift>& d, const char* name,
             V OmbHelmertDatumShift::Parameters::*field, V defaultValue) {
    d.property<V>(
        name, [field](const OmbHelmertDatumShift& s) { return s.parameters().*field; },
        [field](OmbHelmertDatumShift& s, const V& v) {
            OmbHelmertDatumShift::Parameters p = s.parameters();
            p.*field = v;
            s.parameters(p);
        },
        defaultValue);
}

}  // namespace

OMB_DESCRIBE_CLASS(OmbHelmertDatumShift) {
    using P = OmbHelmertDatumShift::Parameters;
    helmert(d, "DX", &P::dx, 0.0);
    helmert(d, "DY", &P::dy, 0.0);
    helmert(d, "DZ", &P::dz, 0.0);
    helmert(d, "RotationX", &P::rx, 0.0);
    helmert(d, "RotationY", &P::ry, 0.0);
    helmert(d, "RotationZ", &P::rz, 0.0);
    helmert(d, "ScaleDifference", &P::scaleDifference, 0.0);
    helmert(d, "RotationSignConvention", &P::convention, OmbRotationSignConvention::PositionVectorTransform);
    helmert(d, "Direction", &P::direction, OmbDatumShiftDirection::ToKnownDatum);
}

OMB_DESCRIBE_CLASS(OmbGridFileDatumShift) {
    using S = OmbGridFileDatumShift;
    d.property<OmbString>("Path", &S::path, [](S& s, const OmbString& v) { s.path = v; }).required();
    d.property<OmbString>("FileName", &S::fileName, [](S& s, const OmbString& v) { s.fileName = v; }).required();
    d.property<bool>(
        "SearchSubdirectories", &S::searchSubdirectories, [](S& s, bool v) { s.searchSubdirectories = v; }, false);
    d.property<OmbDatumShiftDirection>(
        "Direction", &S::direction, [](S& s, OmbDatumShiftDirection v) { s.direction = v; },
        OmbDatumShiftDirection::ToKnownDatum);
}

OMB_DESCRIBE_CLASS(OmbLoLaOffsetsDatumShift) {
    using S = OmbLoLaOffsetsDatumShift;
    d.property<double>("LongitudeOffset", &S::longitudeOffset, [](S& s, double v) { s.longitudeOffset = v; });
    d.property<double>("LatitudeOffset", &S::latitudeOffset, [](S& s, double v) { s.latitudeOffset = v; });
    d.property<OmbDatumShiftDirection>(
        "Direction", &S::direction, [](S& s, OmbDatumShiftDirection v) { s.direction = v; },
        OmbDatumShiftDirection::ToKnownDatum);
}

OMB_DESCRIBE_CLASS(OmbChangedPrimeMeridianDatumShift) {}
OMB_DESCRIBE_CLASS(OmbIdentityDatumShift) {}

OMB_DESCRIBE_CLASS(OmbFallbackDatumShift) {
    using S = OmbFallbackDatumShift;
    d.collection<S::Alternatives>(
         "Alternatives", "DatumShiftCollection", [](const S& s) { return s.alternatives(); },
         [](S& s, const OmbRef<S::Alternatives>& v) { s.alternatives(v); })
        .required();
}

// --- the base --------------------------------------------------------------------

OmbDatumShift::OmbDatumShift() : knownDatum_(OmbGeodeticDatum::wgs84()) {}

OmbDatumShift::OmbDatumShift(const OmbDatumShift& other)
    : OmbResourceObject(other),
      authority_(other.authority_),
      authorityCode_(other.authorityCode_),
      knownDatum_(other.knownDatum_),
      info_(other.info_) {}

OmbDatumShiftStatus OmbDatumShift::changeDatumToKnownDatumNoExceptions(const OmbGeodeticDatum& datum,
                                                                       OmbPoint& p) const {
    return changeDatumToKnownDatum(datum, p);
}

OmbDatumShiftStatus OmbDatumShift::changeDatumFromKnownDatumNoExceptions(const OmbGeodeticDatum& datum,
                                                                         OmbPoint& p) const {
    return changeDatumFromKnownDatum(datum, p);
}

namespace {

bool sameKnownDatum(const OmbDatumShift& a, const OmbDatumShift& b) { return a.knownDatum() == b.knownDatum(); }

// One step of 360 degrees back into [-180, 180].
double wrap(double lon) {
    if (lon > 180) return lon - 360;
    if (lon < -180) return lon + 360;
    return lon;
}

OmbString number(double v) {
    OmbStringBuilder text;
    text << OmbFormat::real(v);
    return text.str();
}

}  // namespace

// --- geocentric maps ---------------------------------------------------------------

void OmbGeocentricTransform::apply(double& x, double& y, double& z) const {
    const double nx = m[0] * x + m[1] * y + m[2] * z + t[0];
    const double ny = m[3] * x + m[4] * y + m[5] * z + t[1];
    const double nz = m[6] * x + m[7] * y + m[8] * z + t[2];
    x = nx, y = ny, z = nz;
}

OmbGeocentricTransform OmbGeocentricTransform::after(const OmbGeocentricTransform& first) const {
    OmbGeocentricTransform out;
    for (int r = 0; r < 3; ++r) {
        for (int c = 0; c < 3; ++c)
            out.m[3 * r + c] = m[3 * r] * first.m[c] + m[3 * r + 1] * first.m[3 + c] + m[3 * r + 2] * first.m[6 + c];
        out.t[r] = m[3 * r] * first.t[0] + m[3 * r + 1] * first.t[1] + m[3 * r + 2] * first.t[2] + t[r];
    }
    return out;
}

// --- Helmert -----------------------------------------------------------------------

OmbHelmertDatumShift::OmbHelmertDatumShift(const OmbHelmertDatumShift& other)
    : OmbDatumShift(other), parameters_(other.parameters_) {}

void OmbHelmertDatumShift::parameters(const Parameters& p) {
    std::lock_guard lock(mutex_);
    parameters_ = p;
    cached_.reset();
}

// X' = T + R (m X) with R = Rz Ry Rx from exact rotations, and its inverse
// X = (1/m) R^T (X' - T).
void OmbHelmertDatumShift::build() const {
    const Parameters& p = parameters_;
    const double sign = p.convention == OmbRotationSignConvention::PositionVectorTransform ? 1 : -1;
    const double toRadians = sign * 3.14159265358979323846 / 180 / 3600;
    const double ax = p.rx * toRadians, ay = p.ry * toRadians, az = p.rz * toRadians;
    const double cx = std::cos(ax), sx = std::sin(ax), cy = std::cos(ay), sy = std::sin(ay);
    const double cz = std::cos(az), sz = std::sin(az);
    // Rz * Ry * Rx
    const std::array<double, 9> r{cz * cy,
                                  cz * sy * sx - sz * cx,
                                  cz * sy * cx + sz * sx,
                                  sz * cy,
                                  sz * sy * sx + cz * cx,
                                  sz * sy * cx - cz * sx,
                                  -sy,
                                  cy * sx,
                                  cy * cx};
    const double scale = 1 + p.scaleDifference * 1e-6;
    OmbGeocentricTransform forward;
    for (int i = 0; i < 9; ++i) forward.m[i] = r[i] * scale;
    forward.t = {p.dx, p.dy, p.dz};
    OmbGeocentricTransform inverse;
    for (int row = 0; row < 3; ++row)
        for (int col = 0; col < 3; ++col) inverse.m[3 * row + col] = r[3 * col + row] / scale;
    for (int row = 0; row < 3; ++row)
        inverse.t[row] = -(inverse.m[3 * row] * p.dx + inverse.m[3 * row + 1] * p.dy + inverse.m[3 * row + 2] * p.dz);
    if (p.direction == OmbDatumShiftDirection::ToKnownDatum)
        cached_.emplace(forward, inverse);
    else
        cached_.emplace(inverse, forward);
}

OmbGeocentricTransform OmbHelmertDatumShift::toKnown() const {
    std::lock_guard lock(mutex_);
    if (!cached_) build();
    return cached_->first;
}

OmbGeocentricTransform OmbHelmertDatumShift::fromKnown() const {
    std::lock_guard lock(mutex_);
    if (!cached_) build();
    return cached_->second;
}

namespace {

void shiftGeocentric(const OmbEllipsoid& from, const OmbEllipsoid& to, const OmbGeocentricTransform& map, OmbPoint& p) {
    from.geodeticToGeocentricXYZ(p.x, p.y, p.z);
    map.apply(p.x, p.y, p.z);
    to.geocentricXYZToGeodetic(p.x, p.y, p.z);
}

}  // namespace

OmbDatumShiftStatus OmbHelmertDatumShift::changeDatumToKnownDatum(const OmbGeodeticDatum& datum, OmbPoint& p) const {
    shiftGeocentric(*datum.ellipsoid(), *knownDatum()->ellipsoid(), toKnown(), p);
    return 0;
}

OmbDatumShiftStatus OmbHelmertDatumShift::changeDatumFromKnownDatum(const OmbGeodeticDatum& datum, OmbPoint& p) const {
    shiftGeocentric(*knownDatum()->ellipsoid(), *datum.ellipsoid(), fromKnown(), p);
    return 0;
}

bool OmbHelmertDatumShift::equivalent(const OmbDatumShift& other) const {
    const auto* h = dynamic_cast<const OmbHelmertDatumShift*>(&other);
    return h && sameKnownDatum(*this, other) && h->parameters() == parameters();
}

bool OmbHelmertDatumShift::zeroShifts() const {
    const Parameters& p = parameters_;
    return p.dx == 0 && p.dy == 0 && p.dz == 0 && p.rx == 0 && p.ry == 0 && p.rz == 0 && p.scaleDifference == 0;
}

// --- long/lat offsets, changed prime meridian, identity ----------------------------

OmbDatumShiftStatus OmbLoLaOffsetsDatumShift::changeDatumToKnownDatum(const OmbGeodeticDatum&, OmbPoint& p) const {
    const double sign = direction == OmbDatumShiftDirection::ToKnownDatum ? 1 : -1;
    p.x = wrap(p.x + sign * longitudeOffset);
    p.y += sign * latitudeOffset;
    return 0;
}

OmbDatumShiftStatus OmbLoLaOffsetsDatumShift::changeDatumFromKnownDatum(const OmbGeodeticDatum&, OmbPoint& p) const {
    const double sign = direction == OmbDatumShiftDirection::ToKnownDatum ? 1 : -1;
    p.x = wrap(p.x - sign * longitudeOffset);
    p.y -= sign * latitudeOffset;
    return 0;
}

bool OmbLoLaOffsetsDatumShift::equivalent(const OmbDatumShift& other) const {
    const auto* o = dynamic_cast<const OmbLoLaOffsetsDatumShift*>(&other);
    return o && sameKnownDatum(*this, other) && o->longitudeOffset == longitudeOffset &&
           o->latitudeOffset == latitudeOffset && o->direction == direction;
}

OmbDatumShiftStatus OmbChangedPrimeMeridianDatumShift::changeDatumToKnownDatum(const OmbGeodeticDatum& datum,
                                                                               OmbPoint& p) const {
    p.x = wrap(p.x + datum.primeMeridianDegrees() - knownDatum()->primeMeridianDegrees());
    return 0;
}

OmbDatumShiftStatus OmbChangedPrimeMeridianDatumShift::changeDatumFromKnownDatum(const OmbGeodeticDatum& datum,
                                                                                 OmbPoint& p) const {
    p.x = wrap(p.x + knownDatum()->primeMeridianDegrees() - datum.primeMeridianDegrees());
    return 0;
}

bool OmbChangedPrimeMeridianDatumShift::equivalent(const OmbDatumShift& other) const {
    return dynamic_cast<const OmbChangedPrimeMeridianDatumShift*>(&other) && sameKnownDatum(*this, other);
}

bool OmbIdentityDatumShift::equivalent(const OmbDatumShift& other) const {
    return dynamic_cast<const OmbIdentityDatumShift*>(&other) && sameKnownDatum(*this, other);
}

// --- grid files ----------------------------------------------------------------------

namespace {

constexpr std::size_t maxGridFileNameLength = 126;

std::vector<OmbString> findGridFiles(const OmbString& folder, const OmbString& pattern, bool recursive) {
    namespace fs = std::filesystem;
    std::vector<OmbString> found;
    const auto consider = [&](const fs::directory_entry& entry) {
        if (entry.is_regular_file() &&
            OmbStringUtils::wildcardMatch(pattern, OmbString(entry.path().filename().native())))
            found.emplace_back(std::string_view(entry.path().native()));
    };
    const fs::path root{std::string(folder)};
    std::error_code error;
    if (recursive) {
        for (fs::recursive_directory_iterator it(root, error), end; !error && it != end; it.increment(error))
            consider(*it);
    } else {
        for (fs::directory_iterator it(root, error), end; !error && it != end; it.increment(error)) consider(*it);
    }
    std::sort(found.begin(), found.end());
    return found;
}

// The Spanish peninsular grids overlap the Balearic one, whose finer
// values must win on the islands.
void putBalearicGridFirst(std::vector<OmbString>& files) {
    if (files.size() != 2) return;
    const auto leaf = [](const OmbString& f) { return std::filesystem::path(std::string(f)).filename().string(); };
    if (leaf(files[1]) == "BALR2009.gsb" && (leaf(files[0]) == "PENR2009.gsb" || leaf(files[0]) == "R2009V9.gsb"))
        std::swap(files[0], files[1]);
}

OmbString joined(const std::vector<OmbString>& files) {
    OmbString list;
    for (const OmbString& f : files) list += (list.empty() ? "" : ",") + f;
    return list;
}

}  // namespace

// The opened grids. PROJ objects are not thread-safe, so every use holds
// the shift's mutex.
struct OmbGridFileDatumShift::Grids {
    OmbString list;
    bool alaska = false;
    PJ_CONTEXT* context = nullptr;
    PJ* transform = nullptr;

    ~Grids() {
        proj_destroy(transform);
        proj_context_destroy(context);
    }
};

OmbGridFileDatumShift::OmbGridFileDatumShift() = default;

OmbGridFileDatumShift::OmbGridFileDatumShift(const OmbGridFileDatumShift& other)
    : OmbDatumShift(other),
      path(other.path),
      fileName(other.fileName),
      searchSubdirectories(other.searchSubdirectories),
      direction(other.direction) {}

OmbGridFileDatumShift::~OmbGridFileDatumShift() = default;

void OmbGridFileDatumShift::construct() const {
    std::lock_guard lock(mutex_);
    grids();
}

OmbString OmbGridFileDatumShift::gridList() const {
    std::lock_guard lock(mutex_);
    return grids().list;
}

OmbGridFileDatumShift::Grids& OmbGridFileDatumShift::grids() const {
    if (grids_) return *grids_;
    std::vector<OmbString> files = findGridFiles(path, fileName, searchSubdirectories);
    if (files.empty()) OMB_THROW(NoFilesFoundByGridFileDatumShift, name(), path, fileName);
    for (const OmbString& f : files)
        if (f.size() > maxGridFileNameLength) OMB_THROW(TooLongFileNameInGridFileDatumShift, name(), f);
    putBalearicGridFirst(files);

    auto grids = std::make_unique<Grids>();
    grids->list = joined(files);
    grids->alaska = grids->list.contains("alaska") || grids->list.contains("Alaska") || grids->list.contains("ALASKA");
    grids->context = proj_context_create();
    proj_log_level(grids->context, PJ_LOG_NONE);
    const std::string definition = "+proj=hgridshift +grids=\"" + std::string(grids->list) + "\"";
    grids->transform = proj_create(grids->context, definition.c_str());
    if (!grids->transform)
        OMB_THROW(IOException, "GridFileDatumShift " + name() + " cannot read the grid files " + grids->list + ": " +
                                   proj_context_errno_string(grids->context, proj_context_errno(grids->context)));
    grids_ = std::move(grids);
    return *grids_;
}

OmbDatumShiftStatus OmbGridFileDatumShift::convert(OmbPoint& p, bool forward) const {
    std::lock_guard lock(mutex_);
    const Grids& g = grids();
    double lon = p.x;
    if (g.alaska && lon > 160 && p.y > 40) lon -= 360;  // the Alaskan grid lies west of -180
    constexpr double toRadians = M_PI / 180;
    const PJ_COORD in = proj_coord(lon * toRadians, p.y * toRadians, 0, 0);
    const PJ_COORD out = proj_trans(g.transform, forward ? PJ_FWD : PJ_INV, in);
    // PROJ reports points outside every grid as errors. A point that comes
    // back unchanged lies where the grids shift by nothing: it is covered.
    const bool failed = proj_errno(g.transform) != 0 || out.lp.lam == HUGE_VAL;
    proj_errno_reset(g.transform);
    if (failed) return 1;
    p.x = out.lp.lam / toRadians;
    if (p.x < -180) p.x += 360;
    p.y = out.lp.phi / toRadians;
    return 0;
}

void OmbGridFileDatumShift::throwOutside(const OmbPoint& p) const {
    OMB_THROW(PointOutsideGridFileDatumShift, number(p.x), number(p.y), name());
}

OmbDatumShiftStatus OmbGridFileDatumShift::changeDatumToKnownDatumNoExceptions(const OmbGeodeticDatum&,
                                                                               OmbPoint& p) const {
    return convert(p, direction == OmbDatumShiftDirection::ToKnownDatum);
}

OmbDatumShiftStatus OmbGridFileDatumShift::changeDatumFromKnownDatumNoExceptions(const OmbGeodeticDatum&,
                                                                                 OmbPoint& p) const {
    return convert(p, direction != OmbDatumShiftDirection::ToKnownDatum);
}

OmbDatumShiftStatus OmbGridFileDatumShift::changeDatumToKnownDatum(const OmbGeodeticDatum& datum, OmbPoint& p) const {
    if (changeDatumToKnownDatumNoExceptions(datum, p) != 0) throwOutside(p);
    return 0;
}

OmbDatumShiftStatus OmbGridFileDatumShift::changeDatumFromKnownDatum(const OmbGeodeticDatum& datum, OmbPoint& p) const {
    if (changeDatumFromKnownDatumNoExceptions(datum, p) != 0) throwOutside(p);
    return 0;
}

bool OmbGridFileDatumShift::equivalent(const OmbDatumShift& other) const {
    const auto* o = dynamic_cast<const OmbGridFileDatumShift*>(&other);
    return o && path == o->path && fileName == o->fileName && searchSubdirectories == o->searchSubdirectories &&
           direction == o->direction && sameKnownDatum(*this, other);
}

// --- fallback ------------------------------------------------------------------------

void OmbFallbackDatumShift::alternatives(const OmbRef<Alternatives>& alternatives) {
    if (!alternatives || alternatives->empty()) OMB_THROW(NoAlternativesInFallbackedDatumShift, name());
    if (alternatives->size() == 1) OMB_THROW(OnlyOneAlternativeInFallbackedDatumShift, name());
    for (std::size_t i = 1; i < alternatives->size(); ++i)
        if (!sameKnownDatum(*alternatives->get(0), *alternatives->get(i)))
            OMB_THROW(AlternativesHaveDifferentKnownDatums, alternatives->get(0)->name(), alternatives->get(i)->name(),
                      name());
    alternatives_ = alternatives;
    knownDatum(alternatives->get(0)->knownDatum());
}

OmbDatumShiftStatus OmbFallbackDatumShift::changeDatumToKnownDatumNoExceptions(const OmbGeodeticDatum& datum,
                                                                               OmbPoint& p) const {
    if (!alternatives_) return 1;
    for (const OmbRef<OmbDatumShift>& alternative : *alternatives_)
        if (alternative->changeDatumToKnownDatumNoExceptions(datum, p) == 0) return 0;
    return 1;
}

OmbDatumShiftStatus OmbFallbackDatumShift::changeDatumFromKnownDatumNoExceptions(const OmbGeodeticDatum& datum,
                                                                                 OmbPoint& p) const {
    if (!alternatives_) return 1;
    for (const OmbRef<OmbDatumShift>& alternative : *alternatives_)
        if (alternative->changeDatumFromKnownDatumNoExceptions(datum, p) == 0) return 0;
    return 1;
}

OmbDatumShiftStatus OmbFallbackDatumShift::changeDatumToKnownDatum(const OmbGeodeticDatum& datum, OmbPoint& p) const {
    if (changeDatumToKnownDatumNoExceptions(datum, p) != 0)
        OMB_THROW(FallbackedDatumShiftFailed, number(p.x), number(p.y), name());
    return 0;
}

OmbDatumShiftStatus OmbFallbackDatumShift::changeDatumFromKnownDatum(const OmbGeodeticDatum& datum, OmbPoint& p) const {
    if (changeDatumFromKnownDatumNoExceptions(datum, p) != 0)
        OMB_THROW(FallbackedDatumShiftFailed, number(p.x), number(p.y), name());
    return 0;
}

bool OmbFallbackDatumShift::equivalent(const OmbDatumShift& other) const {
    const auto* o = dynamic_cast<const OmbFallbackDatumShift*>(&other);
    if (!o || !alternatives_ || !o->alternatives_ || alternatives_->size() != o->alternatives_->size()) return false;
    for (std::size_t i = 0; i < alternatives_->size(); ++i)
        if (!alternatives_->get(i)->equivalent(*o->alternatives_->get(i))) return false;
    return true;
}
