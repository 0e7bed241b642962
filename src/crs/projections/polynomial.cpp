// Polynomial projection: least-squares polynomials in long/lat, through
// newmat's singular value decomposition on coordinates centred and scaled
// to [-1, 1] (which keeps the normal matrix well conditioned). The inverse
// is Newton's method on the two polynomials from the fitted inverse
// polynomials' guess.
#include "projectionmath.h"

#include <oecore/core/exception.h>
#include <oecore/core/log.h>
#include <oecore/core/stringbuilder.h>
#include <oecore/crs/projections/polynomial.h>

#define WANT_STREAM
#include <newmat/newmatap.h>

#include <array>
#include <cmath>
#include <sstream>

using namespace OmbProjectionMath;

OMB_DEFINE_ENGINE_CLASS(OmbPolynomialProjection, OmbProjection, "PolynomialProjection", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbPolynomialProjection)

OMB_DESCRIBE_CLASS(OmbPolynomialProjection) {
    using P = OmbPolynomialProjection;
    d.property<OmbString>(
         "GeoreferencedPoints", [](const P& p) { return P::pointsText(p.georeferencedPoints()); },
         [](P& p, const OmbString& v) { p.georeferencedPoints(P::parsePoints(v)); })
        .required();
    d.property<OmbString>(
         "ImagePoints", [](const P& p) { return P::pointsText(p.imagePoints()); },
         [](P& p, const OmbString& v) { p.imagePoints(P::parsePoints(v)); })
        .required();
    d.property<int>(
        "PolynomialDegree", [](const P& p) { return p.polynomialDegree(); }, [](P& p, int v) { p.polynomialDegree(v); },
        1);
    d.object<OmbLengthUnit>(
        "LengthUnit", [](const P& p) { return p.configuredLengthUnit(); },
        [](P& p, const OmbRef<OmbLengthUnit>& v) { p.lengthUnit(v); });
}

namespace {

constexpr int maxTerms = 10;

// Maps one plane to another by a pair of polynomials in coordinates
// centred and scaled to about [-1, 1].
struct Polynomials {
    int degree = 1;
    int terms = 3;
    double centreX = 0, centreY = 0, scale = 1;
    std::array<double, maxTerms> x{}, y{};

    // 1, u, v, u^2, uv, v^2, u^3, u^2 v, u v^2, v^3 and their derivatives.
    void monomials(double u, double v, double* m, double* du = nullptr, double* dv = nullptr) const {
        int k = 0;
        for (int d = 0; d <= degree; ++d)
            for (int j = 0; j <= d; ++j, ++k) {
                const int i = d - j;  // power of u, then of v
                m[k] = std::pow(u, i) * std::pow(v, j);
                if (du) du[k] = i ? i * std::pow(u, i - 1) * std::pow(v, j) / scale : 0;
                if (dv) dv[k] = j ? j * std::pow(u, i) * std::pow(v, j - 1) / scale : 0;
            }
    }
    OmbPoint apply(const OmbPoint& p) const {
        double m[maxTerms];
        monomials((p.x - centreX) / scale, (p.y - centreY) / scale, m);
        OmbPoint out(0, 0, p.z);
        for (int k = 0; k < terms; ++k) out.x += x[k] * m[k], out.y += y[k] * m[k];
        return out;
    }
    // d(out)/d(in) at p.
    void jacobian(const OmbPoint& p, double& xx, double& xy, double& yx, double& yy) const {
        double m[maxTerms], du[maxTerms], dv[maxTerms];
        monomials((p.x - centreX) / scale, (p.y - centreY) / scale, m, du, dv);
        xx = xy = yx = yy = 0;
        for (int k = 0; k < terms; ++k) {
            xx += x[k] * du[k], xy += x[k] * dv[k];
            yx += y[k] * du[k], yy += y[k] * dv[k];
        }
    }
    OmbString text(const char* variableX, const char* variableY) const {
        std::ostringstream out;
        out.precision(17);
        const char* names[maxTerms] = {"", "*u", "*v", "*u^2", "*u*v", "*v^2", "*u^3", "*u^2*v", "*u*v^2", "*v^3"};
        for (int k = 0; k < terms; ++k) out << (k ? " + " : "") << x[k] << names[k];
        out << "; u = (" << variableX << " - " << centreX << ") / " << scale << ", v = (" << variableY << " - "
            << centreY << ") / " << scale;
        return OmbString(out.str());
    }
};

// Least squares through the singular value decomposition, dropping
// directions the points do not determine.
Polynomials fit(const OmbPointArray& from, const OmbPointArray& to, int degree) {
    Polynomials p;
    p.degree = degree;
    p.terms = (degree + 1) * (degree + 2) / 2;
    OmbRect bounds = OmbRect::invalid();
    for (const OmbPoint& q : from) bounds.include(q);
    p.centreX = (bounds.xmin + bounds.xmax) / 2, p.centreY = (bounds.ymin + bounds.ymax) / 2;
    p.scale = std::max({(bounds.xmax - bounds.xmin) / 2, (bounds.ymax - bounds.ymin) / 2, 1e-12});
    const int n = int(from.size());
    NEWMAT::Matrix a(n, p.terms);
    NEWMAT::ColumnVector bx(n), by(n);
    for (int i = 0; i < n; ++i) {
        double m[maxTerms];
        p.monomials((from[i].x - p.centreX) / p.scale, (from[i].y - p.centreY) / p.scale, m);
        for (int k = 0; k < p.terms; ++k) a(i + 1, k + 1) = m[k];
        bx(i + 1) = to[i].x, by(i + 1) = to[i].y;
    }
    NEWMAT::DiagonalMatrix d;
    NEWMAT::Matrix u, v;
    NEWMAT::SVD(a, d, u, v);
    const double largest = d.MaximumAbsoluteValue();
    for (int k = 1; k <= p.terms; ++k) d(k) = d(k) > largest * 1e-12 ? 1 / d(k) : 0;
    const NEWMAT::ColumnVector cx = v * d * u.t() * bx, cy = v * d * u.t() * by;
    for (int k = 0; k < p.terms; ++k) p.x[k] = cx(k + 1), p.y[k] = cy(k + 1);
    return p;
}

class PolynomialCachedNumbers : public OmbProjCachedNumbers {
public:
    PolynomialCachedNumbers(const OmbGeodeticDatum& datum, const OmbProjection& projection)
        : OmbProjCachedNumbers(datum, projection.metersPerProjUnit()) {}

    Polynomials forward, inverse;
};

const PolynomialCachedNumbers& fitted(const OmbProjCachedNumbers* cached) {
    return *static_cast<const PolynomialCachedNumbers*>(cached);
}

OmbString pointText(const OmbPoint& p) {
    OmbStringBuilder text;
    text << OmbFormat::real(p.x) << ", " << OmbFormat::real(p.y);
    return text.str();
}

}  // namespace

OmbPolynomialProjection::OmbPolynomialProjection(const OmbPointArray& georeferencedPoints,
                                                 const OmbPointArray& imagePoints, int degree)
    : geoPoints_(georeferencedPoints), imagePoints_(imagePoints), degree_(degree) {}

OmbString OmbPolynomialProjection::pointsText(const OmbPointArray& points) {
    OmbStringBuilder text;
    for (std::size_t i = 0; i < points.size(); ++i)
        text << (i ? "; " : "") << OmbFormat::real(points[i].x) << " " << OmbFormat::real(points[i].y);
    return text.str();
}

OmbPointArray OmbPolynomialProjection::parsePoints(const OmbString& text) {
    OmbPointArray points;
    std::istringstream pairs{std::string(text)};
    pairs.imbue(std::locale::classic());
    for (std::string pair; std::getline(pairs, pair, ';');) {
        if (pair.find_first_not_of(" \t\r\n") == std::string::npos) continue;
        std::istringstream fields(pair);
        fields.imbue(std::locale::classic());
        OmbPoint p;
        std::string rest;
        if (!(fields >> p.x >> p.y) || (fields >> rest))
            OMB_THROW(Argument, "the point list \"" + text + "\" (\"x y\" pairs separated by semicolons)");
        points.push_back(p);
    }
    return points;
}

OmbProjCachedNumbers* OmbPolynomialProjection::init(const OmbGeodeticDatum& datum) const {
    const OmbString where = name().empty() ? OmbString::literal("PolynomialProjection") : name();
    if (geoPoints_.size() != imagePoints_.size()) OMB_THROW(DifferentNumberOfGCP, where);
    if (degree_ < 1 || degree_ > 3) {
        OmbStringBuilder text;
        text << "Polynom of degree " << degree_ << " is not implemented";
        OMB_THROW(InvalidOperation, text.str());
    }
    if (int(geoPoints_.size()) < (degree_ + 1) * (degree_ + 2) / 2) {
        OmbStringBuilder degree;
        degree << degree_;
        OMB_THROW(NotEnoughGCP, degree.str());
    }
    auto* cached = new PolynomialCachedNumbers(datum, *this);
    cached->forward = fit(geoPoints_, imagePoints_, degree_);
    cached->inverse = fit(imagePoints_, geoPoints_, degree_);
    OmbLog::debug(Omb_formatMessage("Forward mapping function ImageX(GeoX,GeoY) for PolynomialProjection %1% is %2%.",
                                    {where, cached->forward.text("GeoX", "GeoY")}));
    return cached;
}

double OmbPolynomialProjection::getErrorEstimate(OmbErrorMeasure measure) const {
    if (geoPoints_.empty() || geoPoints_.size() != imagePoints_.size()) return 0;
    const Polynomials forward = fit(geoPoints_, imagePoints_, degree_);
    double largest = 0, sum = 0;
    for (std::size_t i = 0; i < geoPoints_.size(); ++i) {
        const double residual = forward.apply(geoPoints_[i]).distanceTo(imagePoints_[i]);
        largest = std::max(largest, residual);
        sum += residual;
    }
    return measure == OmbErrorMeasure::MaxError ? largest : sum / double(geoPoints_.size());
}

void OmbPolynomialProjection::project(OmbPoint& p, const OmbProjCachedNumbers* cached) const {
    p = fitted(cached).forward.apply(p);
}

void OmbPolynomialProjection::unproject(OmbPoint& p, const OmbProjCachedNumbers* cached) const {
    const PolynomialCachedNumbers& c = fitted(cached);
    const OmbPoint guess = c.inverse.apply(p);
    OmbPoint lola = guess;
    const char* reason = "no convergence within 50 steps";
    for (int step = 0; step < 50; ++step) {
        const OmbPoint image = c.forward.apply(lola);
        double xx, xy, yx, yy;
        c.forward.jacobian(lola, xx, xy, yx, yy);
        const double determinant = xx * yy - xy * yx;
        if (determinant == 0 || !std::isfinite(determinant)) {
            reason = "the Jacobian is singular";
            break;
        }
        const double rx = p.x - image.x, ry = p.y - image.y;
        const double dLon = (yy * rx - xy * ry) / determinant, dLat = (xx * ry - yx * rx) / determinant;
        lola.x += dLon, lola.y += dLat;
        if (std::fabs(dLon) <= 1e-13 * (1 + std::fabs(lola.x)) && std::fabs(dLat) <= 1e-13 * (1 + std::fabs(lola.y))) {
            p.x = lola.x, p.y = lola.y;
            return;
        }
    }
    OMB_THROW(ProjectionFromFailureEx, pointText(p),
              name().empty() ? OmbString::literal("PolynomialProjection") : name(),
              "Failed to find root for the given equation system: \n" + pointText(guess) + ": " + reason);
}

void OmbPolynomialProjection::nominalMetersXY(const OmbProjCachedNumbers* cached, double& mx, double& my) const {
    // Metres per image unit at the control points' centre.
    const PolynomialCachedNumbers& c = fitted(cached);
    const OmbPoint centre(c.forward.centreX, c.forward.centreY);
    double xx, xy, yx, yy;
    c.forward.jacobian(centre, xx, xy, yx, yy);
    const double metersPerDegree = c.a * radiansPerDegree;
    const double cosLat = std::cos(centre.y * radiansPerDegree);
    // Degrees per image unit along x and y, by the inverse Jacobian.
    const double determinant = xx * yy - xy * yx;
    mx = std::hypot(yy / determinant * cosLat, -yx / determinant) * metersPerDegree;
    my = std::hypot(-xy / determinant * cosLat, xx / determinant) * metersPerDegree;
}

bool OmbPolynomialProjection::equivalent(const OmbProjection& other) const {
    const auto* p = dynamic_cast<const OmbPolynomialProjection*>(&other);
    return p && lengthUnit()->equivalent(*p->lengthUnit()) && degree_ == p->degree_ && geoPoints_ == p->geoPoints_ &&
           imagePoints_ == p->imagePoints_;
}
