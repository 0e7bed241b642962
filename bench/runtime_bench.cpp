// The configuration lock against std::shared_mutex, and the global cache's
// touch and collection over 100,000 entries.
#include <oecore/core/globalcache.h>
#include <oecore/core/readerwriterlock.h>
#include <oecore/core/runtime.h>

#include <shared_mutex>

#include "../tests/core/cachetestobjects.h"
#include "ratioreporter.h"

namespace {

OmbReaderWriterLock& sharedLock() {
    static OmbRef<OmbReaderWriterLock> lock(new OmbReaderWriterLock);
    return *lock;
}

std::shared_mutex& sharedMutex() {
    static std::shared_mutex mutex;
    return mutex;
}

void BM_OmbReaderLock(benchmark::State& state) {
    OmbReaderWriterLock& lock = sharedLock();
    for (auto _ : state) {
        lock.acquireReaderLock();
        lock.releaseReaderLock();
    }
}
void BM_StdSharedMutex(benchmark::State& state) {
    std::shared_mutex& mutex = sharedMutex();
    for (auto _ : state) {
        mutex.lock_shared();
        mutex.unlock_shared();
    }
}
BENCHMARK(BM_OmbReaderLock);
BENCHMARK(BM_StdSharedMutex);
BENCHMARK(BM_OmbReaderLock)->Threads(2)->UseRealTime();
BENCHMARK(BM_StdSharedMutex)->Threads(2)->UseRealTime();

constexpr std::uint64_t entries = 100000;

// A data set node with 100,000 cached leaves of the given generation.
OmbRef<TestCacheNode> filledNode(const OmbRef<OmbCacheGen>& gen) {
    OmbRef<TestCacheNode> node(new TestCacheNode);
    for (std::uint64_t key = 0; key < entries; ++key) node->gcAdd(key, OmbRef<TestLeaf>(new TestLeaf(100, gen)).get());
    return node;
}

void BM_CacheTouch(benchmark::State& state) {
    OmbGlobalCache& cache = OmbGlobalCache::instance();
    const OmbRef<TestCacheNode> node = filledNode(cache.newGeneration());
    node->gcGeneration(cache.newGeneration());
    std::uint64_t key = 0;
    for (auto _ : state) {
        benchmark::DoNotOptimize(node->gcGet(key));
        key = (key + 7919) % entries;
    }
}
BENCHMARK(BM_CacheTouch);

// Evicting all 100,000 entries of an old generation.
void BM_CacheCollect100k(benchmark::State& state) {
    OmbRuntime::globalCacheSize(0);
    OmbGlobalCache& cache = OmbGlobalCache::instance();
    for (auto _ : state) {
        state.PauseTiming();
        OmbRef<TestCacheNode> node = filledNode(cache.newGeneration());
        cache.addDataSet(node.get(), 1);
        state.ResumeTiming();
        cache.collect();
        state.PauseTiming();
        node.reset();
        state.ResumeTiming();
    }
    OmbRuntime::globalCacheSize(300);
}
BENCHMARK(BM_CacheCollect100k)->Unit(benchmark::kMillisecond);

}  // namespace

int main(int argc, char** argv) {
    const int status =
        runWithRatios(argc, argv,
                      {{"BM_OmbReaderLock", "BM_StdSharedMutex"},
                       {"BM_OmbReaderLock/real_time/threads:2", "BM_StdSharedMutex/real_time/threads:2"}});
    OmbGlobalCache::destroy();
    return status;
}
