// What a Tangent I/O item does about its name scope and its target, asked in process so that
// the host's program log and injected failures can be looked at: unique names through the host's
// unique-name program, and a move whose rebinding fails.
#include "ProjectTestSupport.h"

#include <gtest/gtest.h>

using qv::com::ComPtr;

namespace {

constexpr const char* kBoard = R"(<Target>
  <Line name="DIO0"/>
  <Line name="DIO1"/>
</Target>
)";

class ItemScopeTest : public projecttest::ModuleProjectTest {
protected:
    void SetUp() override {
        Open(kBoard);
        u = AddTarget(u"U", kBoard);
    }
    // What ITEM's object makes of PROPOSED.
    std::u16string Unique(ProjectItem* item, const char16_t* proposed) {
        BSTR unique = nullptr;
        EXPECT_EQ(qv::com::QueryAs<IwbTIOItemUIPrivate>(item->Object())
                      ->GenerateUniqueName(proposed, &unique),
                  S_OK);
        return projecttest::TakeText(unique);
    }

    ComPtr<ProjectItem> u;
};

TEST_F(ItemScopeTest, UniqueNamesAskTheHostOnlyForATakenName) {
    ProjectItem* pump = AddItem(u"Pump", u"/DIO0");
    AddItem(u"pump1", u"/DIO1", AddFolder(u"F"));
    ProjectItem* other = AddItem(u"Valve", u"/DIO0", u.Get());

    EXPECT_EQ(Unique(other, u"Pump"), u"Pump"); // another scope: free, the program not run
    EXPECT_TRUE(session.Programs().Runs().empty());
    // Taken in the target (in a folder, in another case): the program gets every name there.
    EXPECT_EQ(Unique(pump, u"PUMP"), u"PUMP2");
    const auto runs = session.Programs().Runs();
    ASSERT_EQ(runs.size(), 1u);
    EXPECT_EQ(runs[0].behaviour, "unique-name");
    EXPECT_EQ(std::get<std::u16string>(runs[0].inputs.at(0)), u"PUMP");
    EXPECT_EQ(std::get<std::vector<std::u16string>>(runs[0].inputs.at(1)),
              (std::vector<std::u16string>{u"Pump", u"pump1"}));
}

TEST_F(ItemScopeTest, AMoveWhoseBindingFailsAnswersTheStatusAndKeepsWhatWasStored) {
    ProjectItem* pump = AddItem(u"Pump", u"/DIO0");
    AddItem(u"Valve", u"/DIO0", u.Get()); // U's DIO0 is held: the moved item's status would change
    const auto stored = pump->Bag().Properties();
    const HRESULT diskFull = static_cast<HRESULT>(0x80070070);
    pump->Bag().FailWrites(diskFull);
    EXPECT_EQ(Project().MoveItem(*pump, *u.Get()), diskFull);
    EXPECT_EQ(pump->Bag().Properties(), stored);
}

} // namespace
