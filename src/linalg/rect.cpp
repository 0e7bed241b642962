#include <oecore/linalg/rect.h>

#include <algorithm>

void OmbRect::include(const OmbPoint& p) {
    if (isInvalid()) {
        *this = {p.x, p.y, p.x, p.y};
        return;
    }
    xmin = std::min(xmin, p.x), ymin = std::min(ymin, p.y);
    xmax = std::max(xmax, p.x), ymax = std::max(ymax, p.y);
}

void OmbRect::bounds(const OmbRect& r) {
    if (r.isInvalid()) return;
    if (isInvalid()) {
        *this = r;
        return;
    }
    xmin = std::min(xmin, r.xmin), ymin = std::min(ymin, r.ymin);
    xmax = std::max(xmax, r.xmax), ymax = std::max(ymax, r.ymax);
}

bool OmbRect::clipBy(const OmbRect& r) {
    if (!overlap(r)) return false;
    xmin = std::max(xmin, r.xmin), ymin = std::max(ymin, r.ymin);
    xmax = std::min(xmax, r.xmax), ymax = std::min(ymax, r.ymax);
    return true;
}

OmbRect OmbRect::clipByCopy(const OmbRect& r) const {
    OmbRect copy = *this;
    return copy.clipBy(r) ? copy : invalid();
}

void OmbRect::rotate(const OmbPoint& center, double degrees) {
    const double radians = degrees * 3.14159265358979323846 / 180;
    const double c = std::cos(radians), s = std::sin(radians);
    OmbRect turned = invalid();
    for (const OmbPoint& corner : {sw(), se(), ne(), nw()}) {
        const OmbPoint d = corner - center;
        turned.include({center.x + c * d.x - s * d.y, center.y + s * d.x + c * d.y});
    }
    *this = turned;
}

bool OmbRect::commonEdge(const OmbRect& r) const {
    const bool sameColumn = xmin == r.xmin && xmax == r.xmax;
    const bool sameRow = ymin == r.ymin && ymax == r.ymax;
    return (sameColumn && (ymax == r.ymin || r.ymax == ymin)) || (sameRow && (xmax == r.xmin || r.xmax == xmin));
}

bool OmbRect::merge(const OmbRect& r) {
    if (!commonEdge(r)) return false;
    bounds(r);
    return true;
}

bool OmbRect::clipSegment(OmbPoint& a, OmbPoint& b) const {
    // Liang-Barsky: narrow the parameter range [t0, t1] of a + t (b - a)
    // against each of the four edges.
    const OmbPoint d = b - a;
    double t0 = 0, t1 = 1;
    const auto narrow = [&](double p, double q) {
        if (p == 0) return q >= 0;  // parallel to the edge: inside or out
        const double t = q / p;
        if (p < 0) {
            if (t > t1) return false;
            t0 = std::max(t0, t);
        } else {
            if (t < t0) return false;
            t1 = std::min(t1, t);
        }
        return true;
    };
    if (!(narrow(-d.x, a.x - xmin) && narrow(d.x, xmax - a.x) && narrow(-d.y, a.y - ymin) && narrow(d.y, ymax - a.y)))
        return false;
    const OmbPoint start = a;
    if (t1 < 1) b = start + d * t1;
    if (t0 > 0) a = start + d * t0;
    return true;
}
