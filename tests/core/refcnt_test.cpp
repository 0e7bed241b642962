#include <oecore/core/cache.h>
#include <oecore/core/cacheref.h>
#include <oecore/core/ref.h>

#include <gtest/gtest.h>

#include "testobjects.h"

TEST(RefCnt, CopyStartsFreshWithoutCountWeakRecordOrPredefinedName) {
    OmbRef<TestNode> original(new TestNode("a"));
    original->predefinedName(OmbString("WGS 84"));
    std::vector<OmbRef<TestNode>> holders(4, original);
    OmbWRef<TestNode> weak(original);
    ASSERT_EQ(original->refCount(), 5);
    ASSERT_TRUE(original->hasWeakRecord());

    TestNode* copy = original->clone();
    EXPECT_EQ(copy->refCount(), 0);
    EXPECT_FALSE(copy->hasWeakRecord());
    EXPECT_TRUE(copy->predefinedName().empty());
    EXPECT_EQ(copy->name(), OmbString("a"));
    OmbRef<TestNode> wrapped(copy);
    EXPECT_TRUE(wrapped->hasOnlyOneReferee());

    // Assignment between objects leaves the target's count alone.
    static_cast<OmbRefCnt&>(*wrapped) = *original;
    EXPECT_EQ(wrapped->refCount(), 1);
}

TEST(RefCnt, ReleaseDestroysExactlyOnceAndWeakSurvivesAsNull) {
    const int before = TestNode::alive;
    OmbWRef<TestNode> weak;
    {
        OmbRef<TestNode> strong(new TestNode);
        weak = OmbWRef<TestNode>(strong);
        OmbRef<TestNode> promoted = weak.strong();
        EXPECT_EQ(promoted.get(), strong.get());
        EXPECT_EQ(strong->refCount(), 2);
    }
    EXPECT_EQ(TestNode::alive, before);
    EXPECT_FALSE(weak.strong());
    EXPECT_TRUE(weak.expired());
    OmbWRef<TestNode> copy = weak;  // the record stays valid after the object
    EXPECT_FALSE(copy.strong());
    EXPECT_EQ(weak.data()->refCount(), 2);
}

// The moment between the final release's decrement and its deletion: the
// count is zero. A promotion then must fail; one that succeeded would let
// its own release delete the object while the first release still runs.
TEST(RefCnt, PromotionOfAnObjectWhoseCountReachedZeroFails) {
    const int before = TestNode::alive;
    auto* condemned = new TestNode;
    OmbWRef<TestNode> weak(condemned);
    EXPECT_FALSE(weak.strong());
    EXPECT_EQ(TestNode::alive, before + 1);
    EXPECT_EQ(condemned->refCount(), 0);
    delete condemned;
    EXPECT_FALSE(weak.strong());
}

TEST(RefCnt, SelfAssignmentAndReassignmentKeepCountsRight) {
    OmbRef<TestNode> a(new TestNode);
    OmbRef<TestNode>& alias = a;
    a = alias;
    EXPECT_EQ(a->refCount(), 1);

    const int before = TestNode::alive;
    OmbRef<TestNode> b(new TestNode);
    b = a;  // the old object goes, a's gains a reference
    EXPECT_EQ(TestNode::alive, before);
    EXPECT_EQ(a->refCount(), 2);
    b = nullptr;
    EXPECT_EQ(a->refCount(), 1);
}

namespace {

// A counted object whose interface is not its first base.
struct Payload {
    virtual ~Payload() = default;
    int value = 7;
};
struct Mixed : Payload, OmbRefCnt {
    static inline int destroyed = 0;
    ~Mixed() override { ++destroyed; }
};

}  // namespace

TEST(Ref, CountsThroughTheBaseWhenTheTypedPointerDiffers) {
    auto* object = new Mixed;
    {
        OmbRef<Payload> payload(object, object);
        EXPECT_NE(static_cast<const void*>(payload.countPointer()), static_cast<const void*>(payload.get()));
        OmbRef<Payload> copy = payload;
        EXPECT_EQ(object->refCount(), 2);
        EXPECT_EQ(copy->value, 7);
        OmbRef<Mixed> back = omb_dynamic_cast<Mixed>(copy);
        EXPECT_EQ(back.get(), object);
        EXPECT_EQ(object->refCount(), 3);
    }
    EXPECT_EQ(Mixed::destroyed, 1);
}

namespace {

class TestCachable : public OmbEngineObject, public OmbAbstractCacheLeaf {
    OMB_ENGINE_CLASS_INLINE(OmbEngineObject, "TestCachable", 0)

public:
    explicit TestCachable(bool evictable) : evictable_(evictable) {}
    TestCachable* clone() const override { return new TestCachable(evictable_); }
    OmbRefCnt* asRefCnt() override { return this; }
    std::size_t gcSize() override { return 0; }
    bool gcEvictable() override { return evictable_; }

private:
    bool evictable_;
};

}  // namespace

TEST(CacheRef, EvictableEntriesAreHeldStronglyOthersOnlyWeakly) {
    OmbRef<TestCachable> evictable(new TestCachable(true));
    OmbCacheRef strongHold(evictable.get());
    EXPECT_EQ(evictable->refCount(), 2);
    EXPECT_TRUE(strongHold.wref().empty());

    OmbCacheRef weakHold;
    {
        OmbRef<TestCachable> pinned(new TestCachable(false));
        weakHold = OmbCacheRef(pinned.get());
        EXPECT_EQ(pinned->refCount(), 1);
        EXPECT_FALSE(weakHold.ref());
        EXPECT_TRUE(weakHold.wref().strong());
    }
    // The cache never kept it alive.
    EXPECT_FALSE(weakHold.wref().strong());
}
