#include <oecore/linalg/pointarray.h>

#include <algorithm>

OmbPointArray::OmbPointArray(std::initializer_list<OmbPoint> points)
    : storage_(std::make_shared<std::vector<OmbPoint>>(points)) {}

OmbPointArray::OmbPointArray(std::size_t size) : storage_(std::make_shared<std::vector<OmbPoint>>(size)) {}

std::vector<OmbPoint>& OmbPointArray::own() {
    if (!storage_)
        storage_ = std::make_shared<std::vector<OmbPoint>>();
    else if (storage_.use_count() > 1)
        storage_ = std::make_shared<std::vector<OmbPoint>>(*storage_);
    return *storage_;
}

void OmbPointArray::insert(std::size_t at, const OmbPoint& p) {
    std::vector<OmbPoint>& points = own();
    points.insert(points.begin() + static_cast<std::ptrdiff_t>(at), p);
}

void OmbPointArray::erase(std::size_t at) {
    std::vector<OmbPoint>& points = own();
    points.erase(points.begin() + static_cast<std::ptrdiff_t>(at));
}

bool operator==(const OmbPointArray& a, const OmbPointArray& b) {
    return a.sharesStorageWith(b) || std::equal(a.begin(), a.end(), b.begin(), b.end());
}
