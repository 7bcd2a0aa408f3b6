// The costs wbhost adds to its output and to a comparison's input.
// - BM_EscapedOutput: a 1 MiB dump written through ControlEscaper; "vs_plain" is its time over
//   writing the same text to the same kind of stream directly.
// - BM_LostCharacterCheck: CharactersTheHostCannotKeep over a 1 MiB description with non-ASCII
//   names; "vs_conversion" is its time over the conversion to the code page that compare does
//   anyway.
#include "cli/ControlEscaper.h"
#include "cli/HostText.h"
#include "kern/CodePage.h"

#include <benchmark/benchmark.h>
#include <chrono>
#include <sstream>
#include <string>

namespace {

constexpr size_t kTextBytes = 1u << 20;

// About 1 MiB of a dump: element lines, with (1) or without (0) non-ASCII names.
std::string MakeDump(int kind) {
    const std::string line = kind == 0
                                 ? "  <DigitalLine name=\"DIO17\">\n    <Line>17</Line>\n"
                                 : "  <DigitalLine name=\"Caf\xC3\xA9\">\n    <Line>17</Line>\n";
    std::string text;
    while (text.size() < kTextBytes)
        text += line;
    return text;
}

template <class Work> double SecondsPerRun(Work work) {
    constexpr int kRuns = 20;
    const auto start = std::chrono::steady_clock::now();
    for (int i = 0; i < kRuns; ++i)
        work();
    const std::chrono::duration<double> took = std::chrono::steady_clock::now() - start;
    return took.count() / kRuns;
}

void WritePlain(const std::string& text) {
    std::ostringstream out;
    out << text;
    benchmark::DoNotOptimize(out.str().size());
}

void WriteEscaped(const std::string& text) {
    std::ostringstream out;
    {
        const wbhost::cli::ControlEscaper escape(out);
        out << text;
    }
    benchmark::DoNotOptimize(out.str().size());
}

void BM_EscapedOutput(benchmark::State& state) {
    const std::string text = MakeDump(static_cast<int>(state.range(0)));
    for (auto _ : state)
        WriteEscaped(text);
    state.SetBytesProcessed(state.iterations() * static_cast<int64_t>(text.size()));
    state.counters["vs_plain"] =
        SecondsPerRun([&] { WriteEscaped(text); }) / SecondsPerRun([&] { WritePlain(text); });
}

void BM_LostCharacterCheck(benchmark::State& state) {
    const std::u16string text = wbhost::cli::FromUtf8(MakeDump(1));
    for (auto _ : state)
        benchmark::DoNotOptimize(wbhost::cli::CharactersTheHostCannotKeep(text));
    state.SetBytesProcessed(state.iterations() * static_cast<int64_t>(text.size() * 2));
    state.counters["vs_conversion"] =
        SecondsPerRun(
            [&] { benchmark::DoNotOptimize(wbhost::cli::CharactersTheHostCannotKeep(text)); }) /
        SecondsPerRun([&] { benchmark::DoNotOptimize(qv::kern::WideToAnsi(text)); });
}

} // namespace

BENCHMARK(BM_EscapedOutput)->Arg(0)->Arg(1)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_LostCharacterCheck)->Unit(benchmark::kMillisecond);
