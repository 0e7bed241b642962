// Runs the registered benchmarks and prints, for each pair of an OECore
// benchmark and its peer, the ratio of their times (below 1: OECore is
// faster).
#pragma once

#include <benchmark/benchmark.h>

#include <cstdio>
#include <map>
#include <string>
#include <thread>
#include <utility>
#include <vector>

using BenchmarkPairs = std::vector<std::pair<std::string, std::string>>;

class RatioReporter : public benchmark::ConsoleReporter {
public:
    explicit RatioReporter(BenchmarkPairs pairs) : pairs_(std::move(pairs)) {}

    void ReportRuns(const std::vector<Run>& runs) override {
        for (const Run& run : runs) times_[run.benchmark_name()] = run.GetAdjustedRealTime();
        ConsoleReporter::ReportRuns(runs);
    }

    void printRatios() const {
        std::printf("\nratio (OECore / peer; below 1 is faster):\n");
        for (const auto& [ours, theirs] : pairs_) {
            const auto a = times_.find(ours);
            const auto b = times_.find(theirs);
            if (a == times_.end() || b == times_.end() || b->second <= 0) continue;
            std::printf("  %-36s / %-36s %6.2f\n", ours.c_str(), theirs.c_str(), a->second / b->second);
        }
    }

private:
    BenchmarkPairs pairs_;
    std::map<std::string, double> times_;
};

// The process is made multi-threaded first: libstdc++ switches shared_ptr
// to plain, non-atomic counting while a process has only one thread, which
// no process using OECore is (the cache collector runs from start-up).
inline int runWithRatios(int argc, char** argv, BenchmarkPairs pairs) {
    std::thread([] {}).join();
    benchmark::Initialize(&argc, argv);
    RatioReporter reporter(std::move(pairs));
    benchmark::RunSpecifiedBenchmarks(&reporter);
    reporter.printRatios();
    benchmark::Shutdown();
    return 0;
}
