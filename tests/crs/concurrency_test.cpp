// Datums, shifts and projections shared by threads: the caches that shifts
// build on first use are built once, and every thread sees the same results.
#include <oecore/core/runtime.h>
#include <oecore/crs/crs.h>
#include <oecore/crs/geodeticdatum.h>
#include <oecore/crs/projections/dynamiclocal.h>
#include <oecore/crs/projections/projlibprojections.h>

#include <gtest/gtest.h>

#include <atomic>
#include <functional>
#include <memory>
#include <thread>
#include <vector>

#include "../core/tempdir.h"
#include "../runtimescope.h"
#include "gridfiles.h"
#include "testdatums.h"

namespace {

class SharedByThreads : public RuntimeScope {
protected:
    // Converts the same point on several threads at once, all starting
    // together so that their first calls race; counts results that differ
    // from the expected one.
    static int differingResults(const std::function<OmbPoint()>& convert, const OmbPoint& expected) {
        std::atomic<bool> go{false};
        std::atomic<int> differing{0};
        std::vector<std::thread> threads;
        for (int t = 0; t < 4; ++t)
            threads.emplace_back([&] {
                while (!go) std::this_thread::yield();
                for (int i = 0; i < 200; ++i)
                    if (!(convert() == expected)) ++differing;
            });
        go = true;
        for (std::thread& t : threads) t.join();
        return differing;
    }
};

TEST_F(SharedByThreads, HelmertMatricesAreBuiltOnceForAllThreads) {
    OmbPoint expected(-2, 53, 100);
    osgb36()->changeDatumTo(*OmbGeodeticDatum::wgs84(), expected);

    const auto shared = osgb36();  // its matrices not built yet
    EXPECT_EQ(differingResults(
                  [&] {
                      OmbPoint p(-2, 53, 100);
                      shared->changeDatumTo(*OmbGeodeticDatum::wgs84(), p);
                      return p;
                  },
                  expected),
              0);
}

TEST_F(SharedByThreads, GridFilesAreOpenedOnceForAllThreads) {
    const TempDir dir;
    dir.write("a.ct2", ctable2([](int lon, int lat) { return std::pair(0.5 * lon, 0.25 * lat); }));
    const auto shift = [&] {
        OmbRef<OmbGridFileDatumShift> s(new OmbGridFileDatumShift);
        s->path = OmbString(dir.path().string());
        s->fileName = OmbString("*.ct2");
        return s;
    };
    OmbPoint expected(11.3, 50.7);
    shift()->changeDatumToKnownDatum(*OmbGeodeticDatum::wgs84(), expected);

    const auto shared = shift();  // its grids not opened yet
    EXPECT_EQ(differingResults(
                  [&] {
                      OmbPoint p(11.3, 50.7);
                      shared->changeDatumToKnownDatum(*OmbGeodeticDatum::wgs84(), p);
                      return p;
                  },
                  expected),
              0);
}

TEST_F(SharedByThreads, ProjectionsEvaluatedByProjServeSeveralThreads) {
    OmbRef<OmbAlbersEqualAreaConic> albers(new OmbAlbersEqualAreaConic);
    albers->standardParallel1(29.5);
    albers->standardParallel2(45.5);
    const std::unique_ptr<OmbProjCachedNumbers> cached(albers->init(*OmbGeodeticDatum::wgs84()));
    OmbPoint expected(-100, 40);
    albers->project(expected, cached.get());
    EXPECT_EQ(differingResults(
                  [&] {
                      OmbPoint p(-100, 40);
                      albers->project(p, cached.get());
                      return p;
                  },
                  expected),
              0);
}

// The centre moves while other threads project: each result belongs to one
// whole state, never to a mix of two.
TEST_F(SharedByThreads, DynamicLocalProjectionMovesWhileInUse) {
    OmbRef<OmbDynamicLocalProjection> local(new OmbDynamicLocalProjection);
    const std::unique_ptr<OmbProjCachedNumbers> cached(local->init(*OmbGeodeticDatum::wgs84()));
    const auto projected = [&] {
        OmbPoint p(10.5, 60.5);
        local->project(p, cached.get());
        return p;
    };
    local->set(10, 60, 30);
    const OmbPoint first = projected();
    local->set(11, 61, -45);
    const OmbPoint second = projected();
    std::atomic<bool> done{false};
    std::atomic<int> mixed{0};
    std::thread mover([&] {
        for (int i = 0; i < 2000; ++i) local->set(i % 2 ? 10 : 11, i % 2 ? 60 : 61, i % 2 ? 30 : -45);
        done = true;
    });
    std::vector<std::thread> readers;
    for (int t = 0; t < 3; ++t)
        readers.emplace_back([&] {
            while (!done) {
                const OmbPoint p = projected();
                if (!(p == first) && !(p == second)) ++mixed;
            }
        });
    mover.join();
    for (std::thread& t : readers) t.join();
    EXPECT_EQ(mixed, 0);
}

// One system shared: some threads convert arrays into another system while
// others measure, which builds the auxiliary constants on first use.
TEST_F(SharedByThreads, OneSystemConvertsAndMeasuresOnSeveralThreads) {
    const OmbRef<OmbCrs> utm(new OmbCrs(*OmbCrs::wgs84Utm(32, OmbUTMHemisphere::North)));
    const OmbCrs& web = *OmbCrs::wgs84MercatorWeb();
    OmbPointArray source;
    for (int i = 0; i < 100; ++i) source.push_back({300000.0 + 1000 * i, 5000000.0 + 500 * i});
    OmbPointArray expected = source;
    utm->projectTo(web, expected);
    const double rhumb = OmbCrs(*utm).length2d(source, OmbCrsLineType::RhumbLine, false);
    std::atomic<bool> go{false};
    std::atomic<int> differing{0};
    std::vector<std::thread> threads;
    for (int t = 0; t < 4; ++t)
        threads.emplace_back([&, t] {
            while (!go) std::this_thread::yield();
            for (int i = 0; i < 20; ++i) {
                if (t % 2) {
                    if (utm->length2d(source, OmbCrsLineType::RhumbLine, false) != rhumb) ++differing;
                    continue;
                }
                OmbPointArray points = source;
                utm->projectTo(web, points);
                if (!(points == expected)) ++differing;
            }
        });
    go = true;
    for (std::thread& t : threads) t.join();
    EXPECT_EQ(differing, 0);
}

}  // namespace
