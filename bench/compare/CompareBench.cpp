// The comparison of resource descriptions: a cached answer against the uncached comparison of
// the same pair, with the cache full of long texts that share long prefixes (as descriptions of
// one target do). Prints the ratio of their CPU times, measured in the same run.
#include "resource_tree/CompareCache.h"
#include "resource_tree/ResourceCompare.h"

#include <benchmark/benchmark.h>
#include <cstdio>
#include <string>

namespace {

// A description of a resource with many attributes; descriptions differ only near their end.
std::string Description(int variant) {
    std::string text = "<IOResource><Direction>Input</Direction>";
    for (int i = 0; i < 200; ++i)
        text += "<Attr" + std::to_string(i) + ">value " + std::to_string(i) + "</Attr" +
                std::to_string(i) + ">";
    return text + "<Variant>" + std::to_string(variant) + "</Variant></IOResource>";
}

double g_uncachedNs = 0;
double g_cachedNs = 0;

void BM_UncachedCompare(benchmark::State& state) {
    const std::string a = Description(0);
    const std::string b = Description(0);
    for (auto _ : state) {
        wbhw::ClearCompareCache();
        benchmark::DoNotOptimize(wbhw::CompareResourceTexts(a, b));
    }
    state.counters["ns_per_compare"] =
        benchmark::Counter(static_cast<double>(state.iterations()),
                           benchmark::Counter::kIsRate | benchmark::Counter::kInvert);
}

void BM_CachedCompareOldestOfHundred(benchmark::State& state) {
    wbhw::ClearCompareCache();
    const std::string a = Description(0);
    const std::string b = Description(0);
    wbhw::CompareResourceTexts(a, b); // becomes the oldest of 100 pairs
    for (int i = 1; i < 100; ++i)
        wbhw::CompareResourceTexts(Description(i), b);
    for (auto _ : state)
        benchmark::DoNotOptimize(wbhw::CompareResourceTexts(a, b));
    state.counters["ns_per_compare"] =
        benchmark::Counter(static_cast<double>(state.iterations()),
                           benchmark::Counter::kIsRate | benchmark::Counter::kInvert);
}

// The cache alone: a lookup of the oldest of 100 long keys that share long prefixes.
void BM_CacheLookupOnly(benchmark::State& state) {
    wbhw::CompareCache cache(100, wbhw::kCompareCacheBytes);
    std::string tail(4000, 'x');
    for (int i = 0; i < 100; ++i) {
        const std::string first = tail + char('A' + i % 26) + char('0' + i / 26);
        cache.Insert(wbhw::CompareCache::Key(wbhw::CompareCache::Probe(first, tail)), 0);
    }
    const std::string first = tail + "A0";
    const wbhw::CompareCache::Probe key(first, tail);
    for (auto _ : state)
        benchmark::DoNotOptimize(cache.Find(key));
}

BENCHMARK(BM_UncachedCompare)->Unit(benchmark::kMicrosecond);
BENCHMARK(BM_CachedCompareOldestOfHundred)->Unit(benchmark::kMicrosecond);
BENCHMARK(BM_CacheLookupOnly)->Unit(benchmark::kMicrosecond);

// Collects the two comparison figures and prints their ratio after the run.
class RatioReporter : public benchmark::ConsoleReporter {
public:
    void ReportRuns(const std::vector<Run>& runs) override {
        for (const Run& run : runs) {
            if (run.run_type != Run::RT_Iteration && run.aggregate_name != "median")
                continue;
            if (run.benchmark_name().find("BM_UncachedCompare") == 0)
                g_uncachedNs = run.GetAdjustedCPUTime();
            if (run.benchmark_name().find("BM_CachedCompareOldestOfHundred") == 0)
                g_cachedNs = run.GetAdjustedCPUTime();
        }
        ConsoleReporter::ReportRuns(runs);
    }
};

} // namespace

int main(int argc, char** argv) {
    benchmark::Initialize(&argc, argv);
    RatioReporter reporter;
    benchmark::RunSpecifiedBenchmarks(&reporter);
    if (g_uncachedNs > 0)
        std::printf("cached / uncached comparison time: %.4f\n", g_cachedNs / g_uncachedNs);
    benchmark::Shutdown();
    return 0;
}
