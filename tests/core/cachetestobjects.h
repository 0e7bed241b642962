// Cache leaves and nodes for the cache tests.
#pragma once

#include <oecore/core/cache.h>
#include <oecore/core/refcnt.h>

#include <atomic>
#include <cstddef>

struct TestLeaf : OmbWRefCnt, OmbAbstractCacheLeaf {
    static inline std::atomic<int> alive{0};

    TestLeaf(std::size_t bytes, const OmbRef<OmbCacheGen>& generation, bool evictable = true)
        : bytes(bytes), evictable(evictable) {
        gcGeneration(generation);
        ++alive;
    }
    ~TestLeaf() override { --alive; }

    OmbRefCnt* asRefCnt() override { return this; }
    std::size_t gcSize() override { return bytes; }
    bool gcEvictable() override { return evictable; }
    bool gcEvictableNow() override { return !inUse; }

    std::size_t bytes;
    bool evictable;
    std::atomic<bool> inUse{false};
};

// A node like a data set's: never evicted itself.
struct TestCacheNode : OmbWRefCnt, OmbAbstractCacheNode {
    OmbRefCnt* asRefCnt() override { return this; }
    bool gcEvictable() override { return false; }
};
