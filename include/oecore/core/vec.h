// OmbVec: a reference-counted engine object holding a sequence of values.
#pragma once

#include <oecore/core/collection.h>

#include <vector>

template <class T, int N = 0, class Notifier = OmbVecNotifierDummy, class Container = std::vector<T>,
          class Sharing = OmbVecSharingDummy>
class OmbVec : public OmbCollection<T, Container, Notifier, Sharing> {
public:
    OmbVec() = default;
    OmbVec(std::initializer_list<T> values) {
        for (const T& v : values) this->add(v);
    }

    // A copy of the values; the copy is neither owned nor read-only.
    OmbVec* clone() const override { return new OmbVec(*this); }
    // A new collection with the same values.
    OmbRef<OmbVec> shallowCopy() const { return OmbRef<OmbVec>(clone()); }

    static int classId() {
        static int id = 0;
        return OmbEngineObject::initClassId(id);
    }
    static OmbClass* runtimeClass() {
        static OmbClass record(OmbEngineObject::runtimeClass(), 0, "");
        return &record;
    }
    const char* myRuntimeClassName() const override { return ""; }

private:
    int myClassId_() const override { return classId(); }
    OmbClass* myRuntimeClass_() const override { return runtimeClass(); }
};
