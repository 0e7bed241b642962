// Races on reference counts, weak records, strings, class ids, the
// configuration lock, abort requests and the cache collector. Run under
// ThreadSanitizer and AddressSanitizer, these catch what a plain run cannot.
#include <oecore/attr/attributeset.h>
#include <oecore/core/abort.h>
#include <oecore/core/globalcache.h>
#include <oecore/core/readerwriterlock.h>
#include <oecore/core/ref.h>
#include <oecore/core/runtime.h>
#include <oecore/core/string.h>

#include <gtest/gtest.h>

#include <atomic>
#include <barrier>
#include <set>
#include <thread>
#include <vector>

#include "cachetestobjects.h"
#include "testobjects.h"

namespace {

constexpr int rounds = 2000;

// Runs body(i) on n threads released at the same moment.
template <class Body>
void together(int n, Body body) {
    std::barrier start(n);
    std::vector<std::thread> threads;
    for (int i = 0; i < n; ++i)
        threads.emplace_back([&, i] {
            start.arrive_and_wait();
            body(i);
        });
    for (std::thread& t : threads) t.join();
}

}  // namespace

TEST(Concurrency, TwoFirstWeakReferencesShareOneRecord) {
    for (int round = 0; round < rounds; ++round) {
        OmbRef<TestNode> object(new TestNode);
        OmbWRef<TestNode> weak[2];
        together(2, [&](int i) { weak[i] = OmbWRef<TestNode>(object); });
        ASSERT_EQ(weak[0].data(), weak[1].data());
        ASSERT_EQ(weak[0].data()->refCount(), 3);  // the object's own hold and two callers
    }
}

TEST(Concurrency, PromotionRacingTheFinalReleaseNeverSeesADeadObject) {
    const int before = TestNode::alive;
    int promoted = 0;
    for (int round = 0; round < rounds; ++round) {
        auto* raw = new TestNode;
        OmbRef<TestNode> last(raw);
        OmbWRef<TestNode> weak(last);
        OmbRef<TestNode> got;
        together(2, [&](int i) {
            if (i == 0)
                last.reset();
            else
                got = weak.strong();
        });
        if (got) {
            ++promoted;
            ASSERT_EQ(got.get(), raw);
            ASSERT_EQ(got->refCount(), 1);
            ASSERT_EQ(TestNode::alive, before + 1);
            got.reset();
        }
        ASSERT_FALSE(weak.strong());
        ASSERT_EQ(TestNode::alive, before);
    }
    RecordProperty("promoted", promoted);
}

TEST(Concurrency, RefsCopiedAndReleasedOnManyThreads) {
    const int before = TestNode::alive;
    OmbRef<TestNode> shared(new TestNode);
    OmbWRef<TestNode> weak(shared);
    together(4, [&](int) {
        for (int i = 0; i < 20000; ++i) {
            OmbRef<TestNode> copy = shared;
            OmbRef<TestNode> again = weak.strong();
            ASSERT_TRUE(again);
        }
    });
    EXPECT_EQ(shared->refCount(), 1);
    shared.reset();
    EXPECT_EQ(TestNode::alive, before);
}

TEST(Concurrency, StringCopiesAndReleasesOnManyThreads) {
    OmbString original("a string shared by every thread");
    together(4, [&](int t) {
        std::vector<OmbString> copies;
        for (int i = 0; i < 20000; ++i) {
            copies.push_back(original);
            if (copies.size() > 16) copies.erase(copies.begin(), copies.begin() + 8 + t);
        }
        for (const OmbString& s : copies) ASSERT_EQ(s, original);
    });
    EXPECT_EQ(original, OmbString("a string shared by every thread"));
}

namespace {

template <int N>
struct Racer : OmbEngineObject {
    OMB_ENGINE_CLASS_INLINE(OmbEngineObject, "Racer", 0)

public:
    Racer* clone() const override { return new Racer; }
};

template <int... N>
std::vector<int> idsOf(std::integer_sequence<int, N...>) {
    return {Racer<N>::classId()...};
}

}  // namespace

TEST(Concurrency, ClassIdsStayUniqueWhenAskedFromManyThreads) {
    std::vector<int> seen[4];
    together(4, [&](int t) { seen[t] = idsOf(std::make_integer_sequence<int, 32>()); });
    for (int t = 1; t < 4; ++t) EXPECT_EQ(seen[t], seen[0]);
    EXPECT_EQ(std::set<int>(seen[0].begin(), seen[0].end()).size(), 32u);
}

TEST(Concurrency, WritersExcludeReadersAndEachOther) {
    OmbRef<OmbReaderWriterLock> lock(new OmbReaderWriterLock);
    long long a = 0;
    long long b = 0;  // writers keep a == b
    std::atomic<int> torn{0};
    together(4, [&](int t) {
        for (int i = 0; i < 2000; ++i) {
            if (t % 2 == 0) {
                OmbAcquireWriterLock writer(lock);
                ++a;
                ++b;
            } else {
                OmbReuseWriterOrAcquireRecursiveReaderLock reader(lock);
                if (a != b) ++torn;
            }
        }
    });
    EXPECT_EQ(torn, 0);
    EXPECT_EQ(a, 4000);
}

TEST(Concurrency, AGlobalAbortStopsExactlyOneThread) {
    Omb_requestAbort(0);
    std::atomic<int> aborted{0};
    together(4, [&](int) {
        try {
            Omb_checkAbort();
        } catch (const OmbXAbort&) {
            ++aborted;
        }
    });
    EXPECT_EQ(aborted, 1);
}

TEST(Concurrency, TheCollectorStopsCleanlyWhileCollectionsAreRequested) {
    OmbRuntime::globalCacheSize(0);
    for (int round = 0; round < 20; ++round) {
        OmbGlobalCache& cache = OmbGlobalCache::instance();
        OmbRef<TestCacheNode> node(new TestCacheNode);
        cache.addDataSet(node.get(), 1);
        together(3, [&](int t) {
            for (std::uint64_t i = 0; i < 200; ++i) {
                const OmbRef<OmbCacheGen> gen = cache.newGeneration();
                OmbRef<TestLeaf> leaf(new TestLeaf(64, gen));
                node->gcAdd(static_cast<std::uint64_t>(t) * 1000 + i, leaf.get());
                node->gcGet(static_cast<std::uint64_t>(t) * 1000 + i / 2);
                cache.collectAsync();
            }
        });
        cache.collect();
        OmbGlobalCache::destroy();
    }
    OmbRuntime::globalCacheSize(300);
}

TEST(Concurrency, AtomsInternedFromManyThreadsGetOneNumberPerString) {
    std::vector<OmbAtom> seen[4];
    together(4, [&](int t) {
        for (int i = 0; i < 500; ++i) seen[t].push_back(OmbAtoms::atom(OmbString("concurrent-" + std::to_string(i))));
    });
    for (int t = 1; t < 4; ++t) EXPECT_EQ(seen[t], seen[0]);
    EXPECT_EQ(std::set<OmbAtom>(seen[0].begin(), seen[0].end()).size(), 500u);
}

TEST(Concurrency, ClonesAreReadWhileAnotherCloneIsWritten) {
    const OmbAtom depth = OmbAtoms::atom(OmbString("depth"));
    OmbRef<OmbAttributeSet> original(new OmbAttributeSet);
    for (int i = 0; i < 8; ++i) original->set(OmbAtoms::atom(OmbString("a" + std::to_string(i))), std::int64_t{i});
    original->set(depth, 1.0);
    std::vector<OmbRef<OmbAttributeSet>> clones;
    for (int t = 0; t < 4; ++t) clones.emplace_back(original->clone());
    together(4, [&](int t) {
        for (int i = 0; i < 2000; ++i) {
            if (t == 0) {
                clones[0]->set(depth, static_cast<double>(i));  // copies the shared table once
            } else {
                double d = 0;
                ASSERT_TRUE(clones[t]->get(depth, d));
                ASSERT_EQ(d, 1.0);
            }
        }
    });
    double d = 0;
    EXPECT_TRUE(original->get(depth, d));
    EXPECT_EQ(d, 1.0);
}
