#include <oecore/core/globalcache.h>
#include <oecore/core/log.h>
#include <oecore/core/runtime.h>

#include <algorithm>

namespace {

// Publishes and withdraws the instance, and lets generations that outlive
// their cache find out. Never held while another lock is taken, except the
// cache's own mutex in retire().
std::mutex instanceMutex;
std::atomic<OmbGlobalCache*> current{nullptr};
std::atomic<std::uint64_t> lastEpoch{0};

}  // namespace

OmbCacheGen::OmbCacheGen(OmbGlobalCache& cache, std::uint64_t gen) : gen_(gen), cacheEpoch_(cache.epoch_) {
    cache.activate(gen);
}

OmbCacheGen::~OmbCacheGen() { OmbGlobalCache::retire(gen_, cacheEpoch_); }

OmbGlobalCache& OmbGlobalCache::instance() {
    if (OmbGlobalCache* cache = current.load(std::memory_order_acquire)) return *cache;
    // Built outside the lock: building takes the new root's lock.
    auto* fresh = new OmbGlobalCache(lastEpoch.fetch_add(1) + 1);
    OmbGlobalCache* winner;
    {
        std::lock_guard lock(instanceMutex);
        winner = current.load(std::memory_order_relaxed);
        if (!winner) current.store(winner = fresh, std::memory_order_release);
    }
    if (winner != fresh) delete fresh;  // another thread was first
    return *winner;
}

void OmbGlobalCache::destroy() {
    OmbGlobalCache* cache;
    {
        std::lock_guard lock(instanceMutex);
        cache = current.exchange(nullptr);
    }
    // Outside the lock: releasing cached objects retires generations.
    delete cache;
}

OmbGlobalCache::OmbGlobalCache(std::uint64_t epoch) : epoch_(epoch), root_(new OmbCacheRoot) {
    root_->gcGeneration(OmbRef<OmbCacheGen>(new OmbCacheGen(*this, 0)));
    collector_ = std::thread([this] { runCollector(); });
}

OmbGlobalCache::~OmbGlobalCache() {
    stop_.store(true);
    wake_.release();
    collector_.join();
    flushCache();
}

void OmbGlobalCache::activate(std::uint64_t gen) {
    std::lock_guard lock(mutex_);
    active_.insert(gen);
}

void OmbGlobalCache::retire(std::uint64_t gen, std::uint64_t epoch) {
    std::lock_guard lock(instanceMutex);
    OmbGlobalCache* cache = current.load(std::memory_order_relaxed);
    if (!cache || cache->epoch_ != epoch) return;
    std::lock_guard cacheLock(cache->mutex_);
    cache->active_.erase(gen);
}

OmbRef<OmbCacheGen> OmbGlobalCache::newGeneration() {
    std::uint64_t gen = counter_.load();
    while (!counter_.compare_exchange_weak(gen, gen + 1)) {
    }
    OmbRef<OmbCacheGen> generation(new OmbCacheGen(*this, gen + 1));
    if (const OmbRef<OmbCacheRoot> r = root()) r->gcGeneration(generation);
    return generation;
}

void OmbGlobalCache::addDataSet(OmbICachable* child, std::uint64_t key) {
    if (const OmbRef<OmbCacheRoot> r = root()) r->gcAdd(key, child);
}

std::uint64_t OmbGlobalCache::limit() {
    return static_cast<std::uint64_t>(std::max(0, OmbRuntime::globalCacheSize())) * bytesPerSizeUnit;
}

void OmbGlobalCache::collect() {
    const OmbRef<OmbCacheRoot> r = root();
    if (!r) return;
    const std::uint64_t bound = limit();
    std::uint64_t size = r->gcSize();
    if (size <= bound) return;
    const std::uint64_t target = (bound / 20) * 19;
    while (size > target) {
        std::uint64_t oldest;
        {
            std::lock_guard lock(mutex_);
            if (active_.empty()) break;
            oldest = *active_.begin();
        }
        r->gcEvict(oldest + 1);
        {
            // Retired even if something still refers to it.
            std::lock_guard lock(mutex_);
            if (!active_.empty() && *active_.begin() == oldest) active_.erase(active_.begin());
        }
        size = r->gcSize();
    }
}

void OmbGlobalCache::collectAsync() {
    pending_.store(true);
    wake_.release();
}

void OmbGlobalCache::flushCache() {
    OmbRef<OmbCacheRoot> dropped;
    std::lock_guard lock(mutex_);
    dropped.swap(root_);
}

OmbRef<OmbCacheRoot> OmbGlobalCache::root() {
    std::lock_guard lock(mutex_);
    return root_;
}

std::vector<std::uint64_t> OmbGlobalCache::activeGenerations() {
    std::lock_guard lock(mutex_);
    return {active_.begin(), active_.end()};
}

void OmbGlobalCache::runCollector() {
    for (;;) {
        wake_.acquire();
        if (stop_.load()) return;
        if (!pending_.exchange(false)) continue;
        try {
            collect();
        } catch (const OmbException&) {
            // Already logged; the next request tries again.
        } catch (const std::exception& e) {
            OmbLog::error(Omb_formatMessage("Cache collection failed: %1%", {OmbString(e.what())}));
        }
    }
}
