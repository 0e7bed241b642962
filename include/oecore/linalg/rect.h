// OmbRect: an axis-parallel rectangle, the value type of bounds, view areas
// and query windows.
//
// A rectangle with xmin >= xmax or ymin >= ymax is empty; one with
// xmin > xmax or ymin > ymax is also invalid, which is how "no area yet" is
// written: widening an invalid rectangle starts from nothing.
#pragma once

#include <oecore/linalg/point.h>

struct OmbRect {
    double xmin = 0;
    double ymin = 0;
    double xmax = 0;
    double ymax = 0;

    constexpr OmbRect() = default;
    constexpr OmbRect(double x0, double y0, double x1, double y1) : xmin(x0), ymin(y0), xmax(x1), ymax(y1) {}

    static constexpr OmbRect empty() { return {}; }
    static constexpr OmbRect invalid() { return {0, 0, -1, -1}; }
    static constexpr OmbRect infinite() {
        return {-1.7976931348623157e308, -1.7976931348623157e308, 1.7976931348623157e308, 1.7976931348623157e308};
    }

    constexpr bool isEmpty() const { return xmin >= xmax || ymin >= ymax; }
    constexpr bool isInvalid() const { return xmin > xmax || ymin > ymax; }
    friend constexpr bool operator==(const OmbRect&, const OmbRect&) = default;

    // Within the closed, or the open, rectangle.
    constexpr bool inside(const OmbPoint& p) const { return p.x >= xmin && p.x <= xmax && p.y >= ymin && p.y <= ymax; }
    constexpr bool strictlyInside(const OmbPoint& p) const {
        return p.x > xmin && p.x < xmax && p.y > ymin && p.y < ymax;
    }
    // The closed rectangles meet (touching edges count), or the open ones.
    constexpr bool overlap(const OmbRect& r) const {
        return xmin <= r.xmax && r.xmin <= xmax && ymin <= r.ymax && r.ymin <= ymax;
    }
    constexpr bool strictlyOverlap(const OmbRect& r) const {
        return xmin < r.xmax && r.xmin < xmax && ymin < r.ymax && r.ymin < ymax;
    }
    // r lies within this rectangle, edges included.
    constexpr bool covers(const OmbRect& r) const {
        return r.xmin >= xmin && r.xmax <= xmax && r.ymin >= ymin && r.ymax <= ymax;
    }

    // Widen to contain p, or the union with r.
    void include(const OmbPoint& p);
    void bounds(const OmbRect& r);
    // Becomes the intersection when the rectangles meet; false and unchanged
    // otherwise.
    bool clipBy(const OmbRect& r);
    // The intersection, or invalid() when the rectangles do not meet.
    OmbRect clipByCopy(const OmbRect& r) const;

    void extend(double dx, double dy) { xmin -= dx, ymin -= dy, xmax += dx, ymax += dy; }
    OmbRect extendCopy(double dx, double dy) const { return {xmin - dx, ymin - dy, xmax + dx, ymax + dy}; }
    void offset(double dx, double dy) { xmin += dx, ymin += dy, xmax += dx, ymax += dy; }
    // Becomes the bounds of itself turned by degrees counter-clockwise about
    // center.
    void rotate(const OmbPoint& center, double degrees);

    constexpr OmbPoint center() const { return {(xmin + xmax) / 2, (ymin + ymax) / 2}; }
    constexpr OmbPoint ne() const { return {xmax, ymax}; }
    constexpr OmbPoint nw() const { return {xmin, ymax}; }
    constexpr OmbPoint se() const { return {xmax, ymin}; }
    constexpr OmbPoint sw() const { return {xmin, ymin}; }
    void ne(const OmbPoint& p) { xmax = p.x, ymax = p.y; }
    void nw(const OmbPoint& p) { xmin = p.x, ymax = p.y; }
    void se(const OmbPoint& p) { xmax = p.x, ymin = p.y; }
    void sw(const OmbPoint& p) { xmin = p.x, ymin = p.y; }
    constexpr double width() const { return xmax - xmin; }
    constexpr double height() const { return ymax - ymin; }
    constexpr double area() const { return width() * height(); }

    // Whether r lies next to this rectangle along one whole edge.
    bool commonEdge(const OmbRect& r) const;
    // Extends this rectangle over r when they share a whole edge.
    bool merge(const OmbRect& r);
    // Cuts the segment a-b (z interpolated along) to the closed rectangle;
    // false when nothing of it is inside.
    bool clipSegment(OmbPoint& a, OmbPoint& b) const;
};
