// Loading and saving a generated .px configuration of about 10 MB
// (thousands of objects with references and collections); MB/s.
#include <oecore/config/configuration.h>
#include <oecore/config/xmlparser.h>

#include <benchmark/benchmark.h>

#include <cstdio>
#include <filesystem>
#include <string>

#include "../tests/config/testclasses.h"

namespace {

// Units referred to by name and shapes with nested parts, ~10 MB in all.
const std::string& document() {
    static const std::string text = [] {
        std::string t = "<Configuration Namespace=\"Bench\" Version=\"5.4.0.3\">\n";
        for (int u = 0; u < 100; ++u)
            t += "  <TestUnit Name=\"Unit" + std::to_string(u) + "\" InMeters=\"" + std::to_string(0.1 + u) + "\"/>\n";
        for (int s = 0; t.size() < 10'000'000; ++s) {
            const std::string n = std::to_string(s);
            t += "  <TestShape Name=\"Shape" + n + "\" Public=\"true\" Width=\"" + n + ".25\" Count=\"" + n +
                 "\" Mode=\"AllLevels\" Label=\"Quay number " + n + "\" Unit=\"{ResourceReference Value=Unit" +
                 std::to_string(s % 100) + "}\">\n";
            for (int p = 0; p < 3; ++p) t += "    <TestShape Width=\"" + std::to_string(p) + "\" Label=\"part\"/>\n";
            t += "  </TestShape>\n";
        }
        return t + "</Configuration>\n";
    }();
    return text;
}

OmbRef<OmbConfiguration> loaded() {
    return OmbXmlParser::loadString(OmbString(document()), {}, OmbDataSetInitialization::Delayed, {});
}

void BM_LoadPx10MB(benchmark::State& state) {
    for (auto _ : state) benchmark::DoNotOptimize(loaded());
    state.SetBytesProcessed(static_cast<std::int64_t>(state.iterations() * document().size()));
    state.counters["objects"] = static_cast<double>(loaded()->publicNames()->size());
}
BENCHMARK(BM_LoadPx10MB)->Unit(benchmark::kMillisecond);

void BM_SavePx10MB(benchmark::State& state) {
    const OmbRef<OmbConfiguration> configuration = loaded();
    const std::string file = (std::filesystem::temp_directory_path() / "oecore-bench-save.px").string();
    for (auto _ : state) configuration->savePublicObjects(OmbString(file));
    const auto bytes = std::filesystem::file_size(file);
    state.SetBytesProcessed(static_cast<std::int64_t>(state.iterations() * bytes));
    std::filesystem::remove(file);
}
BENCHMARK(BM_SavePx10MB)->Unit(benchmark::kMillisecond);

}  // namespace

BENCHMARK_MAIN();
