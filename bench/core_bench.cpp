// OmbRef, OmbWRef and OmbString against std::shared_ptr, std::weak_ptr and
// std::string doing the same work. Each pair runs in one process; the
// ratios (OECore time / standard library time) are printed at the end.
#include <oecore/core/ref.h>
#include <oecore/core/refcnt.h>
#include <oecore/core/string.h>

#include <memory>
#include <string>

#include "ratioreporter.h"

namespace {

struct Counted : OmbWRefCnt {
    int value = 1;
};
struct Plain {
    int value = 1;
};

void BM_OmbRef_CopyRelease(benchmark::State& state) {
    OmbRef<Counted> r(new Counted);
    for (auto _ : state) {
        OmbRef<Counted> copy = r;
        benchmark::DoNotOptimize(copy);
    }
}
void BM_SharedPtr_CopyRelease(benchmark::State& state) {
    auto r = std::make_shared<Plain>();
    for (auto _ : state) {
        std::shared_ptr<Plain> copy = r;
        benchmark::DoNotOptimize(copy);
    }
}

void BM_OmbWRef_Promote(benchmark::State& state) {
    OmbRef<Counted> r(new Counted);
    OmbWRef<Counted> w(r);
    for (auto _ : state) {
        OmbRef<Counted> strong = w.strong();
        benchmark::DoNotOptimize(strong);
    }
}
void BM_WeakPtr_Promote(benchmark::State& state) {
    auto r = std::make_shared<Plain>();
    std::weak_ptr<Plain> w = r;
    for (auto _ : state) {
        std::shared_ptr<Plain> strong = w.lock();
        benchmark::DoNotOptimize(strong);
    }
}

const char* const sample = "Harbour approach, northern fairway, leading light sector 270-285";

void BM_OmbString_Copy(benchmark::State& state) {
    const OmbString s(sample);
    for (auto _ : state) {
        OmbString copy = s;
        benchmark::DoNotOptimize(copy);
    }
}
void BM_StdString_Copy(benchmark::State& state) {
    const std::string s(sample);
    for (auto _ : state) {
        std::string copy = s;
        benchmark::DoNotOptimize(copy);
    }
}

void BM_OmbString_Compare(benchmark::State& state) {
    const OmbString a(sample);
    const OmbString b(std::string(sample) + "!");
    for (auto _ : state) benchmark::DoNotOptimize(a < b);
}
void BM_StdString_Compare(benchmark::State& state) {
    const std::string a(sample);
    const std::string b(std::string(sample) + "!");
    for (auto _ : state) benchmark::DoNotOptimize(a < b);
}

void BM_OmbString_Find(benchmark::State& state) {
    const OmbString s(sample);
    const OmbString needle("sector");
    for (auto _ : state) benchmark::DoNotOptimize(s.find(needle));
}
void BM_StdString_Find(benchmark::State& state) {
    const std::string s(sample);
    const std::string needle("sector");
    for (auto _ : state) benchmark::DoNotOptimize(s.find(needle));
}

BENCHMARK(BM_OmbRef_CopyRelease);
BENCHMARK(BM_SharedPtr_CopyRelease);
BENCHMARK(BM_OmbWRef_Promote);
BENCHMARK(BM_WeakPtr_Promote);
BENCHMARK(BM_OmbString_Copy);
BENCHMARK(BM_StdString_Copy);
BENCHMARK(BM_OmbString_Compare);
BENCHMARK(BM_StdString_Compare);
BENCHMARK(BM_OmbString_Find);
BENCHMARK(BM_StdString_Find);

}  // namespace

int main(int argc, char** argv) {
    return runWithRatios(argc, argv,
                         {{"BM_OmbRef_CopyRelease", "BM_SharedPtr_CopyRelease"},
                          {"BM_OmbWRef_Promote", "BM_WeakPtr_Promote"},
                          {"BM_OmbString_Copy", "BM_StdString_Copy"},
                          {"BM_OmbString_Compare", "BM_StdString_Compare"},
                          {"BM_OmbString_Find", "BM_StdString_Find"}});
}
