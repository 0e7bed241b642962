#include "projectionmath.h"

#include <oecore/core/exception.h>
#include <oecore/crs/projections/wrappedprojections.h>

#include <cmath>
#include <memory>

using namespace OmbProjectionMath;

OMB_DEFINE_ENGINE_CLASS(OmbWrappingProjection, OmbProjection, "WrappingProjection", 0)
OMB_DEFINE_ENGINE_CLASS(OmbRotatedProjection, OmbWrappingProjection, "RotatedProjection", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbRotatedProjection)
OMB_DEFINE_ENGINE_CLASS(OmbProjectionWithNewOrigin, OmbWrappingProjection, "ProjectionWithNewOrigin", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbProjectionWithNewOrigin)

OMB_DESCRIBE_CLASS(OmbWrappingProjection) {
    d.object<OmbProjection>(
         "BaseProjection", [](const OmbWrappingProjection& p) { return p.baseProjection(); },
         [](OmbWrappingProjection& p, const OmbRef<OmbProjection>& v) { p.baseProjection(v); })
        .required();
}

OMB_DESCRIBE_CLASS(OmbRotatedProjection) {
    d.property<double>(
        "Up", [](const OmbRotatedProjection& p) { return p.up(); }, [](OmbRotatedProjection& p, double v) { p.up(v); });
}

OMB_DESCRIBE_CLASS(OmbProjectionWithNewOrigin) {
    using N = OmbProjectionWithNewOrigin;
    d.property<double>(
        "OriginLongitude", [](const N& p) { return p.newOrigin().x; },
        [](N& p, double v) {
            p.newOrigin({v, p.newOrigin().y});
        });
    d.property<double>(
        "OriginLatitude", [](const N& p) { return p.newOrigin().y; },
        [](N& p, double v) {
            p.newOrigin({p.newOrigin().x, v});
        });
}

namespace {

// The base projection's numbers and the plane map.
class WrappedCachedNumbers : public OmbProjCachedNumbers {
public:
    WrappedCachedNumbers(const OmbGeodeticDatum& datum, const OmbProjection& projection,
                         std::unique_ptr<OmbProjCachedNumbers> baseNumbers)
        : OmbProjCachedNumbers(datum, projection.metersPerProjUnit()), base(std::move(baseNumbers)) {}

    std::unique_ptr<OmbProjCachedNumbers> base;
    OmbWrappingProjection::Affine affine;
};

const WrappedCachedNumbers& numbers(const OmbProjCachedNumbers* cached) {
    return *static_cast<const WrappedCachedNumbers*>(cached);
}

}  // namespace

void OmbWrappingProjection::Affine::apply(OmbPoint& p) const {
    const double x = p.x, y = p.y;
    p.x = m00 * x + m01 * y + tx;
    p.y = m10 * x + m11 * y + ty;
}

void OmbWrappingProjection::Affine::applyInverse(OmbPoint& p) const {
    const double x = p.x - tx, y = p.y - ty;
    const double determinant = m00 * m11 - m01 * m10;
    p.x = (m11 * x - m01 * y) / determinant;
    p.y = (m00 * y - m10 * x) / determinant;
}

OmbWrappingProjection::OmbWrappingProjection(const OmbWrappingProjection& other)
    : OmbProjection(other), base_(other.base_) {}

void OmbWrappingProjection::baseProjection(const OmbRef<OmbProjection>& base) {
    base_ = base;
    if (base_) lengthUnit(base_->configuredLengthUnit());
}

OmbProjCachedNumbers* OmbWrappingProjection::init(const OmbGeodeticDatum& datum) const {
    if (!base_) OMB_THROW(NullValue, "baseProjection", name().empty() ? OmbString(myRuntimeClassName()) : name());
    auto cached =
        std::make_unique<WrappedCachedNumbers>(datum, *this, std::unique_ptr<OmbProjCachedNumbers>(base_->init(datum)));
    cached->affine = affine(cached->base.get());
    return cached.release();
}

void OmbWrappingProjection::project(OmbPointArray& points, const OmbProjCachedNumbers* cached) const {
    const WrappedCachedNumbers& c = numbers(cached);
    base_->project(points, c.base.get());
    for (OmbPoint& p : points) c.affine.apply(p);
}

void OmbWrappingProjection::project(OmbPoint& p, const OmbProjCachedNumbers* cached) const {
    const WrappedCachedNumbers& c = numbers(cached);
    base_->project(p, c.base.get());
    c.affine.apply(p);
}

void OmbWrappingProjection::unproject(OmbPointArray& points, const OmbProjCachedNumbers* cached) const {
    const WrappedCachedNumbers& c = numbers(cached);
    for (OmbPoint& p : points) c.affine.applyInverse(p);
    base_->unproject(points, c.base.get());
}

void OmbWrappingProjection::unproject(OmbPoint& p, const OmbProjCachedNumbers* cached) const {
    const WrappedCachedNumbers& c = numbers(cached);
    c.affine.applyInverse(p);
    base_->unproject(p, c.base.get());
}

void OmbWrappingProjection::nominalMetersXY(const OmbProjCachedNumbers* cached, double& mx, double& my) const {
    base_->nominalMetersXY(numbers(cached).base.get(), mx, my);
}

OmbRect OmbWrappingProjection::getValidArea(const OmbProjCachedNumbers* cached) const {
    return base_->getValidArea(numbers(cached).base.get());
}

bool OmbWrappingProjection::isValid(const OmbPoint& lola, const OmbProjCachedNumbers* cached) const {
    return base_->isValid(lola, numbers(cached).base.get());
}

OmbPoint OmbWrappingProjection::projectedOrigin(const OmbProjCachedNumbers* cached) const {
    const WrappedCachedNumbers& c = numbers(cached);
    OmbPoint origin = base_->projectedOrigin(c.base.get());
    c.affine.apply(origin);
    return origin;
}

bool OmbWrappingProjection::sameBase(const OmbWrappingProjection& other) const {
    return myRuntimeClass() == other.myRuntimeClass() && base_ && other.base_ && *base_ == *other.base_;
}

// --- rotated ----------------------------------------------------------------------

OmbRotatedProjection::OmbRotatedProjection(const OmbRef<OmbProjection>& base, double up) : up_(up) {
    baseProjection(base);
}

OmbWrappingProjection::Affine OmbRotatedProjection::affine(const OmbProjCachedNumbers* baseCached) const {
    const OmbPoint origin = baseProjection()->projectedOrigin(baseCached);
    const double c = std::cos(up_ * radiansPerDegree), s = std::sin(up_ * radiansPerDegree);
    Affine a;
    a.m00 = c, a.m01 = -s, a.m10 = s, a.m11 = c;
    a.tx = origin.x - (c * origin.x - s * origin.y);
    a.ty = origin.y - (s * origin.x + c * origin.y);
    return a;
}

bool OmbRotatedProjection::equivalent(const OmbProjection& other) const {
    const auto* r = dynamic_cast<const OmbRotatedProjection*>(&other);
    return r && sameBase(*r) && up_ == r->up_;
}

// --- new origin -------------------------------------------------------------------

OmbProjectionWithNewOrigin::OmbProjectionWithNewOrigin(const OmbRef<OmbProjection>& base, const OmbPoint& newOrigin)
    : newOrigin_(newOrigin) {
    baseProjection(base);
    if (base) name(base->name() + OmbString::literal("Recentered"));
}

OmbWrappingProjection::Affine OmbProjectionWithNewOrigin::affine(const OmbProjCachedNumbers* baseCached) const {
    OmbPoint origin = newOrigin_;
    baseProjection()->project(origin, baseCached);
    Affine a;
    a.tx = -origin.x, a.ty = -origin.y;
    return a;
}

bool OmbProjectionWithNewOrigin::equivalent(const OmbProjection& other) const {
    const auto* n = dynamic_cast<const OmbProjectionWithNewOrigin*>(&other);
    return n && sameBase(*n) && newOrigin_ == n->newOrigin_;
}
