// Attribute sets, keyed attribute variables and atoms: ns per operation.
#include <oecore/attr/attributeset.h>
#include <oecore/attr/attributevariable.h>

#include <benchmark/benchmark.h>

#include <string>
#include <vector>

namespace {

std::vector<OmbAtom> keys(int count) {
    std::vector<OmbAtom> out;
    for (int i = 0; i < count; ++i) out.push_back(OmbAtoms::atom(OmbString("attribute" + std::to_string(i))));
    return out;
}

// Sets every attribute, then reads every attribute, of a set of n.
void BM_AttributeSetSetGet(benchmark::State& state) {
    const std::vector<OmbAtom> k = keys(static_cast<int>(state.range(0)));
    OmbRef<OmbAttributeSet> set(new OmbAttributeSet);
    std::int64_t sum = 0;
    for (auto _ : state) {
        for (std::size_t i = 0; i < k.size(); ++i) set->set(k[i], static_cast<std::int64_t>(i));
        for (const OmbAtom key : k) {
            std::int64_t v = 0;
            set->get(key, v);
            sum += v;
        }
    }
    benchmark::DoNotOptimize(sum);
    state.SetItemsProcessed(state.iterations() * static_cast<std::int64_t>(2 * k.size()));
}
BENCHMARK(BM_AttributeSetSetGet)->Arg(8)->Arg(32);

// A feature's copy of a set, changed once: one table copy.
void BM_AttributeSetCloneThenWrite(benchmark::State& state) {
    const std::vector<OmbAtom> k = keys(8);
    OmbRef<OmbAttributeSet> set(new OmbAttributeSet);
    for (std::size_t i = 0; i < k.size(); ++i) set->set(k[i], static_cast<std::int64_t>(i));
    for (auto _ : state) {
        OmbRef<OmbAttributeSet> copy(set->clone());
        copy->set(k[3], std::int64_t{99});
        benchmark::DoNotOptimize(copy);
    }
}
BENCHMARK(BM_AttributeSetCloneThenWrite);

// A keyed lookup over 256 integer classes, with the direct-index table and
// (keys spread over more than 65,536) through the map.
void BM_KeyedLookup(benchmark::State& state) {
    const bool fast = state.range(0) != 0;
    OmbRef<OmbKeyValueTable<double>> table(new OmbKeyValueTable<double>);
    for (std::int64_t i = 0; i < 256; ++i) table->add(OmbAttributeValue(fast ? i : i * 1000), static_cast<double>(i));
    const OmbAtom key = OmbAtoms::atom(OmbString("class"));
    OmbKeyedAttributeVariable<double> variable(key, table);
    OmbRef<OmbAttributeSet> feature(new OmbAttributeSet);
    const OmbReadOnlyAttributes attributes(feature);
    std::int64_t k = 0;
    double out = 0;
    for (auto _ : state) {
        feature->set(key, (k += 7919) % (fast ? 256 : 256000));
        variable.eval(attributes, out);
        benchmark::DoNotOptimize(out);
    }
    state.SetLabel(variable.hasFastTable() ? "direct index" : "map");
}
BENCHMARK(BM_KeyedLookup)->Arg(1)->Arg(0);

void BM_AtomInterning(benchmark::State& state) {
    std::vector<OmbString> names;
    for (int i = 0; i < 1000; ++i) names.emplace_back("interned" + std::to_string(i));
    std::size_t i = 0;
    for (auto _ : state) benchmark::DoNotOptimize(OmbAtoms::atom(names[i++ % names.size()]));
}
BENCHMARK(BM_AtomInterning);

}  // namespace

BENCHMARK_MAIN();
