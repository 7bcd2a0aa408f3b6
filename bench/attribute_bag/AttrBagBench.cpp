// Writing and reading a bag of 1,000 attributes in 100 sets, each reported as a ratio to a raw
// Expat parse (no handlers) of the same document measured in the same run.
#include "attribute_bag/TIOAttrBag.h"
#include "attribute_bag/XmlText.h"

#include <benchmark/benchmark.h>
#include <cstdio>
#include <expat.h>
#include <map>
#include <memory>
#include <string>

namespace {

// 10 sets of 10 sets under the root: 100 sets with 10 attributes each.
const TIOAttrBag& SampleBag() {
    static const std::unique_ptr<TIOAttrBag> bag = [] {
        auto root = std::make_unique<TIOAttrBag>(u"Item");
        for (int i = 0; i < 10; ++i) {
            TIOAttrBag& outer = root->GetOrCreateChild(u"Group" + std::u16string(1, u'A' + i));
            for (int j = 0; j < 10; ++j) {
                TIOAttrBag& set =
                    j == 0 ? outer : outer.GetOrCreateChild(u"Set" + std::u16string(1, u'0' + j));
                for (int k = 0; k < 10; ++k)
                    set.SetValue(u"Attribute" + std::u16string(1, u'a' + k),
                                 u"  value <" + std::u16string(1, u'0' + k) + u"> & more\n");
            }
        }
        return root;
    }();
    return *bag;
}

const std::u16string& SampleText() {
    static const std::u16string text = [] {
        std::u16string out;
        SampleBag().WriteXml(out);
        return out;
    }();
    return text;
}

void BM_ExpatAnchor(benchmark::State& state) {
    const std::string utf8 = wbhw::ToXmlUtf8Lenient(SampleText());
    for (auto _ : state) {
        XML_Parser parser = XML_ParserCreate("UTF-8");
        benchmark::DoNotOptimize(XML_Parse(parser, utf8.data(), static_cast<int>(utf8.size()), 1));
        XML_ParserFree(parser);
    }
    state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * SampleText().size() * 2));
}
BENCHMARK(BM_ExpatAnchor);

void BM_WriteXml(benchmark::State& state) {
    for (auto _ : state) {
        std::u16string out;
        SampleBag().WriteXml(out);
        benchmark::DoNotOptimize(out.data());
    }
    state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * SampleText().size() * 2));
}
BENCHMARK(BM_WriteXml);

void BM_ReadXml(benchmark::State& state) {
    for (auto _ : state) {
        TIOAttrBag bag;
        if (TIOAttrBag::ReadXml(SampleText(), bag) != 0)
            state.SkipWithError("read failed");
    }
    state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * SampleText().size() * 2));
}
BENCHMARK(BM_ReadXml);

// Prints each benchmark's CPU time (the median when repeated) as a ratio to the anchor after the
// usual table. CPU time, since the machine may be shared while this runs.
class RatioReporter : public benchmark::ConsoleReporter {
public:
    void ReportRuns(const std::vector<Run>& runs) override {
        for (const Run& run : runs) {
            const bool median = run.aggregate_name == "median";
            if (run.run_type == Run::RT_Iteration || median)
                times_[run.run_name.function_name] = run.GetAdjustedCPUTime();
        }
        ConsoleReporter::ReportRuns(runs);
    }
    void Finalize() override {
        ConsoleReporter::Finalize();
        const double anchor = times_["BM_ExpatAnchor"];
        for (const auto& [name, time] : times_) {
            if (anchor > 0)
                std::printf("%-16s %10.0f ns CPU, ratio to raw Expat parse: %.2f\n", name.c_str(),
                            time, time / anchor);
        }
    }

private:
    std::map<std::string, double> times_;
};

} // namespace

int main(int argc, char** argv) {
    benchmark::Initialize(&argc, argv);
    RatioReporter reporter;
    benchmark::RunSpecifiedBenchmarks(&reporter);
    benchmark::Shutdown();
    return 0;
}
