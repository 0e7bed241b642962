#include "projectiondescriptions.h"
#include "projectionmath.h"

#include <oecore/crs/projections/dynamiclocal.h>

#include <cmath>

using namespace OmbProjectionMath;

OMB_DEFINE_ENGINE_CLASS(OmbDynamicLocalProjection, OmbProjection, "DynamicLocalProjection", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbDynamicLocalProjection)

OMB_DESCRIBE_CLASS(OmbDynamicLocalProjection) {
    using D = OmbDynamicLocalProjection;
    d.property<double>(
        "CentralLatitude", [](const D& p) { return p.centre().y; },
        [](D& p, double v) { p.set(p.centre().x, v, p.up()); });
    d.property<double>(
        "CentralLongitude", [](const D& p) { return p.centre().x; },
        [](D& p, double v) { p.set(v, p.centre().y, p.up()); });
    d.property<double>(
        "Up", [](const D& p) { return p.up(); }, [](D& p, double v) { p.up(v); });
    d.object<OmbLengthUnit>(
        "LengthUnit", [](const D& p) { return p.configuredLengthUnit(); },
        [](D& p, const OmbRef<OmbLengthUnit>& v) { p.lengthUnit(v); });
}

namespace {

// A nautical mile per arc minute.
constexpr double metersPerDegree = 111120;

}  // namespace

OmbDynamicLocalProjection::OmbDynamicLocalProjection() { set(0, 0, 0); }

OmbDynamicLocalProjection::OmbDynamicLocalProjection(const OmbDynamicLocalProjection& other) : OmbProjection(other) {
    std::lock_guard<std::mutex> lock(other.mutex_);
    up_ = other.up_;
    frame_ = other.frame_;
}

void OmbDynamicLocalProjection::set(double longitude, double latitude, double up) {
    Frame f;
    f.longitude = longitude, f.latitude = latitude;
    f.ky = metersPerDegree;
    f.kx = f.ky * std::max(std::cos(latitude * radiansPerDegree), 0.1);
    f.cosUp = std::cos(up * radiansPerDegree), f.sinUp = std::sin(up * radiansPerDegree);
    std::lock_guard<std::mutex> lock(mutex_);
    up_ = up;
    frame_ = f;
}

double OmbDynamicLocalProjection::up() const {
    std::lock_guard<std::mutex> lock(mutex_);
    return up_;
}

void OmbDynamicLocalProjection::up(double degrees) {
    const OmbPoint c = centre();
    set(c.x, c.y, degrees);
}

OmbPoint OmbDynamicLocalProjection::centre() const {
    std::lock_guard<std::mutex> lock(mutex_);
    return {frame_.longitude, frame_.latitude};
}

OmbDynamicLocalProjection::Frame OmbDynamicLocalProjection::frame() const {
    std::lock_guard<std::mutex> lock(mutex_);
    return frame_;
}

void OmbDynamicLocalProjection::forward(const Frame& f, double unitsPerMeter, OmbPoint& p) {
    const double x0 = wrapLongitude(p.x - f.longitude) * f.kx * unitsPerMeter;
    const double y0 = (p.y - f.latitude) * f.ky * unitsPerMeter;
    p.x = f.cosUp * x0 - f.sinUp * y0;
    p.y = f.cosUp * y0 + f.sinUp * x0;
}

void OmbDynamicLocalProjection::inverse(const Frame& f, double metersPerUnit, OmbPoint& p) {
    const double x0 = (f.cosUp * p.x + f.sinUp * p.y) * metersPerUnit;
    const double y0 = (f.cosUp * p.y - f.sinUp * p.x) * metersPerUnit;
    p.x = wrapLongitude(f.longitude + x0 / f.kx);
    p.y = f.latitude + y0 / f.ky;
}

void OmbDynamicLocalProjection::project(OmbPointArray& points, const OmbProjCachedNumbers* cached) const {
    const Frame f = frame();
    for (OmbPoint& p : points) forward(f, cached->unitsPerMeter, p);
}

void OmbDynamicLocalProjection::project(OmbPoint& p, const OmbProjCachedNumbers* cached) const {
    forward(frame(), cached->unitsPerMeter, p);
}

void OmbDynamicLocalProjection::unproject(OmbPointArray& points, const OmbProjCachedNumbers* cached) const {
    const Frame f = frame();
    for (OmbPoint& p : points) inverse(f, cached->metersPerUnit, p);
}

void OmbDynamicLocalProjection::unproject(OmbPoint& p, const OmbProjCachedNumbers* cached) const {
    inverse(frame(), cached->metersPerUnit, p);
}

void OmbDynamicLocalProjection::nominalMetersXY(const OmbProjCachedNumbers* cached, double& mx, double& my) const {
    mx = my = cached->metersPerUnit;
}

bool OmbDynamicLocalProjection::equivalent(const OmbProjection& other) const {
    if (this == &other) return true;
    const auto* d = dynamic_cast<const OmbDynamicLocalProjection*>(&other);
    if (!d || !lengthUnit()->equivalent(*d->lengthUnit())) return false;
    const Frame a = frame(), b = d->frame();
    return a.longitude == b.longitude && a.latitude == b.latitude && up() == d->up();
}
