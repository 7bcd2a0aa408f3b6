// The Tangent I/O item in the embedded host: the real module's items bound to a real target's
// tree, following its renames, removals and signature changes, saved and reopened; unique names
// through the host's unique-name program, and a move whose rebinding fails.
#include "ProjectTestSupport.h"
#include "framework/IqxItemUI.h"
#include "framework/IwbCompileConfiguration.h"

#include <gtest/gtest.h>

using namespace projecttest;
using qv::com::ComPtr;

namespace {

constexpr const char* kBoard = R"(<Target>
  <TIOItemIconName>Board.png</TIOItemIconName>
  <Connector name="C0">
    <Line name="DIO0">
      <MethodSet>
        <Method name="Read"><Signature>bool read()</Signature><Kind>sync</Kind>
          <ReturnValue><Type>Boolean</Type></ReturnValue></Method>
        <Method name="Write"><Signature>void write(bool)</Signature>
          <ParameterList><Value name="Value"><Type>Boolean</Type></Value></ParameterList></Method>
        <Method name="Flush"><Kind>async</Kind></Method>
      </MethodSet>
      <PropertySet><Property name="Mode"><Signature>enum mode</Signature></Property></PropertySet>
      <AttributeSet>
        <Attribute name="Speed"><Value> fast </Value></Attribute>
        <Attribute name="Note"><Value>x</Value><DoesNotAffectCompilation>Yes</DoesNotAffectCompilation></Attribute>
        <Attribute name="Kept"><Value>k</Value><DoesNotAffectCompilation>false</DoesNotAffectCompilation></Attribute>
      </AttributeSet>
    </Line>
    <Line name="DIO1"><HiddenTIO>TRUE</HiddenTIO><TIOItemIconName>Line.png</TIOItemIconName></Line>
    <Line name="DIO2"/>
  </Connector>
</Target>
)";

class ItemBindingTest : public ModuleProjectTest {
protected:
    void SetUp() override { Open(kBoard); }

    static int32_t Version(ProjectItem* item) { return Int(item, u"tioFeatureSetVersion", 0); }
    static std::u16string Config(IUnknown* object) {
        BSTR text = nullptr;
        EXPECT_EQ(qv::com::QueryAs<IwbCompileConfiguration>(object)->GetCompileConfiguration(&text),
                  S_OK);
        return TakeText(text);
    }
    static std::u16string Icon(ProjectItem* item) {
        BSTR name = nullptr;
        As<IqxItemUI>(item)->GetIconName(&name);
        return TakeText(name);
    }
    size_t OwnerHeard() { return Target().Changed().size(); }
};

TEST_F(ItemBindingTest, AnItemFollowsItsResourceThroughRenamesRemovalAndReturn) {
    ProjectItem* item = AddItem(u"Valve", u"/C0/DIO0");
    EXPECT_EQ(Status(item), 0);
    EXPECT_EQ(Resource(item), u"/C0/DIO0");
    // The definitions arrived with their defaults; the stored bag says so.
    EXPECT_NE(StoredBag(item).find(u"<Value>fast</Value>"), std::u16string::npos);

    // Renaming the node and an ancestor both move "resource", and the bag is saved each time
    // with the owner told.
    const size_t heard = OwnerHeard();
    ASSERT_EQ(Tree().Rename(Node(u"/C0/DIO0"), u"Valve0"), S_OK);
    EXPECT_EQ(Resource(item), u"/C0/Valve0");
    ASSERT_EQ(Tree().Rename(Node(u"/C0"), u"Front"), S_OK);
    EXPECT_EQ(Resource(item), u"/Front/Valve0");
    EXPECT_NE(StoredBag(item).find(u"/Front/Valve0"), std::u16string::npos);
    EXPECT_EQ(OwnerHeard(), heard + 2);
    EXPECT_EQ(Status(item), 0);

    // The whole connector goes: missing, and watching for the resource to come back.
    ASSERT_EQ(Tree().RemoveChild(Tree().Root(), u"Front"), S_OK);
    EXPECT_EQ(Status(item), 1);
    EXPECT_EQ(As<IqxItemUI>(item)->IsValid(), S_FALSE);
    ASSERT_EQ(Tree().InsertSubTree(
                  Tree().Root(), u"<Connector name=\"Front\"><Line name=\"Valve0\"/></Connector>"),
              S_OK);
    EXPECT_EQ(Status(item), 0);
    EXPECT_EQ(Tree().QueryReservation(Node(u"/Front/Valve0"), item), S_OK);
}

TEST_F(ItemBindingTest, ASecondItemOnOneResourceIsInConflictUntilTheFirstIsRemoved) {
    ProjectItem* first = AddItem(u"A", u"/C0/DIO2");
    ProjectItem* second = AddItem(u"B", u"/C0/DIO2");
    EXPECT_EQ(Status(first), 0);
    EXPECT_EQ(Status(second), 2);
    EXPECT_EQ(As<IwbTIOItemError>(second)->HasError(), S_OK);

    const ComPtr<IUnknown> removed = ComPtr<IUnknown>::Share(first->Object());
    const size_t heard = OwnerHeard();
    ASSERT_EQ(Project().RemoveItem(*first), S_OK);
    EXPECT_EQ(Status(second), 0);
    EXPECT_EQ(OwnerHeard(), heard + 1);
    // An item on its way out compiles to nothing and watches nothing any more.
    EXPECT_EQ(Config(removed.Get()), u"");
    ASSERT_EQ(Tree().Rename(Node(u"/C0/DIO2"), u"DIO9"), S_OK);
    EXPECT_EQ(Resource(second), u"/C0/DIO9");
}

TEST_F(ItemBindingTest, SignatureChangesCountOncePerRealChange) {
    ProjectItem* item = AddItem(u"A", u"/C0/DIO0");
    ASSERT_EQ(Version(item), 0);
    auto& read = Node(u"/C0/DIO0/MethodSet/Read");
    ASSERT_EQ(Tree().SetAttribute(read, u"Signature", u"int read()"), S_OK);
    EXPECT_EQ(Version(item), 1);
    // The same signature in other case, or a method without one, is no change.
    ASSERT_EQ(Tree().SetAttribute(read, u"Signature", u"INT READ()"), S_OK);
    ASSERT_EQ(Tree().SetAttribute(Node(u"/C0/DIO0/MethodSet/Flush"), u"Kind", u"sync"), S_OK);
    EXPECT_EQ(Version(item), 1);
    // A new method counts, and is watched from then on.
    ASSERT_EQ(Tree().InsertSubTree(Node(u"/C0/DIO0/MethodSet"),
                                   u"<Method name=\"Reset\"><Signature>void reset()</Signature>"
                                   u"</Method>"),
              S_OK);
    EXPECT_EQ(Version(item), 2);
    ASSERT_EQ(Tree().SetAttribute(Node(u"/C0/DIO0/MethodSet/Reset"), u"Signature", u"void r(int)"),
              S_OK);
    EXPECT_EQ(Version(item), 3);
}

TEST_F(ItemBindingTest, TheCompileConfigurationSpellsOutWhatCompiledCodeDependsOn) {
    ProjectItem* item = AddItem(u"A", u"/C0/DIO0");
    // Attributes in name order ("Note" does not affect compilation, "Kept" does), trimmed; the
    // status; the signed members with their other attributes; the method types.
    EXPECT_EQ(Config(item->Object()), u"Kept=k;resource=/C0/DIO0;Speed=fast;0"
                                      u";<Method name=\"Read\"><Kind>sync</Kind></Method>"
                                      u";<Method name=\"Write\"></Method>"
                                      u";<Property name=\"Mode\"></Property>"
                                      u";ReadMethodType=Boolean;WriteMethodType=Boolean");
    EXPECT_EQ(Icon(item), u"Board.png");

    // A resource marked "HiddenTIO" in capitals hides its item, for good.
    ProjectItem* hidden = AddItem(u"H", u"/C0/DIO1");
    EXPECT_EQ(hidden->Flags() & wbproj::kShownFlag, 0u);
    EXPECT_EQ(Icon(hidden), u"Line.png");
    hidden->SetFlags(hidden->Flags() | wbproj::kShownFlag);
    ASSERT_EQ(Tree().SetAttribute(Node(u"/C0/DIO1"), u"HiddenTIO", u"false"), S_OK);
    ASSERT_EQ(As<IwbhwResourceItemUI2>(hidden)->Rebind(), S_OK);
    EXPECT_EQ(hidden->Flags() & wbproj::kShownFlag, 0u);
}

TEST_F(ItemBindingTest, AnItemWithoutABagIsMissingAndAnUnchangedBagIsNotWrittenAgain) {
    ProjectItem* bare = AddItem(u"Bare", nullptr);
    EXPECT_EQ(Status(bare), 1);
    EXPECT_EQ(Resource(bare), u"");
    EXPECT_NE(StoredBag(bare).find(u"name=\"resource\""), std::u16string::npos);

    ProjectItem* item = AddItem(u"A", u"/C0/DIO0");
    const size_t heard = OwnerHeard();
    const std::u16string stored = StoredBag(item);
    const char16_t* same[] = {u"<Cluster><Name></Name><NumElts>2</NumElts>"
                              u"<String><Name>name</Name><Val>Speed</Val></String>"
                              u"<String><Name>value</Name><Val>FAST</Val></String></Cluster>"};
    ASSERT_EQ(As<IwbTIOItemUIPrivate>(item)->SetAttributes(1, same), S_OK);
    EXPECT_EQ(StoredBag(item), stored);
    EXPECT_EQ(OwnerHeard(), heard);
}

TEST_F(ItemBindingTest, AReopenedProjectBindsEveryItemBackAndKeepsOneThatCannotBind) {
    ProjectItem* folder = AddFolder(u"Sub");
    AddItem(u"A", u"/C0/DIO2");
    AddItem(u"B", u"/C0/DIO2", folder);
    ProjectItem* broken = AddItem(u"C", u"/C0/DIO0");
    // A bag that no longer reads (as another tool might have left it).
    broken->Bag().Put(u"tioAttrBag", Property{Property::Kind::String, u"<AttributeSet", 0});
    std::string error;
    const std::string file = scratch.File("p.wbproj");
    ASSERT_TRUE(session.Save(file, &error)) << error;
    const std::string saved = wbhost::project::FormatProject(Project().Snapshot());

    ASSERT_TRUE(session.OpenProject(file, &error)) << error;
    ProjectItem* reopened = Project().Targets().front().Get();
    EXPECT_EQ(Status(At({u"A"}, reopened)), 0);
    EXPECT_EQ(Status(At({u"Sub", u"B"}, reopened)), 2);
    ProjectItem* kept = At({u"C"}, reopened);
    ASSERT_NE(kept, nullptr);
    EXPECT_TRUE(FAILED(kept->BindStatus()));
    EXPECT_EQ(StoredBag(kept), u"<AttributeSet");
    EXPECT_EQ(wbhost::project::FormatProject(Project().Snapshot()), saved);
}

TEST_F(ItemBindingTest, FailingHostCallsComeBackAsStatusesAndLoseNothing) {
    // A reservation the host cannot make refuses the new item: nothing of it stays behind.
    Tree().FailReservations(E_ACCESSDENIED);
    ComPtr<ProjectItem> refused;
    EXPECT_EQ(Project().CreateItem(
                  *target.Get(), tio::kIOItemType, u"A",
                  {{u"tioAttrBag", Property{Property::Kind::String, ItemBag(u"/C0/DIO0"), 0}}},
                  &refused),
              E_ACCESSDENIED);
    EXPECT_TRUE(target->Children().empty());
    EXPECT_TRUE(Tree().ReservingItems(Node(u"/C0/DIO0"), nullptr).empty());
    Tree().FailReservations(S_OK);

    // Properties that cannot be written: the rename is answered with the failure, the stored
    // bag stays as it was, and the change in memory is written with the next one.
    ProjectItem* item = AddItem(u"A", u"/C0/DIO0");
    const std::u16string stored = StoredBag(item);
    item->Bag().FailWrites(E_OUTOFMEMORY);
    ASSERT_EQ(Tree().Rename(Node(u"/C0/DIO0"), u"DIO7"), S_OK);
    EXPECT_EQ(StoredBag(item), stored);
    EXPECT_EQ(As<IwbhwResourceItemUI2>(item)->SetResource(u"/C0/DIO7"), E_OUTOFMEMORY);
    item->Bag().FailWrites(S_OK);
    ASSERT_EQ(As<IwbhwResourceItemUI2>(item)->Rebind(), S_OK);
    EXPECT_NE(StoredBag(item).find(u"/C0/DIO7"), std::u16string::npos);
    EXPECT_EQ(Status(item), 0);
}

// Two targets of two lines each, for name scopes and moves.
constexpr const char* kScopeBoard = R"(<Target>
  <Line name="DIO0"/>
  <Line name="DIO1"/>
</Target>
)";

class ItemScopeTest : public projecttest::ModuleProjectTest {
protected:
    void SetUp() override {
        Open(kScopeBoard);
        u = AddTarget(u"U", kScopeBoard);
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
