// Files that hold one very large token (an element name, an attribute name or value, a comment)
// loaded through ParseFile: the cost per byte at 16 MB against the cost per byte at 1 MB, which
// stays near 1 only when the loader keeps such a token linear.
#include "resource_tree/ResTreeNode.h"

#include <benchmark/benchmark.h>
#include <cstdio>
#include <fstream>
#include <map>
#include <string>
#include <unistd.h>

namespace {

// The kinds of token, each as the text before and after its N repeated characters.
struct TokenKind {
    const char* name;
    const char* before;
    const char* after;
};
constexpr TokenKind kKinds[] = {
    {"element name", "<r><e", "/></r>"},
    {"attribute name", "<r a", "='1'/>"},
    {"attribute value", "<r a='", "'/>"},
    {"comment", "<r><!--", "--></r>"},
};

// Writes the file of one kind and size once; removed when the program ends.
const std::string& TokenFile(size_t kind, size_t megabytes) {
    static std::map<std::pair<size_t, size_t>, std::string> files;
    std::string& path = files[{kind, megabytes}];
    if (path.empty()) {
        path = "/tmp/huge_token_" + std::to_string(getpid()) + "_" + std::to_string(kind) + "_" +
               std::to_string(megabytes) + ".xml";
        std::ofstream out(path, std::ios::binary);
        out << kKinds[kind].before << std::string(megabytes << 20, 'x') << kKinds[kind].after;
    }
    return path;
}

std::map<std::pair<size_t, size_t>, double> g_nsPerByte;

void BM_HugeToken(benchmark::State& state) {
    const auto kind = static_cast<size_t>(state.range(0));
    const auto megabytes = static_cast<size_t>(state.range(1));
    const std::string& path = TokenFile(kind, megabytes);
    for (auto _ : state) {
        wbhw::ResTreeNode root(u"", u"", false);
        benchmark::DoNotOptimize(root.ParseFile(path, false));
    }
    state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * (megabytes << 20)));
    state.SetLabel(kKinds[kind].name);
}

BENCHMARK(BM_HugeToken)
    ->ArgsProduct({{0, 1, 2, 3}, {1, 16}})
    ->Unit(benchmark::kMillisecond)
    ->Iterations(1)
    ->Repetitions(3);

// Keeps the median processor time per byte of each run (the machine may be shared; waiting
// for it is not the loader's cost) for the ratios printed after the run.
class RatioReporter : public benchmark::ConsoleReporter {
public:
    void ReportRuns(const std::vector<Run>& runs) override {
        for (const Run& run : runs) {
            if (run.run_type != Run::RT_Aggregate || run.aggregate_name != "median")
                continue;
            const std::string name = run.run_name.str();
            size_t kind = 0;
            size_t megabytes = 0;
            if (std::sscanf(name.c_str(), "BM_HugeToken/%zu/%zu", &kind, &megabytes) == 2)
                g_nsPerByte[{kind, megabytes}] =
                    run.GetAdjustedCPUTime() / static_cast<double>(megabytes << 20);
        }
        ConsoleReporter::ReportRuns(runs);
    }
};

} // namespace

int main(int argc, char** argv) {
    benchmark::Initialize(&argc, argv);
    RatioReporter reporter;
    benchmark::RunSpecifiedBenchmarks(&reporter);
    for (size_t kind = 0; kind < std::size(kKinds); ++kind) {
        const double small = g_nsPerByte[{kind, 1}];
        if (small > 0)
            std::printf("%s: cost per byte at 16 MB / at 1 MB: %.2f\n", kKinds[kind].name,
                        g_nsPerByte[{kind, 16}] / small);
        std::remove(TokenFile(kind, 1).c_str());
        std::remove(TokenFile(kind, 16).c_str());
    }
    benchmark::Shutdown();
    return 0;
}
