// Small engine classes shared by the core tests.
#pragma once

#include <oecore/core/engineobject.h>
#include <oecore/core/refvec.h>
#include <oecore/core/resourceobject.h>

#include <atomic>
#include <vector>

// Counts its live instances; refers to any number of children.
class TestNode : public OmbResourceObject {
    OMB_ENGINE_CLASS_INLINE(OmbResourceObject, "TestNode", 9)

public:
    static inline std::atomic<int> alive{0};

    explicit TestNode(const char* name = "") : OmbResourceObject(OmbString(name)) { ++alive; }
    TestNode(const TestNode& other) : OmbResourceObject(other), children(other.children) { ++alive; }
    ~TestNode() override { --alive; }

    TestNode* clone() const override { return new TestNode(*this); }
    void notifyChanged() override { ++changes; }
    OmbRef<OmbEngineObjectVec> getMyChildObjects() const override {
        OmbRef<OmbEngineObjectVec> out(new OmbEngineObjectVec);
        for (const OmbRef<TestNode>& child : children) out->add(child);
        return out;
    }

    // Ownership as items of an owning collection see it.
    bool takeOwnership(int argument) {
        if (owned) return false;
        owned = true;
        ownershipArgument = argument;
        return true;
    }
    void releaseOwnership() { owned = false; }

    std::vector<OmbRef<TestNode>> children;
    int changes = 0;
    bool owned = false;
    int ownershipArgument = -1;
};

// A class that refuses to be cloned.
class Unclonable : public OmbEngineObject {
    OMB_ENGINE_CLASS_INLINE(OmbEngineObject, "Unclonable", 0)

public:
    OmbEngineObject* clone() const override;
};

inline OmbEngineObject* Unclonable::clone() const {
    throw OmbXObjectNotClonable(__FILE__, __LINE__, OmbString(myRuntimeClassName()));
}

using TestNodeVec = OmbRefVec<TestNode>;
using OwningTestNodeVec = OmbRefVec<TestNode, 0, OmbRefVecNotifier, OmbRefVecSharing<TestNode>>;
