// A target with N resources under one connector and a project with one Tangent I/O item for
// each, driven through the embedded host and the real module: opening the project (every item
// made and bound) and renaming the connector (every item follows). Reports the processor time
// per item and, for 10,000 items, its ratio to the same figure at 1,000 items measured in the
// same run (near 1 when no walk is quadratic), and the notifications one rename delivers.
#include "cli/AttributeSet.h"
#include "cli/ItemStates.h"
#include "kern/IntegerText.h"
#include "project/AtomicFile.h"
#include "project/ProjectFormat.h"
#include "provider/TIOIdentifiers.h"
#include "session/HostSession.h"

#include <algorithm>
#include <benchmark/benchmark.h>
#include <cstdio>
#include <ctime>
#include <filesystem>
#include <map>
#include <memory>
#include <string>
#include <vector>

namespace {

namespace fs = std::filesystem;
using wbhost::project::Property;
using wbhost::project::SavedItem;
using wbhost::project::SavedProject;

constexpr int kSmall = 1000;
constexpr int kLarge = 10000;

// Seconds of processor time used by this thread: on a shared machine the wall clock also counts
// the time other processes hold the processor.
double ThreadSeconds() {
    timespec now{};
    clock_gettime(CLOCK_THREAD_CPUTIME_ID, &now);
    return static_cast<double>(now.tv_sec) + static_cast<double>(now.tv_nsec) * 1e-9;
}

// A description whose connector "C0" holds COUNT lines "L0".. described as items read them.
std::string Description(int count) {
    return R"(<Target name="Scale"><Connector name="C0"><DigitalLine names="L[n=0..)" +
           std::to_string(count - 1) + R"(]">
  <Protocols>IOResource,DigitalLine</Protocols><IOInterface>DigitalLine</IOInterface>
  <MethodSet><Method name="Read"><Signature>Boolean Read()</Signature>
    <ReturnValue><Type>Boolean</Type></ReturnValue></Method></MethodSet>
  <PropertySet><Property name="Direction"><Signature>Enum Direction</Signature></Property>
  </PropertySet>
  <AttributeSet><Attribute name="Direction"><Value>Input</Value></Attribute></AttributeSet>
</DigitalLine></Connector></Target>
)";
}

GUID NumberedGuid(uint32_t number) {
    return GUID{number, 0x5ca1, 0xe000, {0x8a, 0, 0, 0, 0, 0, 0, 1}};
}

// A project with the target DESCRIPTION and one item for each of its COUNT lines.
SavedProject ScaleProject(int count, const std::string& description) {
    SavedProject project;
    project.items.push_back({NumberedGuid(0),
                             wbhost::project::kProjectType,
                             wbproj::kShownFlag,
                             u"Scale",
                             SavedItem::kNoParent,
                             {},
                             {}});
    project.items.push_back({NumberedGuid(1),
                             wbhost::project::kTargetType,
                             wbproj::kShownFlag,
                             u"T",
                             0,
                             description,
                             {}});
    for (int i = 0; i < count; ++i) {
        const std::u16string name =
            u"Item" + qv::kern::IntegerToString(static_cast<uint32_t>(i), 10);
        SavedItem item{NumberedGuid(static_cast<uint32_t>(i + 2)),
                       tio::kIOItemType,
                       wbproj::kShownFlag,
                       name,
                       1,
                       {},
                       {}};
        item.properties[u"tioAttrBag"] = {
            Property::Kind::String,
            wbhost::cli::NewItemAttributeSet(
                name, u"/C0/L" + qv::kern::IntegerToString(static_cast<uint32_t>(i), 10)),
            0};
        project.items.push_back(std::move(item));
    }
    return project;
}

// The files of one size, written once per run into a folder removed at exit.
class ScaleFiles {
public:
    explicit ScaleFiles(int count) {
        std::string pattern = (fs::temp_directory_path() / "wbscale-XXXXXX").string();
        folder_ = mkdtemp(pattern.data()) != nullptr ? pattern : std::string();
        const std::string description = (fs::path(folder_) / "scale.xml").string();
        project_ = (fs::path(folder_) / "scale.wbproj").string();
        ok_ = !folder_.empty() &&
              wbhost::project::WriteFileAtomically(description, Description(count), nullptr) &&
              wbhost::project::WriteFileAtomically(
                  project_, FormatProject(ScaleProject(count, description)), nullptr);
    }
    ~ScaleFiles() {
        std::error_code ignored;
        if (!folder_.empty())
            fs::remove_all(folder_, ignored);
    }
    ScaleFiles(const ScaleFiles&) = delete;
    ScaleFiles& operator=(const ScaleFiles&) = delete;
    bool Ok() const noexcept { return ok_; }
    const std::string& Project() const noexcept { return project_; }

private:
    std::string folder_;
    std::string project_;
    bool ok_ = false;
};

const ScaleFiles& FilesOf(int count) {
    static std::map<int, std::unique_ptr<ScaleFiles>> files;
    auto& slot = files[count];
    if (!slot)
        slot = std::make_unique<ScaleFiles>(count);
    return *slot;
}

// A session with the module loaded and the project of COUNT items open; null on failure.
std::unique_ptr<wbhost::session::HostSession> OpenScaleProject(int count, double* seconds) {
    auto session = std::make_unique<wbhost::session::HostSession>();
    std::string error;
    if (!FilesOf(count).Ok() || !session->Open(WBT_MODULE_PATH, &error))
        return nullptr;
    const double start = ThreadSeconds();
    const bool opened = session->OpenProject(FilesOf(count).Project(), &error);
    if (seconds != nullptr)
        *seconds = ThreadSeconds() - start;
    return opened ? std::move(session) : nullptr;
}

wbhost::project::ProjectItem& TargetOf(wbhost::session::HostSession& session) {
    return *session.Project()->Targets().front().Get();
}

// How many items of the open project report STATUS and RESOURCEPREFIX at the start of their
// resource.
double ItemsWith(wbhost::session::HostSession& session, int32_t status,
                 std::u16string_view resourcePrefix) {
    int found = 0;
    for (const auto& state : wbhost::cli::CollectItemStates(TargetOf(session))) {
        if (state.status == status && state.resource.starts_with(resourcePrefix))
            ++found;
    }
    return found;
}

// Processor seconds per item of every run, by measurement and item count.
std::map<std::string, std::map<int, std::vector<double>>> g_perItem;

double Median(std::vector<double> values) {
    if (values.empty())
        return 0;
    std::sort(values.begin(), values.end());
    const size_t middle = values.size() / 2;
    return values.size() % 2 != 0 ? values[middle] : (values[middle - 1] + values[middle]) / 2;
}

// Records one run of WHAT over COUNT items that took SECONDS of processor time.
void Record(benchmark::State& state, const std::string& what, int count, double seconds) {
    auto& samples = g_perItem[what][count];
    samples.push_back(seconds / count);
    state.counters["median_us_per_item"] = Median(samples) * 1e6;
}

void BM_OpenAndBind(benchmark::State& state) {
    const int count = static_cast<int>(state.range(0));
    double bound = 0;
    for (auto _ : state) {
        state.PauseTiming();
        double seconds = 0;
        auto session = OpenScaleProject(count, &seconds);
        if (!session) {
            state.SkipWithError("the project does not open");
            return;
        }
        Record(state, "open and bind", count, seconds);
        bound = ItemsWith(*session, 0, u"/C0/");
        session.reset();
        state.ResumeTiming();
    }
    state.counters["items_bound"] = bound;
}

void BM_RenameConnector(benchmark::State& state) {
    const int count = static_cast<int>(state.range(0));
    auto session = OpenScaleProject(count, nullptr);
    if (!session) {
        state.SkipWithError("the project does not open");
        return;
    }
    wbhost::resources::ResourceTree& tree =
        *session->Project()->TargetOf(TargetOf(*session))->Target().tree;
    const uint64_t before = tree.Notifications();
    bool renamed = false;
    for (auto _ : state) {
        wbhw::ResTreeNode* connector = tree.Find(renamed ? u"C1" : u"C0");
        const double start = ThreadSeconds();
        if (connector == nullptr || tree.Rename(*connector, renamed ? u"C0" : u"C1") != S_OK) {
            state.SkipWithError("the connector cannot be renamed");
            return;
        }
        Record(state, "rename the connector", count, ThreadSeconds() - start);
        renamed = !renamed;
    }
    state.counters["notifications_per_rename"] =
        static_cast<double>(tree.Notifications() - before) /
        static_cast<double>(state.iterations());
    state.counters["items_following"] = ItemsWith(*session, 0, renamed ? u"/C1/" : u"/C0/");
}

// Few runs, each long: the medians of the runs are what the summary compares.
BENCHMARK(BM_OpenAndBind)->Arg(kSmall)->Arg(kLarge)->Unit(benchmark::kMillisecond)->Iterations(5);
BENCHMARK(BM_RenameConnector)
    ->Arg(kSmall)
    ->Arg(kLarge)
    ->Unit(benchmark::kMillisecond)
    ->Iterations(6);

} // namespace

int main(int argc, char** argv) {
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
    for (const auto& [what, bySize] : g_perItem) {
        const auto small = bySize.find(kSmall);
        const auto large = bySize.find(kLarge);
        if (small == bySize.end() || large == bySize.end())
            continue;
        const double smallMedian = Median(small->second);
        const double largeMedian = Median(large->second);
        std::printf("%s: median processor time per item %.2f us at 1,000 items, %.2f us at "
                    "10,000; ratio %.3f\n",
                    what.c_str(), smallMedian * 1e6, largeMedian * 1e6,
                    smallMedian > 0 ? largeMedian / smallMedian : 0.0);
    }
    benchmark::Shutdown();
    return 0;
}
