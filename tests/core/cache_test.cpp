#include <oecore/core/globalcache.h>
#include <oecore/core/runtime.h>

#include <gtest/gtest.h>

#include <chrono>
#include <thread>

#include "cachetestobjects.h"

namespace {

// A fresh cache of the given size for each test, destroyed after it.
class CacheTest : public ::testing::Test {
protected:
    void TearDown() override {
        node.reset();
        OmbGlobalCache::destroy();
        OmbRuntime::globalCacheSize(300);
    }
    OmbGlobalCache& cache(int sizeUnits) {
        OmbRuntime::globalCacheSize(sizeUnits);
        OmbGlobalCache& c = OmbGlobalCache::instance();
        node = OmbRef<TestCacheNode>(new TestCacheNode);
        c.addDataSet(node.get(), 1);
        return c;
    }
    OmbRef<TestLeaf> add(std::uint64_t key, std::size_t bytes, const OmbRef<OmbCacheGen>& gen) {
        OmbRef<TestLeaf> leaf(new TestLeaf(bytes, gen));
        node->gcAdd(key, leaf.get());
        return leaf;
    }
    bool has(std::uint64_t key) {
        std::uint64_t bucket;
        return node->filedIn(key, bucket);
    }

    OmbRef<TestCacheNode> node;
};

}  // namespace

TEST_F(CacheTest, SizeZeroEvictsEverythingEvictable) {
    OmbGlobalCache& c = cache(0);
    const int before = TestLeaf::alive;
    const OmbRef<OmbCacheGen> gen = c.newGeneration();
    for (std::uint64_t key = 10; key < 20; ++key) add(key, 100, gen);
    EXPECT_EQ(c.root()->gcSize(), 1000u);
    c.collect();
    EXPECT_EQ(node->childCount(), 0u);
    EXPECT_EQ(c.root()->gcSize(), 0u);
    EXPECT_EQ(TestLeaf::alive, before);
    EXPECT_TRUE(c.root()->gcGet(1)) << "the data set node itself is not evictable";
}

TEST_F(CacheTest, TheNewestGenerationSurvives) {
    OmbGlobalCache& c = cache(1);  // limit 786432 bytes, target 747110
    const OmbRef<OmbCacheGen> old = c.newGeneration();
    const OmbRef<OmbCacheGen> newest = c.newGeneration();
    add(1, 700000, old);
    add(2, 100000, newest);
    c.collect();
    EXPECT_FALSE(has(1));
    EXPECT_TRUE(has(2));
    EXPECT_EQ(c.activeGenerations(), (std::vector<std::uint64_t>{newest->gen()}));
}

TEST_F(CacheTest, ATouchSinceFilingMovesTheChildToItsNewGeneration) {
    OmbGlobalCache& c = cache(0);
    const OmbRef<OmbCacheGen> first = c.newGeneration();
    const OmbRef<OmbCacheGen> second = c.newGeneration();
    add(5, 10, first);
    node->gcGeneration(second);
    ASSERT_TRUE(node->gcGet(5));  // stamps the leaf with the node's generation
    node->gcEvict(second->gen());
    std::uint64_t bucket = 0;
    ASSERT_TRUE(node->filedIn(5, bucket));
    EXPECT_EQ(bucket, second->gen());
    EXPECT_FALSE(node->gcGet(6));
}

TEST_F(CacheTest, ObjectsInUseAreParkedAndEvictedLater) {
    OmbGlobalCache& c = cache(0);
    const OmbRef<TestLeaf> busy = add(3, 50, c.newGeneration());
    busy->inUse = true;
    c.collect();
    std::uint64_t bucket = 0;
    ASSERT_TRUE(node->filedIn(3, bucket));
    EXPECT_EQ(bucket, OmbAbstractCacheNode::parkedBucket);
    busy->inUse = false;
    c.newGeneration();  // a new update comes, and with it a new collection
    c.collect();
    EXPECT_FALSE(has(3));
}

TEST_F(CacheTest, WeaklyHeldChildrenAreNeverKeptAlive) {
    OmbGlobalCache& c = cache(0);
    {
        OmbRef<TestLeaf> pinned(new TestLeaf(10, c.newGeneration(), false));
        node->gcAdd(8, pinned.get());
        std::uint64_t bucket = 0;
        ASSERT_TRUE(node->filedIn(8, bucket));
        EXPECT_EQ(bucket, OmbAbstractCacheNode::weakBucket);
        EXPECT_EQ(pinned->refCount(), 1);
    }
    EXPECT_FALSE(node->gcGet(8));  // gone, and forgotten
    EXPECT_FALSE(has(8));
}

TEST_F(CacheTest, GenerationChurnLeavesTheActiveSetAsItWas) {
    OmbGlobalCache& c = cache(300);
    c.newGeneration();
    const std::size_t before = c.activeGenerations().size();
    for (int i = 0; i < 100; ++i) c.newGeneration();
    EXPECT_EQ(c.activeGenerations().size(), before);
}

TEST_F(CacheTest, FlushReleasesWhatOnlyTheCacheHeld) {
    OmbGlobalCache& c = cache(300);
    const int before = TestLeaf::alive;
    add(1, 10, c.newGeneration());
    EXPECT_EQ(TestLeaf::alive, before + 1);
    c.flushCache();
    EXPECT_FALSE(c.root());
    node.reset();
    EXPECT_EQ(TestLeaf::alive, before);
    c.collect();  // nothing to collect without a root
}

TEST_F(CacheTest, TheCollectorThreadCollectsOnRequest) {
    OmbGlobalCache& c = cache(0);
    add(4, 10, c.newGeneration());
    c.collectAsync();
    const auto deadline = std::chrono::steady_clock::now() + std::chrono::seconds(10);
    while (has(4) && std::chrono::steady_clock::now() < deadline)
        std::this_thread::sleep_for(std::chrono::milliseconds(1));
    EXPECT_FALSE(has(4));
}

TEST_F(CacheTest, GenerationsMayOutliveTheCache) {
    OmbRef<OmbCacheGen> survivor = cache(300).newGeneration();
    node.reset();
    OmbGlobalCache::destroy();
    OmbGlobalCache& fresh = OmbGlobalCache::instance();
    const OmbRef<OmbCacheGen> next = fresh.newGeneration();
    EXPECT_EQ(next->gen(), 1u);
    survivor.reset();  // retires nothing in the new cache
    EXPECT_EQ(fresh.activeGenerations(), (std::vector<std::uint64_t>{1}));
}
