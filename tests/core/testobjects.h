// Small engine classes shared by the core tests.
#pragma once

#include <oecore/core/engineobject.h>
#include <oecore/core/refvec.h>
#include <oecore/core/resourceobject.h>

#include <atomic>
#include <vector>

// Counts its live instances; refers to any number of children.
class TestNode : public OmbResourceObject {
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

    static int classId() {
        static int id = 0;
        return initClassId(id);
    }
    static OmbClass* runtimeClass() {
        static OmbClass record(OmbResourceObject::runtimeClass(), 9, "TestNode");
        return &record;
    }
    const char* myRuntimeClassName() const override { return "TestNode"; }

    std::vector<OmbRef<TestNode>> children;
    int changes = 0;
    bool owned = false;
    int ownershipArgument = -1;

private:
    int myClassId_() const override { return classId(); }
    OmbClass* myRuntimeClass_() const override { return runtimeClass(); }
};

// A class that refuses to be cloned.
class Unclonable : public OmbEngineObject {
public:
    OmbEngineObject* clone() const override;
    static int classId() {
        static int id = 0;
        return initClassId(id);
    }
    static OmbClass* runtimeClass() {
        static OmbClass record(OmbEngineObject::runtimeClass(), 0, "Unclonable");
        return &record;
    }
    const char* myRuntimeClassName() const override { return "Unclonable"; }

private:
    int myClassId_() const override { return classId(); }
    OmbClass* myRuntimeClass_() const override { return runtimeClass(); }
};

inline OmbEngineObject* Unclonable::clone() const {
    throw OmbXObjectNotClonable(__FILE__, __LINE__, OmbString(myRuntimeClassName()));
}

using TestNodeVec = OmbRefVec<TestNode>;
using OwningTestNodeVec = OmbRefVec<TestNode, 0, OmbRefVecNotifier, OmbRefVecSharing<TestNode>>;
