#include <oecore/core/refvec.h>
#include <oecore/core/vec.h>

#include <gtest/gtest.h>

#include "testobjects.h"

namespace {

using IntVec = OmbVec<int>;
using SharedIntVec = OmbVec<int, 0, OmbVecNotifierDummy, std::vector<int>, OmbVecSharing>;

std::vector<int> values(const IntVec& v) { return {v.begin(), v.end()}; }

}  // namespace

TEST(Vec, EditsKeepOrder) {
    OmbRef<IntVec> v(new IntVec{3, 1, 2});
    v->insert(1, 9);
    v->add(4);
    EXPECT_EQ(values(*v), (std::vector<int>{3, 9, 1, 2, 4}));
    EXPECT_TRUE(v->remove(1));
    EXPECT_FALSE(v->remove(42));
    v->removeAt(0);
    EXPECT_EQ(v->pop(), 4);
    EXPECT_EQ(values(*v), (std::vector<int>{9, 2}));
    v->sort();
    v->addRange(*v);
    EXPECT_EQ(values(*v), (std::vector<int>{2, 9, 2, 9}));
    v->reverse();
    v->set(0, 5);
    EXPECT_EQ(values(*v), (std::vector<int>{5, 2, 9, 2}));
    EXPECT_EQ(v->indexOf(9), 2);
    v->erase(1, 2);
    v->grow(2);
    EXPECT_EQ(values(*v), (std::vector<int>{5, 2, 0, 0}));

    OmbRef<IntVec> copy = v->shallowCopy();
    EXPECT_TRUE(copy->equals(*v));
    copy->set(0, 1);
    EXPECT_FALSE(copy->equals(*v));
}

TEST(Vec, IndicesOfChangesAreCheckedAndNothingChangesOnError) {
    OmbRef<IntVec> v(new IntVec{1, 2, 3});
    EXPECT_THROW(v->set(3, 0), OmbXRangeError);
    EXPECT_THROW(v->insert(4, 0), OmbXRangeError);
    EXPECT_THROW(v->erase(2, 2), OmbXRangeError);
    EXPECT_THROW(v->erase(1, static_cast<std::size_t>(-1)), OmbXRangeError);
    try {
        v->removeAt(7);
        FAIL();
    } catch (const OmbXRangeError& e) {
        EXPECT_EQ(e.asString(), OmbString("Value \"7\" is out of range in collection erase, should be below 4."));
    }
    EXPECT_EQ(values(*v), (std::vector<int>{1, 2, 3}));
    v->insert(3, 4);  // at the end is allowed
    v->erase(4, 0);
    OmbRef<IntVec> empty(new IntVec);
    EXPECT_THROW(empty->pop(), OmbXRangeError);
    EXPECT_THROW(empty->pop_back(), OmbXRangeError);
}

TEST(Vec, ReadOnlyIsEnforcedOnlyWithASharingPolicy) {
    OmbRef<SharedIntVec> shared(new SharedIntVec{1, 2});
    shared->markReadOnly();
    EXPECT_THROW(shared->add(3), OmbXReadOnly);
    EXPECT_THROW(shared->clear(), OmbXReadOnly);
    EXPECT_THROW(shared->set(0, 7), OmbXReadOnly);
    EXPECT_THROW(shared->sort(), OmbXReadOnly);
    EXPECT_EQ(shared->size(), 2u);
    EXPECT_EQ(shared->get(0), 1);
    try {
        shared->add(3);
    } catch (const OmbXReadOnly& e) {
        EXPECT_EQ(e.asString(), OmbString("The Collection is read-only."));
    }

    OmbRef<IntVec> plain(new IntVec{1});
    plain->markReadOnly();
    plain->add(2);
    EXPECT_TRUE(plain->isReadOnly());
    EXPECT_EQ(plain->size(), 2u);

    // A clone is writable again.
    OmbRef<SharedIntVec> copy(shared->clone());
    EXPECT_FALSE(copy->isReadOnly());
    copy->add(3);
}

TEST(Vec, SharingOwnsTheVectorOnce) {
    OmbRef<SharedIntVec> v(new SharedIntVec);
    EXPECT_TRUE(v->takeOwnership());
    EXPECT_FALSE(v->takeOwnership());
    EXPECT_TRUE(v->isOwned());
    v->releaseOwnership();
    EXPECT_FALSE(v->isOwned());
    EXPECT_TRUE(v->takeOwnership());
}

TEST(RefVec, OwnedCollectionOwnsItsItems) {
    OmbRef<OwningTestNodeVec> v(new OwningTestNodeVec);
    OmbRef<TestNode> a(new TestNode("a"));
    OmbRef<TestNode> b(new TestNode("b"));
    v->add(a);
    v->takeOwnershipArgument(7);
    ASSERT_TRUE(v->takeOwnership());
    EXPECT_TRUE(a->owned);
    EXPECT_EQ(a->ownershipArgument, 7);

    v->add(b);
    EXPECT_TRUE(b->owned);
    OmbRef<TestNode> c(new TestNode("c"));
    v->set(0, c);  // a is replaced and free again
    EXPECT_FALSE(a->owned);
    EXPECT_TRUE(c->owned);
    v->removeAt(0);  // and so is an item that leaves
    EXPECT_FALSE(c->owned);

    v->releaseOwnership();
    EXPECT_FALSE(b->owned);
    EXPECT_FALSE(v->isOwned());
}

TEST(RefVec, ItemOwnedElsewhereIsRefusedAndNothingChanges) {
    OmbRef<OwningTestNodeVec> v(new OwningTestNodeVec);
    ASSERT_TRUE(v->takeOwnership());
    OmbRef<TestNode> taken(new TestNode("taken"));
    taken->owned = true;
    EXPECT_THROW(v->add(taken), OmbXSharingViolation);
    EXPECT_TRUE(v->empty());

    OmbRef<OwningTestNodeVec> range(new OwningTestNodeVec);
    OmbRef<TestNode> free(new TestNode("free"));
    range->add(free);
    range->add(taken);
    EXPECT_THROW(v->addRange(*range), OmbXSharingViolation);
    EXPECT_TRUE(v->empty());
    EXPECT_FALSE(free->owned) << "the item taken before the refusal is released again";
}

TEST(RefVec, FailedTakeOwnershipReleasesItemsAndLeavesCollectionFree) {
    OmbRef<OwningTestNodeVec> v(new OwningTestNodeVec);
    OmbRef<TestNode> first(new TestNode("first"));
    OmbRef<TestNode> taken(new TestNode("taken"));
    taken->owned = true;
    v->add(first);
    v->add(taken);
    EXPECT_FALSE(v->takeOwnership());
    EXPECT_FALSE(first->owned);
    EXPECT_FALSE(v->isOwned());
    // Once the obstacle is gone the collection can be owned.
    taken->owned = false;
    EXPECT_TRUE(v->takeOwnership());
}

TEST(RefVec, NotifierReportsChangesToALiveOwnerOnly) {
    OmbRef<OwningTestNodeVec> v(new OwningTestNodeVec);
    {
        OmbRef<TestNode> owner(new TestNode("owner"));
        v->notifier().owner(owner.get());
        v->add(OmbRef<TestNode>(new TestNode));
        v->insert(0, OmbRef<TestNode>(new TestNode));
        v->set(1, OmbRef<TestNode>(new TestNode));
        v->clear();
        EXPECT_EQ(owner->changes, 4);
        EXPECT_EQ(v->notifier().owner().get(), owner.get());
    }
    // The notifier held the owner weakly: it is gone, and changes go unreported.
    EXPECT_FALSE(v->notifier().owner());
    v->add(OmbRef<TestNode>(new TestNode));
}

TEST(RefVec, CloneCopiesItemsShallowCopySharesThem) {
    OmbRef<TestNodeVec> v(new TestNodeVec);
    v->add(OmbRef<TestNode>(new TestNode("x")));
    v->add(OmbRef<TestNode>());
    OmbRef<TestNodeVec> deep(v->clone());
    OmbRef<TestNodeVec> shallow = v->shallowCopy();
    EXPECT_NE(deep->get(0).get(), v->get(0).get());
    EXPECT_EQ(deep->get(0)->name(), OmbString("x"));
    EXPECT_FALSE(deep->get(1));
    EXPECT_EQ(shallow->get(0).get(), v->get(0).get());
    EXPECT_TRUE(shallow->equals(*v));

    OmbRef<OmbEngineObjectVec> children = v->getMyChildObjects();
    EXPECT_EQ(children->size(), 1u);
}
