#include <oecore/core/exception.h>
#include <oecore/linalg/point.h>

namespace {

[[noreturn]] void outOfBounds() { OMB_THROW(IndexOutOfBounds); }

}  // namespace

double& OmbPoint::operator[](std::size_t i) {
    switch (i) {
        case 0: return x;
        case 1: return y;
        case 2: return z;
        default: outOfBounds();
    }
}

double OmbPoint::operator[](std::size_t i) const { return const_cast<OmbPoint&>(*this)[i]; }
