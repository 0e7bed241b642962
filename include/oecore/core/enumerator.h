// Enumerators over sequences of engine objects.
#pragma once

#include <oecore/core/engineobject.h>
#include <oecore/core/refvec.h>

#include <deque>
#include <unordered_set>

class OmbEngineObjectEnumerator : public OmbEngineObject {
    OMB_DECLARE_ENGINE_CLASS()

public:
    // An enumerator over the items of a collection.
    static OmbRef<OmbEngineObjectEnumerator> create(const OmbRef<OmbEngineObjectVec>& items);

    OmbEngineObjectEnumerator* clone() const override;

    // Empty before the first moveNext().
    virtual const OmbRef<OmbEngineObject>& current() const;
    // Advances; false once past the end.
    virtual bool moveNext();
    virtual void reset();

protected:
    OmbEngineObjectEnumerator() = default;

private:
    explicit OmbEngineObjectEnumerator(const OmbRef<OmbEngineObjectVec>& items) : items_(items) {}

    OmbRef<OmbEngineObjectVec> items_;
    std::size_t index_ = 0;
};

// Walks the objects reachable from a root breadth-first, each object once,
// the root itself not reported by its own expansion. Not recursive: only the
// root's own children. The root must outlive the enumerator, like a
// container outlives its iterators.
class OmbChildObjectEnumerator : public OmbEngineObjectEnumerator {
    OMB_DECLARE_ENGINE_CLASS()

public:
    OmbChildObjectEnumerator(const OmbEngineObject& root, bool recursive);

    OmbChildObjectEnumerator* clone() const override;
    const OmbRef<OmbEngineObject>& current() const override;
    bool moveNext() override;
    void reset() override;

private:
    void expand(const OmbEngineObject& object);

    const OmbEngineObject* root_;
    bool recursive_;
    bool started_ = false;
    std::deque<OmbRef<OmbEngineObject>> pending_;
    std::unordered_set<const OmbEngineObject*> seen_;
};
