// What the host pays for one comparison of two large resource descriptions, against the cheapest
// thing that reads the same bytes: two raw Expat parses with no handlers, measured in the same
// iteration. Also the parts on their own (a load against one raw parse, from the wide text and
// from the UTF-8 bytes the call hands Expat, and against Expat calling no-op handlers; the walk
// and the destruction against one load), hostile lists and repeats, the cache's peak memory after
// 100 distinct pairs, and two threads against one. Every figure is a median of per-iteration ratios
// in thread processor time, so that a busy machine slows both sides alike.
#include "kern/CodePage.h"
#include "resource_tree/ResTreeNode.h"
#include "resource_tree/ResourceCompare.h"

#include <algorithm>
#include <benchmark/benchmark.h>
#include <cstdio>
#include <expat.h>
#include <map>
#include <string>
#include <sys/resource.h>
#include <time.h>
#include <vector>

namespace {

// A target with RESOURCES I/O resources in the shape the host compares: attributes, value lists,
// localized names and an ordered group of methods each. About 640 bytes a resource.
std::string TargetDescription(size_t resources, size_t variant) {
    std::string x = "<Target name=\"Board\"><DisplayName localize=\"true\">eng=Board</DisplayName>";
    for (size_t r = 0; r < resources; ++r) {
        const std::string n = std::to_string(r);
        x += "<IOResource name=\"DIO" + n +
             "\"><Direction>bidirectional</Direction>"
             "<DataType>Boolean</DataType><Line>" +
             n + "</Line><Signature>" + n + "-A1F3</Signature><LocalizedName>DIO " + n +
             "</LocalizedName>"
             "<SupportedValues>1,2,4,8</SupportedValues><MemoryLatency>3</MemoryLatency>"
             "<HelpPath>help/io/dio.html</HelpPath><Reserves>../DIO" +
             std::to_string(r + 1) +
             "</Reserves><Group name=\"Methods\" ordered=\"true\">"
             "<Method name=\"Read\"><Direction>in</Direction><Arg>Boolean</Arg></Method>"
             "<Method name=\"Write\"><Direction>out</Direction><Arg>Boolean</Arg></Method>"
             "<Method name=\"Enable\"><Direction>out</Direction></Method></Group></IOResource>";
    }
    // A different comment makes a different text for the same description: a fresh pair for
    // every call, which the cache cannot answer.
    return x + "<!-- " + std::to_string(variant) + " --></Target>";
}

double ThreadSeconds() {
    timespec now{};
    clock_gettime(CLOCK_THREAD_CPUTIME_ID, &now);
    return static_cast<double>(now.tv_sec) + static_cast<double>(now.tv_nsec) * 1e-9;
}

// The anchor: Expat over the bytes with no handlers at all.
void RawParse(const std::string& text) {
    XML_Parser parser = XML_ParserCreate("UTF-8");
    benchmark::DoNotOptimize(XML_Parse(parser, text.data(), static_cast<int>(text.size()), 1));
    XML_ParserFree(parser);
}

void XMLCALL NoStart(void*, const XML_Char*, const XML_Char**) {}
void XMLCALL NoEnd(void*, const XML_Char*) {}
void XMLCALL NoText(void*, const XML_Char*, int) {}

// The loader's own anchor (resource_tree_bench): Expat calling handlers that do nothing, which
// is what any tree built from Expat's events pays before it stores a byte.
void NoOpParse(const std::string& text) {
    XML_Parser parser = XML_ParserCreate("UTF-8");
    XML_SetElementHandler(parser, NoStart, NoEnd);
    XML_SetCharacterDataHandler(parser, NoText);
    benchmark::DoNotOptimize(XML_Parse(parser, text.data(), static_cast<int>(text.size()), 1));
    XML_ParserFree(parser);
}

double Median(std::vector<double> values) {
    if (values.empty())
        return 0;
    std::sort(values.begin(), values.end());
    return values[values.size() / 2];
}

// Runs F and answers the thread processor seconds it took.
template <class F> double Timed(F&& f) {
    const double start = ThreadSeconds();
    f();
    return ThreadSeconds() - start;
}

size_t g_variant = 0;
// Each repetition's median ratio per figure; the summary prints the median over repetitions.
std::map<std::string, std::vector<double>> g_summary;

// Records FIGURE's median for this repetition and answers it for the run's counter.
double Note(const std::string& figure, std::vector<double>& ratios) {
    const double median = Median(ratios);
    g_summary[figure].push_back(median);
    return median;
}

// One iteration measures, on a fresh pair: the whole call against two raw parses; one load
// against one raw parse; the walk over two loaded trees and the destruction of one, each
// against that load.
void BM_HostCost(benchmark::State& state) {
    const auto resources = static_cast<size_t>(state.range(0));
    std::vector<double> call;
    std::vector<double> load;
    std::vector<double> walk;
    std::vector<double> destroy;
    std::vector<double> loadUtf8;
    std::vector<double> loadNoOp;
    for (auto _ : state) {
        state.PauseTiming();
        const std::string a = TargetDescription(resources, ++g_variant);
        const std::string b = TargetDescription(resources, ++g_variant);
        state.ResumeTiming();
        const double callSeconds = Timed([&] { wbhw::CompareResourceTexts(a, b); });
        const double rawTwo = Timed([&] {
            RawParse(a);
            RawParse(b);
        });
        call.push_back(callSeconds / rawTwo);

        state.PauseTiming();
        const std::u16string wideA = qv::kern::AnsiToWide(a);
        auto ta = std::make_unique<wbhw::ResTreeNode>(wbhw::WString(), u"userData1", false);
        auto tb = std::make_unique<wbhw::ResTreeNode>(wbhw::WString(), u"userData2", false);
        const double loadSeconds = Timed([&] { ta->ParseText(wideA, false); });
        load.push_back(loadSeconds / Timed([&] { RawParse(a); }));
        // The load as the call runs it: the ASCII bytes handed to Expat as they are.
        auto tu = std::make_unique<wbhw::ResTreeNode>(wbhw::WString(), u"userData3", false);
        const double utf8Seconds = Timed([&] { tu->ParseUtf8(a, false); });
        loadUtf8.push_back(utf8Seconds / Timed([&] { RawParse(a); }));
        loadNoOp.push_back(utf8Seconds / Timed([&] { NoOpParse(a); }));
        tu.reset();
        tb->ParseText(qv::kern::AnsiToWide(b), false);
        walk.push_back(Timed([&] { wbhw::CompareNodes(ta.get(), tb.get()); }) / loadSeconds);
        destroy.push_back(Timed([&] { ta.reset(); }) / loadSeconds);
        tb.reset();
        state.ResumeTiming();
    }
    const std::string size = std::to_string(resources);
    state.counters["call_vs_2_raw"] = Note("call / two raw parses, " + size, call);
    state.counters["load_vs_raw"] = Note("load / raw parse, " + size, load);
    state.counters["load_utf8_vs_raw"] = Note("load of UTF-8 / raw parse, " + size, loadUtf8);
    state.counters["load_utf8_vs_noop"] =
        Note("load of UTF-8 / parse with no-op handlers, " + size, loadNoOp);
    state.counters["walk_vs_load"] = Note("walk / load, " + size, walk);
    state.counters["destroy_vs_load"] = Note("destroy / load, " + size, destroy);
}

// The walk alone, over the same two loaded trees again and again (what a profile of the walk
// wants to see).
void BM_WalkOnly(benchmark::State& state) {
    const auto resources = static_cast<size_t>(state.range(0));
    wbhw::ResTreeNode a(wbhw::WString(), u"userData1", false);
    wbhw::ResTreeNode b(wbhw::WString(), u"userData2", false);
    a.ParseUtf8(TargetDescription(resources, 1), false);
    b.ParseUtf8(TargetDescription(resources, 2), false);
    for (auto _ : state)
        benchmark::DoNotOptimize(wbhw::CompareNodes(&a, &b));
    state.counters["ns_per_resource"] =
        benchmark::Counter(static_cast<double>(state.iterations() * resources),
                           benchmark::Counter::kIsRate | benchmark::Counter::kInvert);
}

// Hostile inputs: one list of N pieces, and an ordered node repeating one name N times whose
// offered copy is shifted by one entry, so that nothing pairs by place. Reports the time per
// piece or entry; a linear walk keeps it flat from 10k to 40k.
std::map<std::string, std::map<int64_t, double>> g_perItem;

void Hostile(benchmark::State& state, const char* kind, const std::string& a,
             const std::string& b) {
    const auto n = state.range(0);
    double seconds = 0;
    for (auto _ : state) {
        wbhw::ClearCompareCache();
        seconds += Timed([&] { wbhw::CompareResourceTexts(a, b); });
    }
    g_perItem[kind][n] = seconds / static_cast<double>(state.iterations() * n);
    state.counters["ns_per_item"] = g_perItem[kind][n] * 1e9;
}

void BM_LongList(benchmark::State& state) {
    // Every offered piece is spelled in another case and the order is reversed, so each
    // required piece is found only through the collator.
    const int64_t n = state.range(0);
    std::string required;
    std::string offered;
    for (int64_t i = 0; i < n; ++i) {
        required += (i != 0 ? ",v" : "v") + std::to_string(i);
        offered += (i != 0 ? ",V" : "V") + std::to_string(n - 1 - i);
    }
    const auto list = [](const std::string& l) {
        return "<R><SupportedValues>" + l + "</SupportedValues></R>";
    };
    Hostile(state, "list piece", list(required), list(offered));
}

void BM_Repeats(benchmark::State& state) {
    std::string repeats;
    for (int64_t i = 0; i < state.range(0); ++i)
        repeats += "<Pin>" + std::to_string(i % 2) + "</Pin>";
    Hostile(state, "repeated entry", "<R><P name='P' ordered='true'>" + repeats + "</P></R>",
            "<R><P name='P' ordered='true'><Other/>" + repeats + "</P></R>");
}

// Two host threads, each comparing fresh pairs of its own: pairs per second with 2 threads
// against 1 (two cores would make it 2).
std::map<int, double> g_pairsPerSecond;

std::vector<std::pair<std::string, std::string>> ParallelPairs() {
    std::vector<std::pair<std::string, std::string>> pairs;
    for (size_t i = 0; i < 16; ++i)
        pairs.emplace_back(TargetDescription(500, 2 * i), TargetDescription(500, 2 * i + 1));
    return pairs;
}

void BM_Parallel(benchmark::State& state) {
    static const std::vector<std::pair<std::string, std::string>> pairs = ParallelPairs();
    // Threads take alternate pairs, and each empties the cache before its call: no answer comes
    // from the cache, and no thread waits for another but for the moment of the lookup.
    size_t next = static_cast<size_t>(state.thread_index());
    for (auto _ : state) {
        const auto& [a, b] = pairs[next % pairs.size()];
        wbhw::ClearCompareCache();
        benchmark::DoNotOptimize(wbhw::CompareResourceTexts(a, b));
        next += static_cast<size_t>(state.threads());
    }
    state.counters["pairs_per_second"] =
        benchmark::Counter(static_cast<double>(state.iterations()), benchmark::Counter::kIsRate);
}

BENCHMARK(BM_HostCost)->Arg(2000)->Iterations(15)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_HostCost)->Arg(16000)->Iterations(5)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_WalkOnly)->Arg(2000)->Arg(16000)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_LongList)->Arg(10000)->Arg(40000)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_Repeats)->Arg(10000)->Arg(40000)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_Parallel)->Threads(1)->Threads(2)->UseRealTime()->MinTime(2.0);

// Keeps the parallel throughput per thread count for the summary.
class SummaryReporter : public benchmark::ConsoleReporter {
public:
    void ReportRuns(const std::vector<Run>& runs) override {
        for (const Run& run : runs) {
            if (run.benchmark_name().find("BM_Parallel") == 0 && run.run_type == Run::RT_Iteration)
                g_pairsPerSecond[static_cast<int>(run.threads)] =
                    run.counters.at("pairs_per_second");
        }
        ConsoleReporter::ReportRuns(runs);
    }
};

long PeakRssKilobytes() {
    rusage usage{};
    getrusage(RUSAGE_SELF, &usage);
    return usage.ru_maxrss;
}

// The cache's memory: peak resident size before and after 100 distinct pairs of 2,000-resource
// descriptions, before anything else has run.
void ReportCacheMemory() {
    const long before = PeakRssKilobytes();
    for (size_t i = 0; i < 100; ++i)
        wbhw::CompareResourceTexts(TargetDescription(2000, 1000000 + 2 * i),
                                   TargetDescription(2000, 1000001 + 2 * i));
    std::printf("peak RSS before 100 distinct pairs: %.1f MB, after: %.1f MB; the cache keeps "
                "%.1f MB (budget %.0f MB)\n",
                static_cast<double>(before) / 1024, static_cast<double>(PeakRssKilobytes()) / 1024,
                static_cast<double>(wbhw::CompareCacheBytes()) / (1 << 20),
                static_cast<double>(wbhw::kCompareCacheBytes) / (1 << 20));
    wbhw::ClearCompareCache();
}

} // namespace

int main(int argc, char** argv) {
    benchmark::Initialize(&argc, argv);
    ReportCacheMemory();
    SummaryReporter reporter;
    benchmark::RunSpecifiedBenchmarks(&reporter);
    for (const auto& [name, ratios] : g_summary)
        std::printf("%s: %.3f (median of %zu runs)\n", name.c_str(), Median(ratios), ratios.size());
    for (const auto& [kind, perSize] : g_perItem) {
        if (perSize.size() == 2)
            std::printf("%s: time per item at 40k / at 10k: %.2f\n", kind.c_str(),
                        perSize.rbegin()->second / perSize.begin()->second);
    }
    if (g_pairsPerSecond.contains(1) && g_pairsPerSecond.contains(2))
        std::printf("throughput with 2 threads / 1 thread: %.2f\n",
                    g_pairsPerSecond[2] / g_pairsPerSecond[1]);
    benchmark::Shutdown();
    return 0;
}
