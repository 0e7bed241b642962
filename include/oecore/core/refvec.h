// OmbRefVec: a reference-counted engine object holding a sequence of
// OmbRef<T>.
#pragma once

#include <oecore/core/collection.h>

#include <type_traits>
#include <vector>

template <class T, int N = 0, class Notifier = OmbRefVecNotifierDummy, class Sharing = OmbRefVecSharingDummy<T>>
class OmbRefVec : public OmbCollection<OmbRef<T>, std::vector<OmbRef<T>>, Notifier, Sharing> {
    // Collections have no element of their own: they are written inline.
    OMB_ENGINE_CLASS_INLINE(OmbEngineObject, "", 0)

public:
    OmbRefVec() = default;

    // A new collection holding clones of the engine-object items (other
    // items are shared); the copy is neither owned nor read-only.
    OmbRefVec* clone() const override {
        auto* copy = new OmbRefVec(*this);
        if constexpr (std::is_base_of_v<OmbEngineObject, T>) {
            for (std::size_t i = 0; i < copy->size(); ++i) {
                const OmbRef<T>& item = copy->get(i);
                if (item) copy->set(i, OmbRef<T>(static_cast<T*>(item->clone())));
            }
        }
        return copy;
    }
    // A new collection that shares the same items.
    OmbRef<OmbRefVec> shallowCopy() const { return OmbRef<OmbRefVec>(new OmbRefVec(*this)); }

    // The engine-object items, for child enumeration.
    OmbRef<OmbEngineObjectVec> getMyChildObjects() const override {
        OmbRef<OmbEngineObjectVec> children(new OmbEngineObjectVec);
        if constexpr (std::is_base_of_v<OmbEngineObject, T>) {
            for (const OmbRef<T>& item : *this)
                if (item) children->add(item);
        }
        return children;
    }
};
