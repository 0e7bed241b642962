// The bounds of a rectangle's image under a map (a projection or its
// inverse), found along the rectangle's edges.
//
// A projection is an open map away from its singular points: it takes the
// inside of a rectangle to the inside of the image, so the extremes of x
// and y lie on the edges. Each edge is cut at the given lines (where a
// coordinate's behaviour changes, such as the equator), sampled, and every
// extreme refined by golden-section search around its best sample.
#pragma once

#include <oecore/linalg/rect.h>

#include <functional>
#include <vector>

class OmbEdgeSearch {
public:
    // Maps a point in place; it may throw where the point is outside the
    // map's domain, which the search passes over.
    using Map = std::function<void(OmbPoint&)>;

    explicit OmbEdgeSearch(Map map) : map_(std::move(map)) {}

    // Vertical and horizontal lines at which the edges are cut.
    void splitX(double x) { splitsX_.push_back(x); }
    void splitY(double y) { splitsY_.push_back(y); }

    // False, with out untouched, when no point of the edges maps.
    bool bounds(const OmbRect& in, OmbRect& out) const;

private:
    bool image(const OmbPoint& source, OmbPoint& result) const;
    void searchEdge(const OmbPoint& from, const OmbPoint& to, const std::vector<double>& cuts, bool alongX,
                    OmbRect& found) const;
    void searchSegment(const OmbPoint& from, const OmbPoint& to, OmbRect& found) const;

    Map map_;
    std::vector<double> splitsX_;
    std::vector<double> splitsY_;
};
