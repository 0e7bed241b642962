// OmbVec: a reference-counted engine object holding a sequence of values.
#pragma once

#include <oecore/core/collection.h>

#include <vector>

template <class T, int N = 0, class Notifier = OmbVecNotifierDummy, class Container = std::vector<T>,
          class Sharing = OmbVecSharingDummy>
class OmbVec : public OmbCollection<T, Container, Notifier, Sharing> {
    // Collections have no element of their own: they are written inline.
    OMB_ENGINE_CLASS_INLINE(OmbEngineObject, "", 0)

public:
    OmbVec() = default;
    OmbVec(std::initializer_list<T> values) {
        for (const T& v : values) this->add(v);
    }

    // A copy of the values; the copy is neither owned nor read-only.
    OmbVec* clone() const override { return new OmbVec(*this); }
    // A new collection with the same values.
    OmbRef<OmbVec> shallowCopy() const { return OmbRef<OmbVec>(clone()); }
};
