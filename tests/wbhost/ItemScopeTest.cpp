// What a Tangent I/O item does about its name scope and its target, asked in process so that
// the host's program log and injected failures can be looked at: unique names through the host's
// unique-name program, and a move whose rebinding fails.
#include "ProjectTestSupport.h"
#include "items/TIOItemInterfaces.h"
#include "provider/TIOIdentifiers.h"
#include "session/HostSession.h"

#include <gtest/gtest.h>

using qv::com::ComPtr;
using wbhost::project::ProjectItem;
using wbhost::project::Property;

namespace {

constexpr const char* kBoard = R"(<Target>
  <Line name="DIO0"/>
  <Line name="DIO1"/>
</Target>
)";

class ItemScopeTest : public ::testing::Test {
protected:
    void SetUp() override {
        std::string error;
        ASSERT_TRUE(session.Open(WBT_MODULE_PATH, &error)) << error;
        ASSERT_TRUE(session.NewProject(u"P", &error)) << error;
        const std::string file = scratch.Write("t.xml", kBoard);
        t = session.Project()->AddTarget(u"T", file, &error);
        u = session.Project()->AddTarget(u"U", file, &error);
        ASSERT_TRUE(t && u) << error;
    }
    ProjectItem* Add(ProjectItem& parent, std::u16string name, std::u16string_view resource) {
        const std::u16string bag = u"<AttributeSet name=\"\">\n<Attribute name=\"resource\">\n"
                                   u"<Value>" +
                                   std::u16string(resource) +
                                   u"</Value>\n</Attribute>\n</AttributeSet>\n";
        ComPtr<ProjectItem> made;
        EXPECT_EQ(session.Project()->CreateItem(
                      parent, tio::kIOItemType, std::move(name),
                      {{u"tioAttrBag", Property{Property::Kind::String, bag, 0}}}, &made),
                  S_OK);
        return made.Get();
    }
    // What ITEM's object makes of PROPOSED.
    std::u16string Unique(ProjectItem* item, const char16_t* proposed) {
        BSTR unique = nullptr;
        EXPECT_EQ(qv::com::QueryAs<IwbTIOItemUIPrivate>(item->Object())
                      ->GenerateUniqueName(proposed, &unique),
                  S_OK);
        const qv::com::UniqueBstr held(unique);
        return qv::com::BstrToString(unique);
    }

    projecttest::ScratchFolder scratch;
    wbhost::session::HostSession session;
    ComPtr<ProjectItem> t;
    ComPtr<ProjectItem> u;
};

TEST_F(ItemScopeTest, UniqueNamesAskTheHostOnlyForATakenName) {
    ProjectItem* pump = Add(*t.Get(), u"Pump", u"/DIO0");
    ASSERT_EQ(t->CreateChild(wbproj::kFolderType, u"F", nullptr), S_OK);
    Add(*t->Children().back().Get(), u"pump1", u"/DIO1");
    ProjectItem* other = Add(*u.Get(), u"Valve", u"/DIO0");

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
    ProjectItem* pump = Add(*t.Get(), u"Pump", u"/DIO0");
    Add(*u.Get(), u"Valve", u"/DIO0"); // U's DIO0 is held: the moved item's status would change
    const auto stored = pump->Bag().Properties();
    const HRESULT diskFull = static_cast<HRESULT>(0x80070070);
    pump->Bag().FailWrites(diskFull);
    EXPECT_EQ(session.Project()->MoveItem(*pump, *u.Get()), diskFull);
    EXPECT_EQ(pump->Bag().Properties(), stored);
}

} // namespace
