// What a Tangent I/O item offers in the project tree, driven through the embedded host with the
// real module: its menu, its dialogs (host programs whose runs the host records), help, removal
// and drag and drop; and what failing runner steps leave behind.
#include "ProjectTestSupport.h"
#include "com/TaskMem.h"
#include "framework/IqxItemUI.h"
#include "framework/IqxProjectItemUI.h"
#include "framework/IwbProjectCutCopyPaste3.h"
#include "framework/IwbProjectDragDrop.h"
#include "items/TIOItemCommands.h"
#include "kern/GuidText.h"
#include "kern/Utf8.h"
#include "project/DragData.h"
#include "runtime/HostFolder.h"

#include <algorithm>
#include <gtest/gtest.h>

using namespace projecttest;
using qv::com::ComPtr;
using wbhost::runner::HostReference;
using wbhost::runner::ProgramRun;
using wbhost::runner::ProgramValue;
using wbhost::runner::RunnerStep;
using Strings = std::vector<std::u16string>;

namespace {

constexpr const char* kBoard = R"(<Target>
  <IOResourceDefault><Help><Topic>io.html</Topic><Path>board.chm</Path></Help></IOResourceDefault>
  <Connector name="C0">
    <Line name="DIO0"><DisplayName>Valve line</DisplayName>
      <Help><Path>lines/dio.chm</Path><Topic>dio0.html</Topic><LocalizedContext>Lines</LocalizedContext></Help>
      <AttributeSet><Attribute name="Speed"><Value>fast</Value></Attribute></AttributeSet>
    </Line>
    <Line name="DIO1"><DisplayName>Pump line</DisplayName></Line>
    <Line name="DIO2"><TIODefaultName>Spare</TIODefaultName></Line>
    <Line name="DIO3"/>
  </Connector>
</Target>
)";

constexpr const char* kBareBoard = R"(<Target>
  <TIOItemSelectResourceDialog><Remove>yes</Remove></TIOItemSelectResourceDialog>
  <Line name="DIO0"/>
</Target>
)";

// One attribute as the properties dialog hands it back.
std::u16string Cluster(std::u16string_view name, std::u16string_view value) {
    return u"<Cluster><Name></Name><NumElts>2</NumElts><String><Name>name</Name><Val>" +
           std::u16string(name) + u"</Val></String><String><Name>value</Name><Val>" +
           std::u16string(value) + u"</Val></String></Cluster>";
}

struct Menu {
    std::vector<std::u16string> texts;
    std::vector<QxMenuEntry> entries;
};

class ItemCommandsTest : public ModuleProjectTest {
protected:
    void SetUp() override {
        Open(kBoard);
        other = AddTarget(u"U", kBareBoard);
    }

    wbhost::runner::ProgramSession& Programs() { return session.Programs(); }
    static Menu MenuOf(ProjectItem* item) {
        uint32_t count = 0;
        QxMenuEntry* entries = nullptr;
        EXPECT_EQ(As<IqxItemUI>(item)->GetContextMenu(&count, &entries), S_OK);
        Menu menu;
        for (uint32_t i = 0; i < count; ++i) {
            menu.entries.push_back(entries[i]);
            menu.texts.push_back(TakeText(entries[i].text));
        }
        CoTaskMemFree(entries);
        return menu;
    }
    static HRESULT Run(ProjectItem* item, const GUID& command) {
        return As<IqxItemUI>(item)->ExecuteCommand(command);
    }
    // The last run of BEHAVIOUR.
    ProgramRun LastRun(const std::string& behaviour) {
        const auto runs = Programs().Runs();
        const auto run = std::find_if(runs.rbegin(), runs.rend(), [&](const ProgramRun& r) {
            return r.behaviour == behaviour;
        });
        EXPECT_NE(run, runs.rend()) << "no run of " << behaviour;
        return run != runs.rend() ? *run : ProgramRun{};
    }
    size_t OpenReferences() { return session.Programs().Ledger().Counts().open; }
    // Whether REFERENCE (a runner's host reference) was made for ITEM.
    static bool RefersTo(const ProgramValue& value, ProjectItem* item) {
        const auto* reference = std::get_if<HostReference>(&value);
        return reference != nullptr && reference->value != 0 && item != nullptr;
    }

    ComPtr<ProjectItem> other;
};

TEST_F(ItemCommandsTest, TheMenuOffersWhatTheItemAndItsTargetAllow) {
    ProjectItem* bound = AddItem(u"Valve", u"/C0/DIO0");
    Menu menu = MenuOf(bound);
    ASSERT_EQ(menu.entries.size(), 1u);
    EXPECT_EQ(menu.texts[0], u"Select Resource...");
    EXPECT_EQ(menu.entries[0].flags, 14u);
    EXPECT_EQ(menu.entries[0].kind, 2u);
    EXPECT_EQ(menu.entries[0].command, tio::kSelectResourceCommand);

    // In error: the explanation comes in, placed where the host's error entries go.
    ProjectItem* missing = AddItem(u"Ghost", u"/C0/DIO9");
    menu = MenuOf(missing);
    ASSERT_EQ(menu.entries.size(), 2u);
    EXPECT_EQ(menu.entries[1].command, tio::kExplainErrorCommand);
    EXPECT_EQ(menu.entries[1].flags, 0x10Eu);
    EXPECT_EQ(menu.entries[1].group, 3u);
    EXPECT_EQ(menu.entries[1].position, 6000000u);

    // A physical item stands for fixed hardware: no other resource to choose, and it stays.
    ASSERT_EQ(As<IwbTIOInstanceItemUI>(bound)->SetPhysical(1), S_OK);
    EXPECT_TRUE(MenuOf(bound).entries.empty());
    EXPECT_EQ(As<IqxProjectItemUI>(bound)->QueryCanRemove(), S_FALSE);
    EXPECT_EQ(As<IwbProjectCutCopyPaste3>(bound)->QueryCanCut(), S_FALSE);
    EXPECT_EQ(As<IqxProjectItemUI>(missing)->QueryCanRemove(), S_OK);
    EXPECT_EQ(As<IwbProjectCutCopyPaste3>(missing)->QueryCanCut(), S_OK);

    // A target whose tree takes the dialog away takes it from every item, bound or not.
    for (const char16_t* resource : {u"/DIO0", u"/DIO7"}) {
        ProjectItem* item = AddItem(u"On U", resource, other.Get());
        for (const auto& entry : MenuOf(item).entries)
            EXPECT_NE(entry.command, tio::kSelectResourceCommand);
        ASSERT_EQ(Project().RemoveItem(*item), S_OK);
    }
    EXPECT_EQ(Run(bound, GUID_NULL), S_FALSE);
}

TEST_F(ItemCommandsTest, PropertiesShowTheAttributesButTheResourceAndApplyWhatComesBack) {
    ProjectItem* item = AddItem(u"Valve", u"/C0/DIO0");
    const std::u16string before = StoredBag(item);

    // Closed without a choice: nothing changes.
    ASSERT_EQ(As<IqxProjectItemUI>(item)->ShowProperties(), S_OK);
    ProgramRun run = LastRun("properties");
    EXPECT_TRUE(RefersTo(run.inputs.at(11), target.Get()));
    EXPECT_TRUE(RefersTo(run.inputs.at(10), item));
    EXPECT_EQ(run.inputs.at(9), ProgramValue(Strings{Cluster(u"Speed", u"fast")}));
    EXPECT_EQ(StoredBag(item), before);

    Programs().SetAnswer("properties", 0, 0);
    Programs().SetAnswer("properties", 1, Strings{Cluster(u"Speed", u"slow")});
    ASSERT_EQ(As<IqxProjectItemUI>(item)->ShowProperties(), S_OK);
    EXPECT_NE(StoredBag(item).find(u"<Value>slow</Value>"), std::u16string::npos);

    // A text the dialog hands back that cannot be read changes nothing, not even the texts
    // before it.
    Programs().SetAnswer("properties", 1, Strings{Cluster(u"Speed", u"odd"), u"<Cluster"});
    const std::u16string applied = StoredBag(item);
    EXPECT_LT(As<IqxProjectItemUI>(item)->ShowProperties(), 0);
    EXPECT_EQ(StoredBag(item), applied);

    // A dialog that hands the resource back changed has the item bound to it, never merely
    // saying so.
    Programs().SetAnswer("properties", 1, Strings{Cluster(u"resource", u"/C0/DIO1")});
    ASSERT_EQ(As<IqxProjectItemUI>(item)->ShowProperties(), S_OK);
    EXPECT_EQ(Resource(item), u"/C0/DIO1");
    EXPECT_EQ(Status(item), 0);
    EXPECT_EQ(OpenReferences(), 0u);
}

TEST_F(ItemCommandsTest, SelectingAResourceRebindsAndTheNameFollowsOnlyWhenTheResourceGaveIt) {
    ProjectItem* named = AddItem(u"Valve line", u"/C0/DIO0");
    ProjectItem* own = AddItem(u"Mine", u"/C0/DIO2");
    ProjectItem* taken = AddItem(u"Pump line", u"/C0/DIO3");
    ASSERT_EQ(Status(named), 0);

    // The same path in other case is no new choice: no rebind, no save.
    Programs().SetAnswer("select-resource", 0, 0);
    Programs().SetAnswer("select-resource", 1, std::u16string(u"/c0/dio0"));
    const size_t refreshes = named->Refreshes().size();
    ASSERT_EQ(Run(named, tio::kSelectResourceCommand), S_OK);
    EXPECT_EQ(Resource(named), u"/C0/DIO0");
    EXPECT_EQ(named->Refreshes().size(), refreshes);
    ProgramRun run = LastRun("select-resource");
    EXPECT_EQ(run.inputs.at(9), ProgramValue(std::u16string(u"/C0/DIO0")));
    QxItemInfoRecord record;
    ASSERT_EQ(named->GetInfoRecord(&record), S_OK);
    EXPECT_EQ(run.inputs.at(8), ProgramValue(qv::kern::GuidToString(record.id)));
    EXPECT_TRUE(RefersTo(run.inputs.at(11), target.Get()));

    // Named after the old line's display name: takes the new one's, made unique in the target
    // (another item carries it already).
    Programs().SetAnswer("select-resource", 1, std::u16string(u"/C0/DIO1"));
    Programs().SetAnswer("select-resource", 2, 1);
    ASSERT_EQ(Run(named, tio::kSelectResourceCommand), S_OK);
    EXPECT_EQ(Resource(named), u"/C0/DIO1");
    EXPECT_EQ(Status(named), 0);
    EXPECT_EQ(NameOf(named), u"Pump line1");
    EXPECT_EQ(named->Refreshes().back(), wbproj::kUpdateRenamed);
    EXPECT_EQ(NameOf(taken), u"Pump line");

    // A name of the user's own stays, whatever the dialog asks.
    Programs().SetAnswer("select-resource", 1, std::u16string(u"/C0/DIO0"));
    ASSERT_EQ(Run(own, tio::kSelectResourceCommand), S_OK);
    EXPECT_EQ(Resource(own), u"/C0/DIO0");
    EXPECT_EQ(NameOf(own), u"Mine");

    // Cancelled: nothing happens, whatever else it says.
    Programs().SetAnswer("select-resource", 0, 1);
    Programs().SetAnswer("select-resource", 1, std::u16string(u"/C0/DIO3"));
    ASSERT_EQ(Run(own, tio::kSelectResourceCommand), S_OK);
    EXPECT_EQ(Resource(own), u"/C0/DIO0");
    EXPECT_EQ(OpenReferences(), 0u);
    EXPECT_GE(Programs().Ledger().Counts().made, 8u);
}

TEST_F(ItemCommandsTest, HelpFallsBackTwiceAndComesOutBelowTheHostFolder) {
    const std::u16string host = qv::kern::Utf8ToWide(wbhost::runtime::HostFolder());
    auto help = [](ProjectItem* item) {
        BSTR path = nullptr, topic = nullptr, context = nullptr;
        EXPECT_EQ(As<IqxItemUI>(item)->GetHelp(&path, &topic, &context), S_OK);
        return std::array{TakeText(path), TakeText(topic), TakeText(context)};
    };
    using Help = std::array<std::u16string, 3>;
    EXPECT_EQ(help(AddItem(u"A", u"/C0/DIO0")),
              (Help{host + u"/lines/dio.chm", u"dio0.html", u"Lines"}));
    // No "Help" of its own: the tree's default resource, and the module's context.
    EXPECT_EQ(help(AddItem(u"B", u"/C0/DIO1")),
              (Help{host + u"/board.chm", u"io.html", u"Tangent I/O"}));
    // Neither: the module's own page, in the host's help folder.
    ProjectItem* plain = AddItem(u"C", u"/DIO0", other.Get());
    EXPECT_EQ(help(plain), (Help{host + u"/help/wbfpgaconcepts.chm", u"Performing_Basic_I_O.html",
                                 u"Tangent I/O"}));
    BSTR file = nullptr, topic = nullptr;
    uint32_t kind = 0;
    ASSERT_EQ(As<IqxItemUI>(plain)->GetDefaultHelp(&file, &topic, &kind), S_OK);
    EXPECT_EQ(TakeText(file), u"wbfpgaconcepts.chm");
    EXPECT_EQ(TakeText(topic), u"Performing_Basic_I_O.html");
    EXPECT_EQ(kind, 5u);
}

TEST_F(ItemCommandsTest, APhysicalItemIsDroppedOnlyWithinItsTargetAndTheDropProgramGetsItsPlace) {
    ProjectItem* folder = AddFolder(u"Pumps");
    ProjectItem* item = AddItem(u"Valve", u"/C0/DIO0", folder);
    const auto drag = Make<wbhost::project::DragDataImpl>(
        std::vector<ComPtr<IwbProjectItem>>{ComPtr<IwbProjectItem>::Share(item)});
    const auto dragDrop = As<IwbProjectDragDrop>(item);
    EXPECT_EQ(dragDrop->DropAllowed(drag.Get(), other.Get()), S_OK);
    EXPECT_EQ(dragDrop->DropAllowed(nullptr, target.Get()), S_FALSE);
    EXPECT_EQ(dragDrop->DropAllowed(drag.Get(), &Project().Root()), S_FALSE);

    ASSERT_EQ(As<IwbTIOInstanceItemUI>(item)->SetPhysical(1), S_OK);
    EXPECT_EQ(dragDrop->DropAllowed(drag.Get(), other.Get()), S_FALSE);
    EXPECT_EQ(dragDrop->DropAllowed(drag.Get(), target.Get()), S_OK);

    uint32_t effect = 0;
    ASSERT_EQ(dragDrop->Drop(5, 7, 3, 0, 0x2, &effect), S_OK);
    EXPECT_EQ(effect, 1u);
    const ProgramRun run = LastRun("drag-and-drop");
    EXPECT_EQ(run.inputs.at(0), ProgramValue(3));
    EXPECT_EQ(run.inputs.at(5), ProgramValue(5));
    EXPECT_EQ(run.inputs.at(7), ProgramValue(7));
    GUID targetType{}, folderType{};
    target->GetTypeGuid(&targetType);
    folder->GetTypeGuid(&folderType);
    EXPECT_EQ(run.inputs.at(11),
              ProgramValue(u"T." + qv::kern::GuidToString(targetType) + u">>Pumps." +
                           qv::kern::GuidToString(folderType) + u">>Valve." +
                           qv::kern::GuidToString(tio::kIOItemType)));
    // Not the program's: the item declines, or refuses what it cannot do.
    EXPECT_EQ(dragDrop->Drop(0, 0, 0, 0, 0x4, &effect), S_FALSE);
    EXPECT_EQ(effect, 2u);
    EXPECT_EQ(dragDrop->Drop(0, 0, 0, 1, 0x4, &effect), E_FAIL);
    EXPECT_EQ(dragDrop->Drop(0, 0, 0, 0, 0, &effect), S_FALSE);
    EXPECT_EQ(effect, 4u);

    // Dropped out of its folder: it binds where it now is, holding its line still (a second
    // reservation of its own would put it in conflict with itself).
    ASSERT_EQ(Project().MoveItem(*item, *target.Get()), S_OK);
    EXPECT_EQ(As<IwbProjectDragDropped>(item)->Dropped(), S_OK);
    EXPECT_EQ(Status(item), 0);
    EXPECT_EQ(OpenReferences(), 0u);
}

TEST_F(ItemCommandsTest, FailingRunnerStepsComeBackAsStatusesWithTheItemUnchanged) {
    ProjectItem* item = AddItem(u"Valve line", u"/C0/DIO0");
    Programs().SetAnswer("select-resource", 0, 0);
    Programs().SetAnswer("select-resource", 1, std::u16string(u"/C0/DIO1"));
    Programs().SetAnswer("select-resource", 2, 1);
    Programs().SetAnswer("properties", 0, 0);
    Programs().SetAnswer("properties", 1, Strings{Cluster(u"Speed", u"slow")});
    const std::u16string bag = StoredBag(item);
    for (const RunnerStep step : {RunnerStep::Reference, RunnerStep::Open, RunnerStep::Input,
                                  RunnerStep::Run, RunnerStep::Output}) {
        Programs().Ledger().Fail(step, E_ACCESSDENIED);
        EXPECT_EQ(Run(item, tio::kSelectResourceCommand), E_ACCESSDENIED);
        EXPECT_EQ(As<IqxProjectItemUI>(item)->ShowProperties(), E_ACCESSDENIED);
        // The explanation hands the program no reference.
        EXPECT_EQ(Run(item, tio::kExplainErrorCommand),
                  step == RunnerStep::Reference ? S_OK : E_ACCESSDENIED);
        Programs().Ledger().ClearFailures();
        EXPECT_EQ(Resource(item), u"/C0/DIO0");
        EXPECT_EQ(NameOf(item), u"Valve line");
        EXPECT_EQ(StoredBag(item), bag);
        EXPECT_EQ(OpenReferences(), 0u) << static_cast<int>(step);
    }
    EXPECT_EQ(Run(item, tio::kSelectResourceCommand), S_OK);
    EXPECT_EQ(NameOf(item), u"Pump line");
}

} // namespace
