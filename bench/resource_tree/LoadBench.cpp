// Loading generated target descriptions of about 1 MB and 10 MB, against Expat with no-op
// handlers over the same bytes: throughput, the ratio to Expat (against the anchor's own
// benchmark, and paired with an anchor parse after each load), cost per element, heap bytes per
// element and the time to destroy the tree.
#include "resource_tree/LoaderText.h"
#include "resource_tree/ResTreeNode.h"

#include <benchmark/benchmark.h>
#include <chrono>
#include <expat.h>
#include <malloc.h>
#include <map>
#include <memory>
#include <string>
#include <time.h>

namespace {

struct Document {
    std::string utf8;
    std::u16string wide;
    size_t elements = 0;
};

// A target in the style of a real board: shared method sets, connectors of I/O resources, each
// with its attribute set and its own method set.
Document MakeTarget(size_t bytes) {
    Document doc;
    std::string& x = doc.utf8;
    auto element = [&doc](size_t n = 1) { doc.elements += n; };
    x = "<Target name=\"Board\" vendor=\"Acme\">\n"
        "  <DisplayName localize=\"true\">eng=Board, deu=Platine</DisplayName>\n";
    element(2);
    for (size_t c = 0; x.size() < bytes; ++c) {
        const std::string conn = "Connector" + std::to_string(c);
        x += "  <Connector name=\"" + conn + "\">\n";
        element();
        for (size_t r = 0; r < 64 && x.size() < bytes; ++r) {
            const std::string name = "DIO" + std::to_string(r);
            x += "    <IOResource name=\"" + name +
                 "\">\n"
                 "      <DisplayName>" +
                 conn + "/" + name +
                 "</DisplayName>\n"
                 "      <Direction>bidirectional</Direction>\n"
                 "      <DataType>Boolean</DataType>\n"
                 "      <Line>" +
                 std::to_string(r) +
                 "</Line>\n"
                 "      <Signature>" +
                 std::to_string(c * 64 + r) +
                 "-A1F3</Signature>\n"
                 "      <HelpPath>help/io/dio.html</HelpPath>\n"
                 "      <Reserves>../DIO" +
                 std::to_string((r + 1) % 64) +
                 "</Reserves>\n"
                 "      <Group name=\"Methods\">\n"
                 "        <Method "
                 "name=\"Read\"><Direction>in</Direction><Arg>Boolean</Arg></Method>\n"
                 "        <Method "
                 "name=\"Write\"><Direction>out</Direction><Arg>Boolean</Arg></Method>\n"
                 "        <Method name=\"SetOutputEnable\"><Direction>out</Direction></Method>\n"
                 "      </Group>\n"
                 "    </IOResource>\n";
            element(1 + 7 + 1 + 3 * 3 - 1);
        }
        x += "  </Connector>\n";
    }
    x += "</Target>\n";
    doc.wide = wbhw::FromUtf8Lenient(x);
    return doc;
}

const Document& DocumentOf(int megabytes) {
    static std::map<int, Document> documents;
    auto found = documents.find(megabytes);
    if (found == documents.end())
        found =
            documents.emplace(megabytes, MakeTarget(static_cast<size_t>(megabytes) << 20)).first;
    return found->second;
}

// Seconds per iteration of the raw parse and of the load, per size, for the ratios.
std::map<int, double> expatSeconds;
std::map<int, double> loadNsPerElement;
std::map<int, double> loadCpuNsPerElement;

void XMLCALL NoStart(void*, const XML_Char*, const XML_Char**) {}
void XMLCALL NoEnd(void*, const XML_Char*) {}
void XMLCALL NoText(void*, const XML_Char*, int) {}

// The raw parse: Expat with no-op handlers over the bytes of DOC.
void ParseWithExpat(const Document& doc) {
    XML_Parser parser = XML_ParserCreate("UTF-8");
    XML_SetElementHandler(parser, NoStart, NoEnd);
    XML_SetCharacterDataHandler(parser, NoText);
    const XML_Status ok = XML_Parse(parser, doc.utf8.data(), static_cast<int>(doc.utf8.size()), 1);
    XML_ParserFree(parser);
    benchmark::DoNotOptimize(ok);
}

// Seconds of processor time used by this thread: on a shared machine the wall clock also counts
// the time other processes hold the processor.
double ThreadSeconds() {
    timespec now{};
    clock_gettime(CLOCK_THREAD_CPUTIME_ID, &now);
    return static_cast<double>(now.tv_sec) + static_cast<double>(now.tv_nsec) * 1e-9;
}

void BM_ExpatNoOp(benchmark::State& state) {
    const Document& doc = DocumentOf(static_cast<int>(state.range(0)));
    double total = 0;
    for (auto _ : state) {
        const auto start = std::chrono::steady_clock::now();
        ParseWithExpat(doc);
        total += std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
    }
    expatSeconds[static_cast<int>(state.range(0))] =
        total / static_cast<double>(state.iterations());
    state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * doc.utf8.size()));
    state.counters["elements"] = static_cast<double>(doc.elements);
}

void BM_LoadText(benchmark::State& state) {
    const int size = static_cast<int>(state.range(0));
    const Document& doc = DocumentOf(size);
    double total = 0;
    // Heap bytes held by one loaded tree, measured once outside the timed runs (asking the
    // allocator walks its whole heap).
    size_t heapBytes = 0;
    {
        // Entries come from the tree's arena, whose slabs the allocator counts.
        const size_t before = mallinfo2().uordblks;
        auto root = std::make_unique<wbhw::ResTreeNode>(wbhw::WString(), wbhw::WString(), false);
        root->ParseText(doc.wide, false);
        heapBytes = mallinfo2().uordblks - before;
    }
    // The anchor is also parsed right after every load, untimed by the framework, and both are
    // measured in this thread's processor time: load and anchor then meet the same machine load.
    double pairedLoad = 0;
    double pairedExpat = 0;
    for (auto _ : state) {
        const auto start = std::chrono::steady_clock::now();
        const double cpuStart = ThreadSeconds();
        auto root = std::make_unique<wbhw::ResTreeNode>(wbhw::WString(), wbhw::WString(), false);
        const int32_t result = root->ParseText(doc.wide, false);
        const double cpuLoaded = ThreadSeconds();
        total += std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
        if (result != 0)
            state.SkipWithError("load failed");
        state.PauseTiming();
        ParseWithExpat(doc);
        pairedLoad += cpuLoaded - cpuStart;
        pairedExpat += ThreadSeconds() - cpuLoaded;
        root.reset();
        state.ResumeTiming();
    }
    const double seconds = total / static_cast<double>(state.iterations());
    state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * doc.utf8.size()));
    state.counters["ratio_to_expat"] = seconds / expatSeconds[size];
    state.counters["paired_cpu_ratio"] = pairedLoad / pairedExpat;
    const double cpuNsPerElement = pairedLoad * 1e9 / static_cast<double>(state.iterations()) /
                                   static_cast<double>(doc.elements);
    state.counters["cpu_ns_per_element"] = cpuNsPerElement;
    loadCpuNsPerElement[size] = cpuNsPerElement;
    if (size != 1 && loadCpuNsPerElement.contains(1))
        state.counters["cpu_per_element_vs_1MB"] = cpuNsPerElement / loadCpuNsPerElement[1];
    state.counters["ns_per_element"] = seconds * 1e9 / static_cast<double>(doc.elements);
    state.counters["bytes_per_element"] =
        static_cast<double>(heapBytes) / static_cast<double>(doc.elements);
    loadNsPerElement[size] = seconds * 1e9 / static_cast<double>(doc.elements);
    if (size != 1 && loadNsPerElement.contains(1))
        state.counters["per_element_vs_1MB"] = loadNsPerElement[size] / loadNsPerElement[1];
}

void BM_Destroy(benchmark::State& state) {
    const int size = static_cast<int>(state.range(0));
    const Document& doc = DocumentOf(size);
    double total = 0;
    for (auto _ : state) {
        state.PauseTiming();
        auto root = std::make_unique<wbhw::ResTreeNode>(wbhw::WString(), wbhw::WString(), false);
        root->ParseText(doc.wide, false);
        state.ResumeTiming();
        const auto start = std::chrono::steady_clock::now();
        root.reset();
        total += std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
    }
    state.counters["ratio_to_expat"] =
        total / static_cast<double>(state.iterations()) / expatSeconds[size];
}

} // namespace

BENCHMARK(BM_ExpatNoOp)->Arg(1)->Arg(10)->Unit(benchmark::kMillisecond)->UseRealTime();
BENCHMARK(BM_LoadText)->Arg(1)->Arg(10)->Unit(benchmark::kMillisecond)->UseRealTime();
BENCHMARK(BM_Destroy)->Arg(1)->Arg(10)->Unit(benchmark::kMillisecond)->UseRealTime();
