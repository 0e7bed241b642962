// The building blocks of the global object cache: generations, leaves (the
// cached objects) and nodes (objects with cached children).
//
// Every view update opens a generation; objects used in it are stamped with
// it. A node files each child under the generation it was last stamped with,
// so eviction walks only the generations older than the one it is given.
//
// Thread safety: every node operation takes the node's mutex; leaves guard
// their generation themselves. All may be called from any thread.
#pragma once

#include <oecore/core/cachable.h>
#include <oecore/core/cacheref.h>
#include <oecore/core/refcnt.h>

#include <cstddef>
#include <cstdint>
#include <functional>
#include <map>
#include <mutex>
#include <unordered_map>
#include <unordered_set>
#include <vector>

class OmbGlobalCache;

// A generation number, active while referenced (or until the cache retires
// it). Created by OmbGlobalCache::newGeneration().
class OmbCacheGen : public OmbRefCnt {
public:
    ~OmbCacheGen() override;
    std::uint64_t gen() const noexcept { return gen_; }

private:
    friend class OmbGlobalCache;
    OmbCacheGen(OmbGlobalCache& cache, std::uint64_t gen);

    std::uint64_t gen_;
    std::uint64_t cacheEpoch_;
};

// The generation number of a stamp; 0 for none.
inline std::uint64_t Omb_generationOf(const OmbRef<OmbCacheGen>& gen) { return gen ? gen->gen() : 0; }

// A cached object: it only keeps the generation of its last touch.
class OmbAbstractCacheLeaf : public OmbICachable {
public:
    void gcGeneration(const OmbRef<OmbCacheGen>& generation) override;
    OmbRef<OmbCacheGen> gcGeneration() override;
    bool gcIsCacheLeaf() override { return true; }
    bool gcEvictable() override { return true; }
    bool gcEvictableNow() override { return true; }
    OmbRef<OmbRefCnt> gcGet(std::uint64_t) override { return OmbRef<OmbRefCnt>(); }
    void gcAdd(std::uint64_t, OmbICachable*) override {}
    void gcRemove(std::uint64_t) override {}
    void gcEvict(std::uint64_t) override {}
    bool gcEmpty() override { return true; }

private:
    std::mutex mutex_;
    OmbRef<OmbCacheGen> generation_;
};

// A cache node: children under 64-bit keys, filed in generation buckets.
// Evictable children are held strongly (the node keeps them alive until it
// evicts them), the others weakly in a bucket of their own.
class OmbAbstractCacheNode : public OmbICachable {
public:
    // Weakly held children.
    static constexpr std::uint64_t weakBucket = 0xFFFFFFFFFFFFFFFFull;
    // Children that were due for eviction while in use; retried later.
    static constexpr std::uint64_t parkedBucket = 0xFFFFFFFFFFFFFFFEull;

    // The node is guarded by the owning object's mutex, or by its own when
    // none is given.
    explicit OmbAbstractCacheNode(std::recursive_mutex* ownerMutex = nullptr);
    OmbAbstractCacheNode(const OmbAbstractCacheNode&) = delete;
    OmbAbstractCacheNode& operator=(const OmbAbstractCacheNode&) = delete;

    // The summed sizes of the children, as they were when added.
    std::size_t gcSize() override;
    void gcGeneration(const OmbRef<OmbCacheGen>& generation) override;
    OmbRef<OmbCacheGen> gcGeneration() override;
    bool gcIsCacheLeaf() override { return false; }
    bool gcEvictable() override { return true; }
    bool gcEvictableNow() override { return true; }
    OmbRef<OmbRefCnt> gcGet(std::uint64_t key) override;
    // Replaces a child already under the key.
    void gcAdd(std::uint64_t key, OmbICachable* child) override;
    void gcRemove(std::uint64_t key) override;
    void gcEvict(std::uint64_t generation) override;
    bool gcEmpty() override;

    std::size_t childCount();
    // The bucket a child is filed in, or none.
    bool filedIn(std::uint64_t key, std::uint64_t& bucket);

protected:
    // Calls fn with every child that still exists, under the node's mutex.
    void forEachLiveChild(const std::function<void(OmbICachable&)>& fn);

private:
    struct Entry {
        OmbCacheRef ref;
        std::uint64_t bucket;
        std::size_t size;
    };
    using Guard = std::lock_guard<std::recursive_mutex>;

    void file(std::uint64_t key, std::uint64_t bucket);
    void unfile(std::uint64_t key, std::uint64_t bucket);
    // Removes the entry; its reference is handed to released so that the
    // child dies after the mutex is left.
    void erase(std::unordered_map<std::uint64_t, Entry>::iterator it, std::vector<OmbCacheRef>& released);

    std::recursive_mutex ownMutex_;
    std::recursive_mutex& mutex_;
    std::unordered_map<std::uint64_t, Entry> children_;
    std::map<std::uint64_t, std::unordered_set<std::uint64_t>> buckets_;
    std::size_t size_ = 0;
    OmbRef<OmbCacheGen> generation_;
};

// The root of the global cache; never evicted. Its size is the live size of
// the whole tree.
class OmbCacheRoot : public OmbRefCnt, public OmbAbstractCacheNode {
public:
    OmbRefCnt* asRefCnt() override { return this; }
    std::size_t gcSize() override;
    bool gcEvictable() override { return false; }
};
