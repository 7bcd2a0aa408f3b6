// Name comparison against a plain ASCII case-insensitive comparison of the same names. Each
// benchmark pair runs the same name pairs through both; the "vs_ascii" counter is the ratio of
// the name comparison's time per pair to the ASCII anchor's, measured in the same run.
#include "kern/Collate.h"
#include "kern/NameCollator.h"

#include <benchmark/benchmark.h>
#include <chrono>
#include <string>
#include <vector>

namespace {

using Pairs = std::vector<std::pair<std::u16string, std::u16string>>;

std::u16string NameOf(int i) {
    const std::string n = "Connector" + std::to_string(i % 4) + "/DIO" + std::to_string(i);
    return std::u16string(n.begin(), n.end());
}

std::u16string Lower(std::u16string s) {
    for (char16_t& c : s)
        c = (c >= u'A' && c <= u'Z') ? static_cast<char16_t>(c + 32) : c;
    return s;
}

Pairs MakePairs(int kind) {
    Pairs pairs;
    for (int i = 0; i < 256; ++i) {
        const std::u16string a = NameOf(i);
        if (kind == 0)
            pairs.emplace_back(a, Lower(a)); // differ in case only
        else if (kind == 1)
            pairs.emplace_back(a, a); // equal
        else
            pairs.emplace_back(a, NameOf(i + 1)); // different names
    }
    return pairs;
}

int AsciiCompareNoCase(std::u16string_view a, std::u16string_view b) {
    const size_t n = std::min(a.size(), b.size());
    for (size_t i = 0; i < n; ++i) {
        char16_t x = a[i];
        char16_t y = b[i];
        x = (x >= u'A' && x <= u'Z') ? static_cast<char16_t>(x + 32) : x;
        y = (y >= u'A' && y <= u'Z') ? static_cast<char16_t>(y + 32) : y;
        if (x != y)
            return x < y ? -1 : 1;
    }
    return a.size() == b.size() ? 0 : (a.size() < b.size() ? -1 : 1);
}

// Seconds per pair of a comparison over all pairs, for the ratio counter.
template <class Compare> double SecondsPerPair(const Pairs& pairs, Compare compare) {
    const auto start = std::chrono::steady_clock::now();
    int sink = 0;
    for (int round = 0; round < 200; ++round)
        for (const auto& [a, b] : pairs)
            sink += compare(a, b);
    benchmark::DoNotOptimize(sink);
    const std::chrono::duration<double> took = std::chrono::steady_clock::now() - start;
    return took.count() / (200.0 * static_cast<double>(pairs.size()));
}

template <class Compare> void Run(benchmark::State& state, Compare compare) {
    const Pairs pairs = MakePairs(static_cast<int>(state.range(0)));
    for (auto _ : state) {
        for (const auto& [a, b] : pairs)
            benchmark::DoNotOptimize(compare(a, b));
    }
    state.SetItemsProcessed(state.iterations() * static_cast<int64_t>(pairs.size()));
    const double anchor = SecondsPerPair(pairs, AsciiCompareNoCase);
    state.counters["vs_ascii"] = SecondsPerPair(pairs, compare) / anchor;
}

void BM_CompareNoCase(benchmark::State& state) {
    Run(state, qv::kern::CompareNoCase);
}

// ICU alone, without the rank table: what every comparison would cost without it.
void BM_IcuCollator(benchmark::State& state) {
    const qv::kern::NameCollator collator("");
    Run(state, [&](std::u16string_view a, std::u16string_view b) {
        return collator.CompareWithCollator(a, b);
    });
}

void BM_AsciiAnchor(benchmark::State& state) {
    Run(state, AsciiCompareNoCase);
}

// 0: names differing in case only, 1: equal names, 2: different names.
BENCHMARK(BM_AsciiAnchor)->Arg(0)->Arg(1)->Arg(2);
BENCHMARK(BM_CompareNoCase)->Arg(0)->Arg(1)->Arg(2);
BENCHMARK(BM_IcuCollator)->Arg(0)->Arg(1)->Arg(2);

} // namespace
