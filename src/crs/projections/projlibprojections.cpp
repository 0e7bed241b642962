// The projections evaluated through PROJ. The definitions carry the
// ellipsoid as "+a=%.6f +f=%.20f", the centre as "+lon_0=%.10f
// +lat_0=%.10f", standard parallels as "%.16f", and a zero false origin,
// which is applied here with the length unit.
#include "projectiondescriptions.h"
#include "projectionmath.h"

#include <oecore/core/exception.h>
#include <oecore/crs/projections/projlibprojections.h>

#include <proj.h>

#include <cmath>
#include <cstdio>
#include <mutex>

using namespace OmbProjectionMath;

OMB_DEFINE_ENGINE_CLASS(OmbAlbersEqualAreaConic, OmbProjection, "AlbersEqualAreaConicProjection", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbAlbersEqualAreaConic)
OMB_DEFINE_ENGINE_CLASS(OmbAzimuthalEqualArea, OmbAzimuthalGlobal, "AzimuthalEqualAreaProjection", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbAzimuthalEqualArea)
OMB_DEFINE_ENGINE_CLASS(OmbCassiniSoldner, OmbProjection, "CassiniSoldnerProjection", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbCassiniSoldner)
OMB_DEFINE_ENGINE_CLASS(OmbHotineObliqueMercator, OmbProjection, "HotineObliqueMercatorProjection", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbHotineObliqueMercator)
OMB_DEFINE_ENGINE_CLASS(OmbLabordeObliqueMercator, OmbProjection, "LabordeObliqueMercatorProjection", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbLabordeObliqueMercator)
OMB_DEFINE_ENGINE_CLASS(OmbNewZealandMapGrid, OmbProjection, "NewZealandMapGridProjection", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbNewZealandMapGrid)

OMB_DESCRIBE_CLASS(OmbAlbersEqualAreaConic) {
    using A = OmbAlbersEqualAreaConic;
    Omb_describeCentre(d);
    Omb_describeFalseOrigin(d);
    d.property<double>(
         "StandardParallel1", [](const A& p) { return p.standardParallel1(); },
         [](A& p, double v) { p.standardParallel1(v); })
        .required();
    d.property<double>(
         "StandardParallel2", [](const A& p) { return p.standardParallel2(); },
         [](A& p, double v) { p.standardParallel2(v); })
        .required();
}

OMB_DESCRIBE_CLASS(OmbAzimuthalEqualArea) { Omb_describeEarthShape(d, OmbEarthShape::Ellipsoid); }

OMB_DESCRIBE_CLASS(OmbCassiniSoldner) {
    Omb_describeCentre(d);
    Omb_describeFalseOrigin(d);
}

OMB_DESCRIBE_CLASS(OmbHotineObliqueMercator) {
    using H = OmbHotineObliqueMercator;
    Omb_describeCentre(d);
    Omb_describeFalseOrigin(d);
    d.property<double>(
        "Azimuth", [](const H& p) { return p.azimuth(); }, [](H& p, double v) { p.azimuth(v); });
    d.property<double>(
        "RectifiedGridAngle", [](const H& p) { return p.rectifiedGridAngle(); },
        [](H& p, double v) { p.rectifiedGridAngle(v); });
    Omb_describeScaleFactor(d);
    d.property<OmbHotineObliqueMercatorTrueOrigin>(
        "TrueOrigin", [](const H& p) { return p.trueOrigin(); },
        [](H& p, OmbHotineObliqueMercatorTrueOrigin v) { p.trueOrigin(v); },
        OmbHotineObliqueMercatorTrueOrigin::CentralPoint);
}

OMB_DESCRIBE_CLASS(OmbLabordeObliqueMercator) {
    using L = OmbLabordeObliqueMercator;
    Omb_describeCentre(d);
    Omb_describeFalseOrigin(d);
    d.property<double>(
        "Azimuth", [](const L& p) { return p.azimuth(); }, [](L& p, double v) { p.azimuth(v); });
    Omb_describeScaleFactor(d);
}

OMB_DESCRIBE_CLASS(OmbNewZealandMapGrid) {
    d.object<OmbLengthUnit>(
        "LengthUnit", [](const OmbNewZealandMapGrid& p) { return p.configuredLengthUnit(); },
        [](OmbNewZealandMapGrid& p, const OmbRef<OmbLengthUnit>& v) { p.lengthUnit(v); });
}

namespace {

std::string format(const char* key, const char* pattern, double value) {
    char text[96];
    std::snprintf(text, sizeof text, pattern, key, value);
    return text;
}

// A PROJ object for one definition. PROJ objects are not to be used from
// two threads at once: calls are serialised.
class ProjLibCachedNumbers : public OmbProjCachedNumbers {
public:
    ProjLibCachedNumbers(const OmbGeodeticDatum& datum, const OmbProjection& projection)
        : OmbProjCachedNumbers(datum, projection.metersPerProjUnit()),
          falseEasting(projection.falseEasting()),
          falseNorthing(projection.falseNorthing()) {}
    ~ProjLibCachedNumbers() override {
        if (pj) proj_destroy(pj);
        proj_context_destroy(context);
    }

    void create(const OmbProjection& projection, const std::string& definition) {
        proj_log_level(context, PJ_LOG_NONE);  // failures become exceptions
        pj = proj_create(context, definition.c_str());
        if (!pj)
            OMB_THROW(ProjectionError, projection.name().empty() ? projection.myRuntimeClassName() : projection.name(),
                      OmbString(definition + ": " + proj_context_errno_string(context, proj_context_errno(context))));
    }

    // In place over n points; false when PROJ failed on any (those become
    // HUGE_VAL). Degrees to units forward, units to degrees inverse.
    bool transform(OmbPoint* points, std::size_t n, PJ_DIRECTION direction) const {
        if (n == 0) return true;
        for (std::size_t i = 0; i < n; ++i) {
            OmbPoint& p = points[i];
            if (direction == PJ_FWD)
                p.x *= radiansPerDegree, p.y *= radiansPerDegree;
            else
                p.x = (p.x - falseEasting) * metersPerUnit, p.y = (p.y - falseNorthing) * metersPerUnit;
        }
        {
            std::lock_guard<std::mutex> lock(mutex);
            proj_errno_reset(pj);
            proj_trans_generic(pj, direction, &points[0].x, sizeof(OmbPoint), n, &points[0].y, sizeof(OmbPoint), n,
                               nullptr, 0, 0, nullptr, 0, 0);
        }
        bool ok = true;
        for (std::size_t i = 0; i < n; ++i) {
            OmbPoint& p = points[i];
            if (p.x == HUGE_VAL || p.y == HUGE_VAL) {
                ok = false;
                continue;
            }
            if (direction == PJ_FWD)
                p.x = falseEasting + p.x * unitsPerMeter, p.y = falseNorthing + p.y * unitsPerMeter;
            else
                p.x = wrapLongitude(p.x * degreesPerRadian), p.y *= degreesPerRadian;
        }
        return ok;
    }

    // Some of PROJ's inverses iterate only to about 1e-7 degrees (Laborde):
    // a Newton step on the forward mapping makes unproject undo project.
    void refineInverse(const OmbPoint& target, OmbPoint& lola) const {
        const auto forward = [this](double lon, double lat, double& x, double& y) {
            OmbPoint p(lon, lat);
            if (!transform(&p, 1, PJ_FWD)) return false;
            x = p.x, y = p.y;
            return true;
        };
        double lon = lola.x, lat = lola.y;
        if (std::fabs(lat) < 89.9 && newtonStep(forward, target.x, target.y, lon, lat))
            lola.x = wrapLongitude(lon), lola.y = lat;
    }

    PJ_CONTEXT* context = proj_context_create();
    PJ* pj = nullptr;
    mutable std::mutex mutex;
    double falseEasting, falseNorthing;
};

const ProjLibCachedNumbers& numbers(const OmbProjCachedNumbers* cached) {
    return *static_cast<const ProjLibCachedNumbers*>(cached);
}

}  // namespace

template <class Base>
OmbProjCachedNumbers* OmbProjLibEvaluated<Base>::init(const OmbGeodeticDatum& datum) const {
    auto* cached = new ProjLibCachedNumbers(datum, *this);
    try {
        cached->create(*this, definition(*cached));
    } catch (...) {
        delete cached;
        throw;
    }
    return cached;
}

template <class Base>
void OmbProjLibEvaluated<Base>::project(OmbPointArray& points, const OmbProjCachedNumbers* cached) const {
    if (!numbers(cached).transform(points.data(), points.size(), PJ_FWD))
        OMB_THROW(ProjectionToFailure, this->name().empty() ? this->myRuntimeClassName() : this->name());
}

template <class Base>
void OmbProjLibEvaluated<Base>::project(OmbPoint& p, const OmbProjCachedNumbers* cached) const {
    const OmbPoint original = p;
    if (!numbers(cached).transform(&p, 1, PJ_FWD)) this->projectionError(original, "PROJ cannot project the point");
}

template <class Base>
void OmbProjLibEvaluated<Base>::unproject(OmbPointArray& points, const OmbProjCachedNumbers* cached) const {
    const OmbPointArray targets = points;
    const ProjLibCachedNumbers& c = numbers(cached);
    if (!c.transform(points.data(), points.size(), PJ_INV))
        OMB_THROW(ProjectionFromFailure, this->name().empty() ? this->myRuntimeClassName() : this->name());
    for (std::size_t i = 0; i < points.size(); ++i) c.refineInverse(targets[i], points[i]);
}

template <class Base>
void OmbProjLibEvaluated<Base>::unproject(OmbPoint& p, const OmbProjCachedNumbers* cached) const {
    const OmbPoint target = p;
    const ProjLibCachedNumbers& c = numbers(cached);
    if (!c.transform(&p, 1, PJ_INV)) this->projectionError(target, "PROJ cannot unproject the point");
    c.refineInverse(target, p);
}

template <class Base>
void OmbProjLibEvaluated<Base>::nominalMetersXY(const OmbProjCachedNumbers* cached, double& mx, double& my) const {
    mx = my = cached->metersPerUnit / this->scaleFactor();
}

template <class Base>
std::string OmbProjLibEvaluated<Base>::ellipsoidParameters(const OmbProjCachedNumbers& cached) {
    return format("+a=", "%s%.6f", cached.a) + " " + format("+f=", "%s%.20f", cached.f);
}

template <class Base>
std::string OmbProjLibEvaluated<Base>::centreParameters() const {
    return format("+lon_0=", "%s%.10f", this->centralLongitude()) + " " +
           format("+lat_0=", "%s%.10f", this->centralLatitude());
}

template class OmbProjLibEvaluated<OmbProjection>;
template class OmbProjLibEvaluated<OmbAzimuthalGlobal>;

std::string OmbAlbersEqualAreaConic::definition(const OmbProjCachedNumbers& cached) const {
    return "+proj=aea " + ellipsoidParameters(cached) + " " + centreParameters() + " " +
           format("+lat_1=", "%s%.16f", standardParallel1_) + " " + format("+lat_2=", "%s%.16f", standardParallel2_) +
           " +x_0=0 +y_0=0 +no_defs";
}

bool OmbAlbersEqualAreaConic::equivalent(const OmbProjection& other) const {
    if (!sameParameters(other)) return false;
    const auto& a = static_cast<const OmbAlbersEqualAreaConic&>(other);
    return standardParallel1_ == a.standardParallel1_ && standardParallel2_ == a.standardParallel2_;
}

std::string OmbAzimuthalEqualArea::definition(const OmbProjCachedNumbers& cached) const {
    const std::string earth = shape() == OmbEarthShape::Sphere
                                  ? format("+R=", "%s%.6f", sphereRadiusFor(cached, centralLatitude()))
                                  : ellipsoidParameters(cached);
    return "+proj=laea " + earth + " " + centreParameters() + " +x_0=0 +y_0=0 +no_defs";
}

bool OmbAzimuthalEqualArea::equivalent(const OmbProjection& other) const {
    if (!sameAzimuthalParameters(other)) return false;
    const auto& a = static_cast<const OmbAzimuthalEqualArea&>(other);
    return sameEarthShape(a);
}

std::string OmbCassiniSoldner::definition(const OmbProjCachedNumbers& cached) const {
    return "+proj=cass " + ellipsoidParameters(cached) + " " + centreParameters() + " +x_0=0 +y_0=0 +no_defs";
}

std::string OmbHotineObliqueMercator::definition(const OmbProjCachedNumbers& cached) const {
    std::string text =
        "+proj=omerc " + ellipsoidParameters(cached) + " " + format("+lat_0=", "%s%.10f", centralLatitude()) + " " +
        format("+lonc=", "%s%.10f", centralLongitude()) + " " + format("+alpha=", "%s%.16f", azimuth_) + " " +
        (rectifiedGridAngle_ == 0 ? std::string("+gamma=0.0") : format("+gamma=", "%s%.16f", rectifiedGridAngle_)) +
        " " + format("+k_0=", "%s%.16f", scaleFactor());
    if (trueOrigin_ == OmbHotineObliqueMercatorTrueOrigin::HotineNaturalOriginNearEquator) text += " +no_uoff";
    return text + " +x_0=0 +y_0=0 +no_defs";
}

bool OmbHotineObliqueMercator::equivalent(const OmbProjection& other) const {
    if (!sameParameters(other)) return false;
    const auto& h = static_cast<const OmbHotineObliqueMercator&>(other);
    return azimuth_ == h.azimuth_ && rectifiedGridAngle_ == h.rectifiedGridAngle_ && trueOrigin_ == h.trueOrigin_;
}

std::string OmbLabordeObliqueMercator::definition(const OmbProjCachedNumbers& cached) const {
    return "+proj=labrd " + ellipsoidParameters(cached) + " " + centreParameters() + " " +
           format("+azi=", "%s%.16f", azimuth_) + " " + format("+k_0=", "%s%.16f", scaleFactor()) +
           " +x_0=0 +y_0=0 +no_defs";
}

bool OmbLabordeObliqueMercator::equivalent(const OmbProjection& other) const {
    return sameParameters(other) && azimuth_ == static_cast<const OmbLabordeObliqueMercator&>(other).azimuth_;
}
