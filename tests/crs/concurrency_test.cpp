// Datums and shifts shared by threads: the caches that shifts build on first
// use are built once, and every thread sees the same results.
#include <oecore/core/runtime.h>
#include <oecore/crs/geodeticdatum.h>

#include <gtest/gtest.h>

#include <atomic>
#include <functional>
#include <thread>
#include <vector>

#include "../core/tempdir.h"
#include "../runtimescope.h"
#include "gridfiles.h"

namespace {

class SharedShifts : public RuntimeScope {
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

TEST_F(SharedShifts, HelmertMatricesAreBuiltOnceForAllThreads) {
    const auto datum = [] {
        OmbHelmertDatumShift::Parameters p;
        p.dx = 446.448, p.dy = -125.157, p.dz = 542.06, p.rx = 0.15, p.ry = 0.247, p.rz = 0.842;
        p.scaleDifference = -20.489;
        OmbRef<OmbHelmertDatumShift> shift(new OmbHelmertDatumShift);
        shift->parameters(p);
        return OmbRef<OmbGeodeticDatum>(
            new OmbGeodeticDatum(OmbEllipsoid::airy1830(), OmbPrimeMeridian::greenwich(), shift));
    };
    OmbPoint expected(-2, 53, 100);
    datum()->changeDatumTo(*OmbGeodeticDatum::wgs84(), expected);

    const auto shared = datum();  // its matrices not built yet
    EXPECT_EQ(differingResults(
                  [&] {
                      OmbPoint p(-2, 53, 100);
                      shared->changeDatumTo(*OmbGeodeticDatum::wgs84(), p);
                      return p;
                  },
                  expected),
              0);
}

TEST_F(SharedShifts, GridFilesAreOpenedOnceForAllThreads) {
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

}  // namespace
