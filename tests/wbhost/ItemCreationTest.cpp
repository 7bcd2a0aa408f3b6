// Creating Tangent I/O items through the real module, as the host's project tree does (the
// provider's wizard) and as host programs do (TIO_CreateMultiple), in the embedded host.
#include "ProjectTestSupport.h"
#include "cli/AttributeSet.h"
#include "cli/HostStringList.h"
#include "cli/HostText.h"
#include "runtime/RefnumTable.h"
#include "session/NewItemWizard.h"

#include <gtest/gtest.h>

using namespace projecttest;
using qv::com::ComPtr;
using wbhost::cli::NewItemAttributeSet;

namespace {

constexpr const char* kBoard = R"(<Target>
  <TIOItemTypeName>Board I/O</TIOItemTypeName>
  <TIOItemIconName>Board.png</TIOItemIconName>
  <Connector name="C0">
    <Line name="DIO0"/><Line name="DIO1"><HiddenTIO>True</HiddenTIO></Line>
    <Line name="DIO2"/><Line name="DIO3"/><Line name="DIO4"><HiddenTIO>yes</HiddenTIO></Line>
  </Connector>
</Target>
)";

using CreateMultipleFn = int32_t(const WBRefNum*, WBHandle*);

// A name taken where the new item or one of its folders would go.
constexpr int32_t kNameTaken = static_cast<int32_t>(0x800700B7);

class ItemCreationTest : public ModuleProjectTest {
protected:
    void SetUp() override {
        Open(kBoard);
        createMultiple = Export<CreateMultipleFn>("TIO_CreateMultiple");
        ASSERT_NE(createMultiple, nullptr);
    }

    // TIO_CreateMultiple below the item PARENT with one definition per (name, resource).
    int32_t CreateMultiple(ProjectItem& parent,
                           const std::vector<std::pair<std::u16string, std::u16string>>& items) {
        std::vector<std::string> texts;
        for (const auto& [name, resource] : items)
            texts.push_back(
                wbhost::cli::ToHostText(wbhost::cli::ToUtf8(NewItemAttributeSet(name, resource))));
        return CreateMultipleTexts(parent, texts);
    }
    int32_t CreateMultipleTexts(ProjectItem& parent, const std::vector<std::string>& texts) {
        wbhost::cli::HostStringList definitions(texts);
        auto& refnums = wbhost::runtime::RefnumTable::Instance();
        const WBRefNum refnum = refnums.Add(parent.Object());
        const int32_t status = createMultiple(&refnum, &definitions.Handle());
        refnums.Remove(refnum);
        return status;
    }

    static bool Shown(ProjectItem* item) { return (item->Flags() & wbproj::kShownFlag) != 0; }

    CreateMultipleFn* createMultiple = nullptr;
};

TEST_F(ItemCreationTest,
       CreateMultipleMakesFoldersOnceKeepsEscapedSlashesHidesAsTheTreeSaysOrFailsEmpty) {
    WBRefNum refnum = wbhost::runtime::RefnumTable::Instance().Add(target->Object());
    wbhost::cli::HostStringList none({});
    EXPECT_EQ(createMultiple(&refnum, &none.Handle()), E_FAIL);
    WBHandle null = nullptr;
    EXPECT_EQ(createMultiple(&refnum, &null), E_FAIL);
    EXPECT_EQ(createMultiple(&refnum, nullptr), E_FAIL);
    wbhost::runtime::RefnumTable::Instance().Remove(refnum);
    wbhost::cli::HostStringList one({"<AttributeSet name=\"\"/>"});
    const WBRefNum unknown = 0xFFFFFFF0u;
    EXPECT_EQ(createMultiple(&unknown, &one.Handle()), E_INVALIDARG);
    // A tree's refnum is no project item.
    const WBRefNum tree = Target().Target().refnum;
    EXPECT_EQ(createMultiple(&tree, &one.Handle()), E_NOINTERFACE);
    EXPECT_TRUE(target->Children().empty());
    // Definitions make their folders once, keep escaped slashes and hide as the tree says.
    ASSERT_EQ(CreateMultiple(*target.Get(), {{u"A/B/Valve", u"/C0/DIO0"},
                                             {u"a/B/Pump", u"/C0/DIO2"},
                                             {u"Pump\\/Valve", u"/C0/DIO3"},
                                             {u"Hidden", u"/C0/DIO1"},
                                             {u"Shown", u"/C0/DIO4"}}),
              S_OK);
    // The folders are made once and found again whatever the case of a later name.
    ASSERT_EQ(target->Children().size(), 4u);
    ProjectItem* b = At({u"A", u"B"});
    ASSERT_NE(b, nullptr);
    EXPECT_TRUE(IsEqualGUID(b->Type(), wbproj::kFolderType));
    EXPECT_EQ(At({u"A"})->Children().size(), 1u);
    ASSERT_EQ(b->Children().size(), 2u);
    for (ProjectItem* item : {At({u"A", u"B", u"Valve"}), At({u"A", u"B", u"Pump"}),
                              At({u"Pump/Valve"}), At({u"Hidden"})})
        ASSERT_TRUE(item && IsEqualGUID(item->Type(), tio::kIOItemType) && Status(item) == 0);
    // "True" in any case hides the item; other texts ("yes") do not.
    EXPECT_FALSE(Shown(At({u"Hidden"})));
    EXPECT_TRUE(Shown(At({u"Shown"})));
    EXPECT_TRUE(Shown(At({u"Pump/Valve"})));
    // The items reached the target while its change handling was suspended, and it is back.
    EXPECT_GT(Target().SuspendedChanges(), 0);
    EXPECT_FALSE(Target().Suspended());

    // A folder's refnum takes items below the folder; a name taken there is refused.
    EXPECT_EQ(CreateMultiple(*b, {{u"Deeper", u"/C0/DIO4"}}), S_OK);
    EXPECT_NE(At({u"A", u"B", u"Deeper"}), nullptr);
    EXPECT_EQ(CreateMultiple(*b, {{u"VALVE", u"/C0/DIO4"}}), kNameTaken);
    // A folder part naming an item that is no folder is refused rather than filled.
    EXPECT_EQ(CreateMultiple(*target.Get(), {{u"Hidden/X", u"/C0/DIO4"}}), kNameTaken);
    EXPECT_EQ(At({u"Hidden"})->Children().size(), 0u);
}

TEST_F(ItemCreationTest, AFailingCreationKeepsTheItemsBeforeItAndTheTargetsChangeHandling) {
    const auto text = [](std::u16string name, std::u16string resource) {
        return wbhost::cli::ToHostText(
            wbhost::cli::ToUtf8(NewItemAttributeSet(std::move(name), std::move(resource))));
    };
    EXPECT_EQ(CreateMultipleTexts(*target.Get(),
                                  {text(u"One", u"/C0/DIO0"), text(u"Two", u"/C0/DIO2"),
                                   "<AttributeSet name=\"\">", text(u"Four", u"/C0/DIO3")}),
              E_FAIL);
    EXPECT_NE(At({u"One"}), nullptr);
    EXPECT_NE(At({u"Two"}), nullptr);
    EXPECT_EQ(target->Children().size(), 2u);
    EXPECT_FALSE(Target().Suspended());
    // A target that was suspended already stays so: the previous setting comes back.
    int32_t previous = -1;
    ASSERT_EQ(Target().SuspendChangeHandling(1, &previous), S_OK);
    EXPECT_EQ(
        CreateMultipleTexts(*target.Get(), {text(u"Five", u"/C0/DIO3"), text(u"", u"/C0/DIO4")}),
        E_INVALIDARG);
    EXPECT_NE(At({u"Five"}), nullptr);
    EXPECT_TRUE(Target().Suspended());
    Target().RestoreChangeHandling(previous);

    // The wizard's creations end the same way.
    auto& programs = session.Programs();
    programs.SetAnswer("new-item-wizard", 0, int32_t{0});
    programs.SetAnswer("new-item-wizard", 3,
                       std::vector<std::u16string>{NewItemAttributeSet(u"Six", u"/C0/DIO4"),
                                                   NewItemAttributeSet(u"one", u"/C0/DIO1")});
    EXPECT_EQ(wbhost::session::RunNewItemWizard(session, *target.Get()).status, kNameTaken);
    EXPECT_NE(At({u"Six"}), nullptr);
    EXPECT_FALSE(Target().Suspended());
}

TEST_F(ItemCreationTest, TheWizardOffersTheTargetsTypeAndCreatesWhatItsProgramAnswers) {
    auto& programs = session.Programs();
    // Closed without a choice: nothing is created, and that is no failure.
    programs.SetAnswer("new-item-wizard", 1, int32_t{7});
    const auto cancelled = wbhost::session::RunNewItemWizard(session, *target.Get());
    EXPECT_EQ(cancelled.status, S_OK);
    EXPECT_TRUE(cancelled.cancelled);
    EXPECT_EQ(cancelled.offered, u"Board I/O");
    EXPECT_TRUE(target->Children().empty());
    ASSERT_FALSE(programs.Icons().empty());
    EXPECT_EQ(programs.Icons().back(), u"Board.png");

    programs.SetAnswer("new-item-wizard", 0, int32_t{0});
    programs.SetAnswer("new-item-wizard", 1, int32_t{3});
    programs.SetAnswer("new-item-wizard", 3,
                       std::vector<std::u16string>{NewItemAttributeSet(u"In/Valve", u"/C0/DIO0")});
    const auto made = wbhost::session::RunNewItemWizard(session, *target.Get());
    ASSERT_EQ(made.status, S_OK);
    EXPECT_FALSE(made.cancelled);
    ProjectItem* valve = At({u"In", u"Valve"});
    ASSERT_NE(valve, nullptr);
    EXPECT_EQ(Status(valve), 0);
    // The program was handed the target and the choice the previous run left.
    const auto run = programs.Runs().back();
    EXPECT_EQ(std::get<int32_t>(run.inputs.at(1)), 7);
    EXPECT_TRUE(std::holds_alternative<wbhost::runner::HostReference>(run.inputs.at(11)));
    // The reference made for the program is given back after the run.
    const auto reference = std::get<wbhost::runner::HostReference>(run.inputs.at(11)).value;
    ComPtr<IUnknown> gone;
    EXPECT_EQ(wbhost::runtime::RefnumTable::Instance().Query(static_cast<WBRefNum>(reference),
                                                             IUnknown::iid, gone.PutVoid()),
              E_INVALIDARG);

    // Bound to a folder, the wizard creates below it and still offers the target's type.
    ProjectItem* folder = At({u"In"});
    programs.SetAnswer("new-item-wizard", 3,
                       std::vector<std::u16string>{NewItemAttributeSet(u"Pump", u"/C0/DIO2")});
    const auto below = wbhost::session::RunNewItemWizard(session, *folder);
    EXPECT_EQ(below.status, S_OK);
    EXPECT_EQ(below.offered, u"Board I/O");
    EXPECT_NE(At({u"In", u"Pump"}), nullptr);
    EXPECT_EQ(std::get<int32_t>(programs.Runs().back().inputs.at(1)), 3);
}

} // namespace
