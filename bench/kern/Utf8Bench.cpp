// UTF-8 decoding and encoding against memcpy of the same bytes; "vs_memcpy" is the ratio of the
// conversion's time to the copy's, both measured in the same run.
#include "kern/Utf8.h"

#include <benchmark/benchmark.h>
#include <chrono>
#include <cstring>
#include <string>
#include <vector>

namespace {

// About 64 KiB of text: ASCII only (0) or mixed with two- and three-byte sequences (1).
std::string MakeText(int kind) {
    const std::string unit = kind == 0 ? "Connector0/DIO17 resource name, "
                                       : "Caf\xC3\xA9 \xE6\x97\xA5\xE6\x9C\xAC DIO17, ";
    std::string text;
    while (text.size() < 65536)
        text += unit;
    return text;
}

template <class Work> double SecondsPerRun(Work work) {
    const auto start = std::chrono::steady_clock::now();
    for (int i = 0; i < 200; ++i)
        work();
    const std::chrono::duration<double> took = std::chrono::steady_clock::now() - start;
    return took.count() / 200.0;
}

double MemcpySeconds(const std::string& text) {
    std::vector<char> copy(text.size());
    return SecondsPerRun([&] {
        std::memcpy(copy.data(), text.data(), text.size());
        benchmark::DoNotOptimize(copy.data());
        benchmark::ClobberMemory();
    });
}

void BM_Utf8ToWide(benchmark::State& state) {
    const std::string text = MakeText(static_cast<int>(state.range(0)));
    for (auto _ : state)
        benchmark::DoNotOptimize(qv::kern::Utf8ToWide(text));
    state.SetBytesProcessed(state.iterations() * static_cast<int64_t>(text.size()));
    state.counters["vs_memcpy"] =
        SecondsPerRun([&] { benchmark::DoNotOptimize(qv::kern::Utf8ToWide(text)); }) /
        MemcpySeconds(text);
}

void BM_WideToUtf8(benchmark::State& state) {
    const std::string text = MakeText(static_cast<int>(state.range(0)));
    const std::u16string wide = qv::kern::Utf8ToWide(text);
    for (auto _ : state)
        benchmark::DoNotOptimize(qv::kern::WideToUtf8(wide));
    state.SetBytesProcessed(state.iterations() * static_cast<int64_t>(text.size()));
    state.counters["vs_memcpy"] =
        SecondsPerRun([&] { benchmark::DoNotOptimize(qv::kern::WideToUtf8(wide)); }) /
        MemcpySeconds(text);
}

void BM_MemcpyAnchor(benchmark::State& state) {
    const std::string text = MakeText(static_cast<int>(state.range(0)));
    std::vector<char> copy(text.size());
    for (auto _ : state) {
        std::memcpy(copy.data(), text.data(), text.size());
        benchmark::DoNotOptimize(copy.data());
        benchmark::ClobberMemory();
    }
    state.SetBytesProcessed(state.iterations() * static_cast<int64_t>(text.size()));
}

// 0: ASCII text, 1: text with two- and three-byte sequences.
BENCHMARK(BM_MemcpyAnchor)->Arg(0)->Arg(1);
BENCHMARK(BM_Utf8ToWide)->Arg(0)->Arg(1);
BENCHMARK(BM_WideToUtf8)->Arg(0)->Arg(1);

} // namespace
