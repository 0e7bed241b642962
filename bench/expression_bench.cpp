// Conditions over a million features: evaluations per second.
#include <oecore/attr/condition.h>
#include <oecore/attr/expression.h>

#include <benchmark/benchmark.h>

#include <vector>

namespace {

const std::vector<OmbRef<OmbAttributeSet>>& features() {
    static const std::vector<OmbRef<OmbAttributeSet>> sets = [] {
        const OmbAtom cls = OmbAtoms::atom(OmbString("class"));
        const OmbAtom bridge = OmbAtoms::atom(OmbString("bridge"));
        const OmbAtom depth = OmbAtoms::atom(OmbString("depth"));
        const OmbAtom name = OmbAtoms::atom(OmbString("name"));
        std::vector<OmbRef<OmbAttributeSet>> out;
        out.reserve(1'000'000);
        for (std::int64_t i = 0; i < 1'000'000; ++i) {
            OmbRef<OmbAttributeSet> set(new OmbAttributeSet);
            set->set(cls, i % 5);
            set->setBool(bridge, i % 7 == 0);
            set->set(depth, static_cast<double>(i % 100) / 4);
            set->set(name, OmbString(i % 3 ? "Main Road" : "Quay"));
            out.push_back(set);
        }
        return out;
    }();
    return sets;
}

void run(benchmark::State& state, const char* text) {
    const OmbCondition condition{OmbString(text)};
    const auto& sets = features();
    std::int64_t holds = 0;
    for (auto _ : state)
        for (const OmbRef<OmbAttributeSet>& set : sets) holds += condition.eval(set);
    benchmark::DoNotOptimize(holds);
    state.SetItemsProcessed(state.iterations() * static_cast<std::int64_t>(sets.size()));
}

void BM_ConditionSimple(benchmark::State& state) { run(state, "class = 2 and not bridge"); }
BENCHMARK(BM_ConditionSimple)->Unit(benchmark::kMillisecond);

// The same over 1,000 features that stay in the cache: the evaluation alone.
void BM_ConditionSimpleCached(benchmark::State& state) {
    const OmbCondition condition{OmbString("class = 2 and not bridge")};
    const std::vector<OmbRef<OmbAttributeSet>> sets(features().begin(), features().begin() + 1000);
    std::int64_t holds = 0;
    for (auto _ : state)
        for (const OmbRef<OmbAttributeSet>& set : sets) holds += condition.eval(set);
    benchmark::DoNotOptimize(holds);
    state.SetItemsProcessed(state.iterations() * static_cast<std::int64_t>(sets.size()));
}
BENCHMARK(BM_ConditionSimpleCached);

// Ten terms: comparisons, arithmetic, a function and a membership test.
void BM_ConditionTenTerms(benchmark::State& state) {
    run(state,
        "class in (1, 2, 3) and depth * 2 > 5 and not bridge and length(name) > 3 and depth - 1 < 20 and "
        "class != 4 and like(name, \"M*\") and depth >= 0 and class + 1 <= 4 and name != \"Pier\"");
}
BENCHMARK(BM_ConditionTenTerms)->Unit(benchmark::kMillisecond);

}  // namespace

BENCHMARK_MAIN();
