// OmbRef, OmbWRef and OmbString against std::shared_ptr, std::weak_ptr and
// std::string doing the same work. Each pair runs in one process; the
// ratios (OECore time / standard library time) are printed at the end.
//
// The process starts a thread before measuring: libstdc++ switches
// shared_ptr to plain, non-atomic counting while a process has only one
// thread, which no process using OECore is (the cache collector runs from
// start-up).
#include <oecore/core/ref.h>
#include <oecore/core/refcnt.h>
#include <oecore/core/string.h>

#include <benchmark/benchmark.h>

#include <cstdio>
#include <map>
#include <memory>
#include <string>
#include <thread>
#include <vector>

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

// Collects the time per iteration of every run to print the ratios.
class RatioReporter : public benchmark::ConsoleReporter {
public:
    void ReportRuns(const std::vector<Run>& runs) override {
        for (const Run& run : runs) times_[run.benchmark_name()] = run.GetAdjustedCPUTime();
        ConsoleReporter::ReportRuns(runs);
    }
    void printRatios() const {
        const std::pair<const char*, const char*> pairs[] = {
            {"BM_OmbRef_CopyRelease", "BM_SharedPtr_CopyRelease"},
            {"BM_OmbWRef_Promote", "BM_WeakPtr_Promote"},
            {"BM_OmbString_Copy", "BM_StdString_Copy"},
            {"BM_OmbString_Compare", "BM_StdString_Compare"},
            {"BM_OmbString_Find", "BM_StdString_Find"},
        };
        std::printf("\nratio (OECore / standard library; below 1 is faster):\n");
        for (const auto& [ours, theirs] : pairs) {
            const auto a = times_.find(ours);
            const auto b = times_.find(theirs);
            if (a == times_.end() || b == times_.end() || b->second <= 0) continue;
            std::printf("  %-24s / %-26s %6.2f\n", ours, theirs, a->second / b->second);
        }
    }

private:
    std::map<std::string, double> times_;
};

}  // namespace

int main(int argc, char** argv) {
    std::thread([] {}).join();
    benchmark::Initialize(&argc, argv);
    RatioReporter reporter;
    benchmark::RunSpecifiedBenchmarks(&reporter);
    reporter.printRatios();
    benchmark::Shutdown();
    return 0;
}
