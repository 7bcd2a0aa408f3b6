// A target with N resources under one connector and a project with one Tangent I/O item for
// each, driven through the embedded host and the real module: opening the project (every item
// made and bound), renaming the connector (every item follows) and creating the items in one
// bulk call of TIO_CreateMultiple, as a host program does. Reports the processor time
// per item and, for 10,000 items, its ratio to the same figure at 1,000 items measured in the
// same run (near 1 when no walk is quadratic), and the notifications one rename delivers. Also
// the item's judgement of a new name, which looks through every item of its target.
#include "cli/AttributeSet.h"
#include "cli/HostStringList.h"
#include "cli/HostText.h"
#include "cli/HostedModule.h"
#include "cli/ItemStates.h"
#include "framework/IqxProjectItemUI.h"
#include "kern/IntegerText.h"
#include "project/AtomicFile.h"
#include "project/ProjectFormat.h"
#include "provider/TIOIdentifiers.h"
#include "runtime/RefnumTable.h"
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

// A project with the target DESCRIPTION and one item for each of its first COUNT lines.
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
    // COUNT lines, and an item for each when WITHITEMS.
    ScaleFiles(int count, bool withItems) {
        std::string pattern = (fs::temp_directory_path() / "wbscale-XXXXXX").string();
        folder_ = mkdtemp(pattern.data()) != nullptr ? pattern : std::string();
        const std::string description = (fs::path(folder_) / "scale.xml").string();
        project_ = (fs::path(folder_) / "scale.wbproj").string();
        ok_ =
            !folder_.empty() &&
            wbhost::project::WriteFileAtomically(description, Description(count), nullptr) &&
            wbhost::project::WriteFileAtomically(
                project_, FormatProject(ScaleProject(withItems ? count : 0, description)), nullptr);
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

const ScaleFiles& FilesOf(int count, bool withItems) {
    static std::map<std::pair<int, bool>, std::unique_ptr<ScaleFiles>> files;
    auto& slot = files[{count, withItems}];
    if (!slot)
        slot = std::make_unique<ScaleFiles>(count, withItems);
    return *slot;
}

// A session with the module loaded and the project of COUNT lines open (with an item for each
// when WITHITEMS); null on failure. SECONDS receives the processor time of the opening.
std::unique_ptr<wbhost::session::HostSession> OpenScaleProject(int count, bool withItems,
                                                               double* seconds) {
    auto session = std::make_unique<wbhost::session::HostSession>();
    std::string error;
    const ScaleFiles& files = FilesOf(count, withItems);
    if (!files.Ok() || !session->Open(WBT_MODULE_PATH, &error))
        return nullptr;
    const double start = ThreadSeconds();
    const bool opened = session->OpenProject(files.Project(), &error);
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

double Median(std::vector<double> values) {
    if (values.empty())
        return 0;
    std::sort(values.begin(), values.end());
    const size_t middle = values.size() / 2;
    return values.size() % 2 != 0 ? values[middle] : (values[middle - 1] + values[middle]) / 2;
}

// Processor seconds per item (or line) at 1,000 and at 10,000, measured in pairs: each iteration
// measures both sizes one after the other, so a change of the machine's load between runs does
// not pass for a change of scale. The ratio is taken per pair and its median reported.
struct Pairs {
    std::vector<double> small;
    std::vector<double> large;
    std::vector<double> ratios;
    void Add(double smallSeconds, double largeSeconds) {
        small.push_back(smallSeconds / kSmall);
        large.push_back(largeSeconds / kLarge);
        ratios.push_back(large.back() / small.back());
    }
    void Report(benchmark::State& state) const {
        state.counters["median_us_per_item_1000"] = Median(small) * 1e6;
        state.counters["median_us_per_item_10000"] = Median(large) * 1e6;
        state.counters["median_ratio"] = Median(ratios);
    }
};
std::map<std::string, Pairs> g_pairs;

// Measures SMALL and LARGE (processor seconds, negative on failure) once per iteration into
// PAIRS. Each size goes first every other time: the one measured second finds the caches filled
// by the other. False, with the benchmark skipped for WHY, when a measurement fails.
template <class Small, class Large>
bool MeasureInTurns(benchmark::State& state, Pairs& pairs, Small&& small, Large&& large,
                    const char* why) {
    bool smallFirst = true;
    for (auto _ : state) {
        const double firstSeconds = smallFirst ? small() : large();
        const double secondSeconds = smallFirst ? large() : small();
        const double smallSeconds = smallFirst ? firstSeconds : secondSeconds;
        const double largeSeconds = smallFirst ? secondSeconds : firstSeconds;
        smallFirst = !smallFirst;
        if (smallSeconds < 0 || largeSeconds < 0) {
            state.SkipWithError(why);
            return false;
        }
        pairs.Add(smallSeconds, largeSeconds);
    }
    return true;
}

// Opens a project of COUNT items, every one made and bound; the processor seconds of the
// opening, or a negative number when it failed. BOUND receives how many items came out bound.
double OpenAndBind(int count, double* bound) {
    double seconds = -1;
    const auto session = OpenScaleProject(count, true, &seconds);
    if (!session)
        return -1;
    *bound += ItemsWith(*session, 0, u"/C0/");
    return seconds;
}

// Runs MEASURE(count, &bound) on 1,000 and 10,000 items in turns, as PAIRS NAME, and reports
// the pairs and how many items came out bound per pair.
template <class Measure>
void MeasureBoundPairs(benchmark::State& state, const char* name, Measure&& measure,
                       const char* why) {
    Pairs& pairs = g_pairs[name];
    double bound = 0;
    if (!MeasureInTurns(
            state, pairs, [&] { return measure(kSmall, &bound); },
            [&] { return measure(kLarge, &bound); }, why))
        return;
    pairs.Report(state);
    state.counters["items_bound_per_pair"] = bound / static_cast<double>(state.iterations());
}

void BM_OpenAndBind(benchmark::State& state) {
    MeasureBoundPairs(state, "open and bind", OpenAndBind, "the project does not open");
}

// One project open for the connector renames: its tree, and which name the connector has now.
struct RenameSubject {
    std::unique_ptr<wbhost::session::HostSession> session;
    wbhost::resources::ResourceTree* tree = nullptr;
    bool renamed = false;

    RenameSubject(int count, bool withItems)
        : session(OpenScaleProject(count, withItems, nullptr)) {
        if (session)
            tree = session->Project()->TargetOf(TargetOf(*session))->Target().tree.get();
    }
    // Renames the connector back and forth; the processor seconds it took, or a negative number.
    double Rename() {
        wbhw::ResTreeNode* connector = tree->Find(renamed ? u"C1" : u"C0");
        const double start = ThreadSeconds();
        if (connector == nullptr || tree->Rename(*connector, renamed ? u"C0" : u"C1") != S_OK)
            return -1;
        renamed = !renamed;
        return ThreadSeconds() - start;
    }
    // How many items now report the connector's current name in their bound resource.
    double Following() { return ItemsWith(*session, 0, renamed ? u"/C1/" : u"/C0/"); }
};

// Renames the connector above 1,000 and 10,000 lines, with an item for each line when RANGE(0)
// is 1; without items it shows what the host's tree alone costs.
void BM_RenameConnector(benchmark::State& state) {
    const bool withItems = state.range(0) != 0;
    RenameSubject small(kSmall, withItems);
    RenameSubject large(kLarge, withItems);
    if (small.tree == nullptr || large.tree == nullptr) {
        state.SkipWithError("the project does not open");
        return;
    }
    Pairs& pairs = g_pairs[withItems ? "rename the connector" : "rename the connector, no items"];
    const uint64_t before = large.tree->Notifications();
    if (!MeasureInTurns(
            state, pairs, [&] { return small.Rename(); }, [&] { return large.Rename(); },
            "the connector cannot be renamed"))
        return;
    pairs.Report(state);
    state.counters["notifications_per_rename_10000"] =
        static_cast<double>(large.tree->Notifications() - before) /
        static_cast<double>(state.iterations());
    state.counters["items_following_10000"] = large.Following();
}

// COUNT definitions, one item for each line of the scale target, in the host's code page.
std::vector<std::string> Definitions(int count) {
    std::vector<std::string> texts;
    for (int i = 0; i < count; ++i) {
        const std::u16string number = qv::kern::IntegerToString(static_cast<uint32_t>(i), 10);
        texts.push_back(wbhost::cli::ToHostText(wbhost::cli::ToUtf8(
            wbhost::cli::NewItemAttributeSet(u"Item" + number, u"/C0/L" + number))));
    }
    return texts;
}

// Creates an item for each of the COUNT lines of a new project's target in one call of
// TIO_CreateMultiple; the processor seconds of the call, or a negative number when it failed.
// BOUND receives how many items came out bound.
double CreateMultiple(int count, double* bound) {
    auto session = OpenScaleProject(count, false, nullptr);
    using CreateMultipleFn = int32_t(const WBRefNum*, WBHandle*);
    auto* create =
        session ? session->Module()->Find<CreateMultipleFn>("TIO_CreateMultiple") : nullptr;
    if (create == nullptr)
        return -1;
    wbhost::cli::HostStringList definitions(Definitions(count));
    auto& refnums = wbhost::runtime::RefnumTable::Instance();
    const WBRefNum refnum = refnums.Add(TargetOf(*session).Object());
    const double start = ThreadSeconds();
    const int32_t status = create(&refnum, &definitions.Handle());
    const double seconds = ThreadSeconds() - start;
    refnums.Remove(refnum);
    *bound += ItemsWith(*session, 0, u"/C0/");
    return status == S_OK ? seconds : -1;
}

void BM_CreateMultiple(benchmark::State& state) {
    MeasureBoundPairs(state, "create in one call", CreateMultiple, "the items cannot be created");
}

// Processor seconds of ten judgements of a free name for the first item of SESSION's target
// (each looks at the name of every item there); negative when one is not accepted.
double JudgeNames(wbhost::session::HostSession& session) {
    const auto rules =
        qv::com::QueryAs<IqxProjectItemUI>(TargetOf(session).Children().front()->Object());
    if (!rules)
        return -1;
    const double start = ThreadSeconds();
    for (int i = 0; i < 10; ++i) {
        if (rules->ValidateNewName(u"A name nobody has") != S_OK)
            return -1;
    }
    return ThreadSeconds() - start;
}

// A rename judged in a target of 1,000 and of 10,000 items: the time per item of the target.
void BM_ValidateNewName(benchmark::State& state) {
    const auto small = OpenScaleProject(kSmall, true, nullptr);
    const auto large = OpenScaleProject(kLarge, true, nullptr);
    if (!small || !large) {
        state.SkipWithError("the project does not open");
        return;
    }
    Pairs& pairs = g_pairs["judge a new name (ten times)"];
    if (!MeasureInTurns(
            state, pairs, [&] { return JudgeNames(*small); }, [&] { return JudgeNames(*large); },
            "the name is not accepted"))
        return;
    pairs.Report(state);
}

// Few iterations, each long; the medians of the pairs are what the summary compares.
BENCHMARK(BM_OpenAndBind)->Unit(benchmark::kMillisecond)->Iterations(6);
BENCHMARK(BM_RenameConnector)->Arg(0)->Arg(1)->Unit(benchmark::kMillisecond)->Iterations(10);
BENCHMARK(BM_CreateMultiple)->Unit(benchmark::kMillisecond)->Iterations(4);
BENCHMARK(BM_ValidateNewName)->Unit(benchmark::kMillisecond)->Iterations(10);

} // namespace

int main(int argc, char** argv) {
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
    for (const auto& [what, pairs] : g_pairs)
        std::printf("%s: median processor time per item %.2f us at 1,000, %.2f us at 10,000; "
                    "median ratio of pairs %.3f\n",
                    what.c_str(), Median(pairs.small) * 1e6, Median(pairs.large) * 1e6,
                    Median(pairs.ratios));
    benchmark::Shutdown();
    return 0;
}
