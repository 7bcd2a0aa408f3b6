// Hostile descriptions of a few KB that multiply themselves (names lists inside names lists, a
// chain of prototypes each copying the previous twice, siblings each naming 200,000 copies), and
// repeated names lists merged under one node: time, heap held when the load stops, and the ratio
// to a load of a real 1 MB target description in the same run.
#include "resource_tree/LoaderText.h"
#include "resource_tree/ResTreeNode.h"

#include <benchmark/benchmark.h>
#include <chrono>
#include <malloc.h>
#include <memory>
#include <string>

namespace {

std::u16string NestedNames() {
    return u"<Target name='T'><X names=\"A[i=0..199999]\"><Y names=\"B[j=0..199999]\"/></X>"
           u"</Target>";
}

std::u16string PrototypeChain() {
    std::string x = "<Target name='T'>\n<P0 name='P0'><V>x</V></P0>\n";
    for (int i = 1; i < 60; ++i) {
        const std::string me = std::to_string(i);
        const std::string before = std::to_string(i - 1);
        x += "<P" + me + " name='P" + me + "'><A prototype='/P" + before + "'/><B prototype='/P" +
             before + "'/></P" + me + ">\n";
    }
    return wbhw::FromUtf8Lenient(x + "</Target>");
}

std::u16string SiblingCopies() {
    std::string x = "<Target name='T'>\n";
    for (int i = 0; i < 60; ++i) {
        const std::string me = std::to_string(i);
        x += "<S" + me + " names='N" + me + "_[k=0..199999]'/>\n";
    }
    return wbhw::FromUtf8Lenient(x + "</Target>");
}

// Two sibling lists that repeat the same N names under an unordered node.
std::u16string RepeatedNames(int64_t n) {
    const std::string range = "[i=0.." + std::to_string(n - 1) + "]";
    return wbhw::FromUtf8Lenient("<Target name='T'><A names='N" + range + "'/><B names='N" + range +
                                 "'/></Target>");
}

// A real board: connectors of I/O resources with their attributes and method sets, about 1 MB.
std::u16string RealTarget() {
    std::string x = "<Target name=\"Board\">\n";
    for (size_t c = 0; x.size() < (1u << 20); ++c) {
        x += "<Connector name=\"C" + std::to_string(c) + "\">\n";
        for (int r = 0; r < 64; ++r) {
            x += "<IOResource name=\"DIO" + std::to_string(r) +
                 "\"><Direction>bidirectional</Direction><DataType>Boolean</DataType><Line>" +
                 std::to_string(r) +
                 "</Line><Group name=\"Methods\"><Method name=\"Read\"><Arg>Boolean</Arg>"
                 "</Method><Method name=\"Write\"><Arg>Boolean</Arg></Method></Group>"
                 "</IOResource>\n";
        }
        x += "</Connector>\n";
    }
    return wbhw::FromUtf8Lenient(x + "</Target>");
}

double anchorSeconds = 0;

// Loads TEXT once per iteration; reports seconds, the heap the stopped tree holds and the ratio
// to the anchor load.
void RunLoad(benchmark::State& state, const std::u16string& text) {
    double total = 0;
    double heldMB = 0;
    for (auto _ : state) {
        const size_t before = mallinfo2().uordblks;
        const auto start = std::chrono::steady_clock::now();
        auto root = std::make_unique<wbhw::ResTreeNode>(wbhw::WString(), wbhw::WString(), false);
        benchmark::DoNotOptimize(root->ParseText(text, false));
        total += std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
        state.PauseTiming();
        heldMB = static_cast<double>(mallinfo2().uordblks - before) / 1e6;
        root.reset();
        state.ResumeTiming();
    }
    const double seconds = total / static_cast<double>(state.iterations());
    state.counters["seconds"] = seconds;
    state.counters["held_MB"] = heldMB;
    if (anchorSeconds > 0)
        state.counters["ratio_to_1MB_load"] = seconds / anchorSeconds;
}

void BM_AnchorRealTarget1MB(benchmark::State& state) {
    static const std::u16string text = RealTarget();
    RunLoad(state, text);
    anchorSeconds = state.counters["seconds"];
}

void BM_HostileNestedNames(benchmark::State& state) {
    RunLoad(state, NestedNames());
}

void BM_HostilePrototypeChain(benchmark::State& state) {
    RunLoad(state, PrototypeChain());
}

void BM_HostileSiblingCopies(benchmark::State& state) {
    RunLoad(state, SiblingCopies());
}

void BM_RepeatedNamesMerge(benchmark::State& state) {
    RunLoad(state, RepeatedNames(state.range(0)));
    state.counters["ns_per_name"] =
        state.counters["seconds"] * 1e9 / static_cast<double>(state.range(0));
}

} // namespace

BENCHMARK(BM_AnchorRealTarget1MB)->Unit(benchmark::kMillisecond)->UseRealTime();
BENCHMARK(BM_HostileNestedNames)->Unit(benchmark::kMillisecond)->UseRealTime()->Iterations(1);
BENCHMARK(BM_HostilePrototypeChain)->Unit(benchmark::kMillisecond)->UseRealTime()->Iterations(1);
BENCHMARK(BM_HostileSiblingCopies)->Unit(benchmark::kMillisecond)->UseRealTime()->Iterations(1);
BENCHMARK(BM_RepeatedNamesMerge)
    ->Arg(10000)
    ->Arg(40000)
    ->Arg(200000)
    ->Unit(benchmark::kMillisecond)
    ->UseRealTime()
    ->Iterations(1);
