#include <oecore/core/runtime.h>
#include <oecore/crs/ellipsoid.h>

#include <cmath>

OMB_DEFINE_ENGINE_CLASS(OmbEllipsoid, OmbResourceObject, "Ellipsoid", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbEllipsoid)

OMB_DESCRIBE_CLASS(OmbEllipsoid) {
    Omb_describeAuthority(d);
    d.property<double>(
         "EquatorialRadius", [](const OmbEllipsoid& e) { return e.equatorialRadius(); },
         [](OmbEllipsoid& e, double v) { e.equatorialRadius(v); })
        .required();
    d.property<double>(
         "InverseFlattening", [](const OmbEllipsoid& e) { return e.inverseFlattening(); },
         [](OmbEllipsoid& e, double v) { e.inverseFlattening(v); })
        .required();
}

namespace {

constexpr double degrees = 57.29577951308232;

// The predefined ellipsoids, in the order of the list.
enum PredefinedEllipsoid {
#define OMB_ELLIPSOID_INDEX(NAME, ACCESSOR, A, INVF, CODE) Ellipsoid##NAME,
    OMB_PREDEFINED_ELLIPSOIDS(OMB_ELLIPSOID_INDEX)
#undef OMB_ELLIPSOID_INDEX
        EllipsoidCount
};

OmbRef<OmbEllipsoid> predefined[EllipsoidCount];

[[maybe_unused]] const bool registered =
    (OmbRuntime::registerPredefinedClass(OmbRuntime::PredefinedClass::Ellipsoids, OmbEllipsoid::createPredefined,
                                         OmbEllipsoid::destroyPredefined),
     true);

}  // namespace

OmbEllipsoid::OmbEllipsoid(double equatorialRadius, double inverseFlattening, const OmbString& authority,
                           const OmbString& authorityCode)
    : authority_(authority), authorityCode_(authorityCode) {
    set(equatorialRadius, inverseFlattening);
}

void OmbEllipsoid::set(double equatorialRadius, double inverseFlattening) {
    a_ = equatorialRadius;
    inverseF_ = inverseFlattening;
    f_ = inverseFlattening == 0 ? 0 : 1 / inverseFlattening;
    b_ = a_ * (1 - f_);
    e2_ = f_ * (2 - f_);
}

bool OmbEllipsoid::equivalent(const OmbEllipsoid& other) const {
    if (std::fabs(a_ - other.a_) > 0.001) return false;
    if (inverseF_ == 0 || other.inverseF_ == 0) return inverseF_ == other.inverseF_;
    return std::fabs(inverseF_ / other.inverseF_ - 1) < 1e-8;
}

void OmbEllipsoid::geodeticToGeocentricXYZ(double& lon, double& lat, double& h) const {
    const double phi = lat / degrees;
    const double lambda = lon / degrees;
    const double sinPhi = std::sin(phi);
    const double cosPhi = std::cos(phi);
    const double n = a_ / std::sqrt(1 - e2_ * sinPhi * sinPhi);
    const double x = (n + h) * cosPhi * std::cos(lambda);
    const double y = (n + h) * cosPhi * std::sin(lambda);
    const double z = ((1 - e2_) * n + h) * sinPhi;
    lon = x;
    lat = y;
    h = z;
}

void OmbEllipsoid::geocentricXYZToGeodetic(double& x, double& y, double& z) const {
    // One Bowring step, no iteration. The sines and cosines of the auxiliary
    // angle theta and of the latitude come from the sides of their triangles
    // rather than from trigonometric calls, and plain square roots serve for
    // the lengths (geocentric coordinates are far from overflow): array
    // conversions spend most of their time here.
    const double p = std::sqrt(x * x + y * y);
    const double thetaY = z * a_, thetaX = b_ * p, thetaR = std::sqrt(thetaY * thetaY + thetaX * thetaX);
    const double sinTheta = thetaY / thetaR, cosTheta = thetaX / thetaR;
    const double ep2 = a_ * a_ / (b_ * b_) - 1;
    const double phiY = z + ep2 * b_ * sinTheta * sinTheta * sinTheta;
    const double phiX = p - e2_ * a_ * cosTheta * cosTheta * cosTheta;
    const double phiR = std::sqrt(phiY * phiY + phiX * phiX);
    const double sinPhi = phiY / phiR, cosPhi = phiX / phiR;
    const double h = p / cosPhi - a_ / std::sqrt(1 - e2_ * sinPhi * sinPhi);
    x = std::atan2(y, x) * degrees;
    y = std::atan2(phiY, phiX) * degrees;
    z = h;
}

void OmbEllipsoid::createPredefined() {
#define OMB_CREATE_ELLIPSOID(NAME, ACCESSOR, A, INVF, CODE)                                                     \
    predefined[Ellipsoid##NAME] =                                                                               \
        OmbRef<OmbEllipsoid>(new OmbEllipsoid(A, INVF, OmbString::literal("epsg"), OmbString::literal(#CODE))); \
    predefined[Ellipsoid##NAME]->name(OmbString::literal(#NAME));                                               \
    OmbRuntime::registerPredefined(OmbString::literal("Ellipsoids." #NAME),                                     \
                                   OmbRef<OmbEngineObject>(predefined[Ellipsoid##NAME]));
    OMB_PREDEFINED_ELLIPSOIDS(OMB_CREATE_ELLIPSOID)
#undef OMB_CREATE_ELLIPSOID
}

void OmbEllipsoid::destroyPredefined() {
    for (OmbRef<OmbEllipsoid>& e : predefined) e.reset();
}

#define OMB_ELLIPSOID_ACCESSOR(NAME, ACCESSOR, A, INVF, CODE) \
    const OmbRef<OmbEllipsoid>& OmbEllipsoid::ACCESSOR() { return predefined[Ellipsoid##NAME]; }
OMB_PREDEFINED_ELLIPSOIDS(OMB_ELLIPSOID_ACCESSOR)
#undef OMB_ELLIPSOID_ACCESSOR
