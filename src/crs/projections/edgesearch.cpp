#include "edgesearch.h"

#include <oecore/core/exception.h>

#include <algorithm>
#include <array>
#include <cmath>
#include <limits>

namespace {

constexpr int samples = 16;
constexpr int refinements = 60;
constexpr double goldenRatio = 0.6180339887498949;
constexpr double nothing = -std::numeric_limits<double>::infinity();

// The four quantities maximised: -x, x, -y, y.
double objective(const OmbPoint& p, int which) {
    const double v = which < 2 ? p.x : p.y;
    return which % 2 ? v : -v;
}

}  // namespace

bool OmbEdgeSearch::image(const OmbPoint& source, OmbPoint& result) const {
    result = source;
    try {
        map_(result);
    } catch (const OmbException&) {
        return false;
    }
    return std::isfinite(result.x) && std::isfinite(result.y);
}

bool OmbEdgeSearch::bounds(const OmbRect& in, OmbRect& out) const {
    OmbRect found = OmbRect::invalid();
    searchEdge({in.xmin, in.ymin}, {in.xmax, in.ymin}, splitsX_, true, found);
    searchEdge({in.xmin, in.ymax}, {in.xmax, in.ymax}, splitsX_, true, found);
    searchEdge({in.xmin, in.ymin}, {in.xmin, in.ymax}, splitsY_, false, found);
    searchEdge({in.xmax, in.ymin}, {in.xmax, in.ymax}, splitsY_, false, found);
    if (found.isInvalid()) return false;
    out = found;
    return true;
}

void OmbEdgeSearch::searchEdge(const OmbPoint& from, const OmbPoint& to, const std::vector<double>& cuts, bool alongX,
                               OmbRect& found) const {
    const double start = alongX ? from.x : from.y;
    const double end = alongX ? to.x : to.y;
    std::vector<double> stops{start};
    for (double c : cuts)
        if (c > start && c < end) stops.push_back(c);
    std::sort(stops.begin() + 1, stops.end());
    stops.push_back(end);
    for (std::size_t i = 0; i + 1 < stops.size(); ++i) {
        OmbPoint a = from, b = to;
        (alongX ? a.x : a.y) = stops[i];
        (alongX ? b.x : b.y) = stops[i + 1];
        searchSegment(a, b, found);
    }
}

void OmbEdgeSearch::searchSegment(const OmbPoint& from, const OmbPoint& to, OmbRect& found) const {
    auto at = [&](double t) { return OmbPoint(from.x + t * (to.x - from.x), from.y + t * (to.y - from.y)); };
    std::array<OmbPoint, samples + 1> images;
    std::array<bool, samples + 1> valid;
    for (int i = 0; i <= samples; ++i) {
        valid[i] = image(at(double(i) / samples), images[i]);
        if (valid[i]) found.include(images[i]);
    }
    for (int which = 0; which < 4; ++which) {
        int best = -1;
        for (int i = 0; i <= samples; ++i)
            if (valid[i] && (best < 0 || objective(images[i], which) > objective(images[best], which))) best = i;
        if (best < 0) return;
        // Golden-section search for the maximum between the neighbours.
        auto value = [&](double t, OmbPoint& p) { return image(at(t), p) ? objective(p, which) : nothing; };
        double lo = std::max(0, best - 1) / double(samples), hi = std::min(samples, best + 1) / double(samples);
        OmbPoint p1, p2;
        double t1 = hi - goldenRatio * (hi - lo), t2 = lo + goldenRatio * (hi - lo);
        double v1 = value(t1, p1), v2 = value(t2, p2);
        for (int k = 0; k < refinements && hi - lo > 1e-15; ++k) {
            if (v1 < v2) {
                lo = t1, t1 = t2, v1 = v2, p1 = p2;
                t2 = lo + goldenRatio * (hi - lo);
                v2 = value(t2, p2);
            } else {
                hi = t2, t2 = t1, v2 = v1, p2 = p1;
                t1 = hi - goldenRatio * (hi - lo);
                v1 = value(t1, p1);
            }
        }
        if (v1 != nothing) found.include(p1);
        if (v2 != nothing) found.include(p2);
    }
}
