// OmbGlobalCache: the process-wide, memory-bounded cache of re-creatable
// objects (open files, decoded tiles, presentation caches).
//
// A tree of cache nodes hangs from the root; every view update takes a new
// generation and stamps what it uses. When the cache grows past its limit
// (OmbRuntime::globalCacheSize() x 768 KiB) a collection evicts what was
// last used in the oldest active generations until the size is back under
// 95% of the limit. Collections run on the caller's thread (collect()) or on
// a background collector (collectAsync()).
//
// Thread safety: every operation may be called from any thread.
#pragma once

#include <oecore/core/cache.h>

#include <atomic>
#include <cstdint>
#include <mutex>
#include <semaphore>
#include <set>
#include <thread>
#include <vector>

class OmbGlobalCache {
public:
    // Bytes of cache per unit of OmbRuntime::globalCacheSize().
    static constexpr std::uint64_t bytesPerSizeUnit = 786432;

    // The cache, created on first use with its root, generation 0 and the
    // collector thread.
    static OmbGlobalCache& instance();
    // Stops the collector and releases the cache with everything only it
    // holds; the next instance() starts a new one. Called at runtime shutdown.
    static void destroy();

    // A new generation, active while referenced, stamped on the root.
    OmbRef<OmbCacheGen> newGeneration();
    // Adds a data set's cache node under the data set's key.
    void addDataSet(OmbICachable* child, std::uint64_t key);
    // Evicts until the cache is back under its limit, oldest generations first.
    void collect();
    // Asks the collector thread for a collection; returns at once.
    void collectAsync();
    // Drops the root and with it every object that nobody else holds.
    void flushCache();

    OmbRef<OmbCacheRoot> root();
    // The active generation numbers in ascending order.
    std::vector<std::uint64_t> activeGenerations();
    // The byte limit collections keep to.
    static std::uint64_t limit();

    OmbGlobalCache(const OmbGlobalCache&) = delete;
    OmbGlobalCache& operator=(const OmbGlobalCache&) = delete;

private:
    friend class OmbCacheGen;

    explicit OmbGlobalCache(std::uint64_t epoch);
    ~OmbGlobalCache();

    void activate(std::uint64_t gen);
    // Unregisters gen from the cache of that epoch, if it still exists.
    static void retire(std::uint64_t gen, std::uint64_t epoch);
    void runCollector();

    const std::uint64_t epoch_;
    std::mutex mutex_;
    std::set<std::uint64_t> active_;
    std::atomic<std::uint64_t> counter_{0};
    OmbRef<OmbCacheRoot> root_;
    std::counting_semaphore<> wake_{0};
    std::atomic<bool> stop_{false};
    std::atomic<bool> pending_{false};
    std::thread collector_;
};
