// The host resource tree: which nodes hear which change bits when the tree is edited, finding
// nodes by path through the node interface, and the target's hardware object (which resources fit
// an I/O interface under a protocol filter).
#include "TestObjects.h"
#include "com/TaskMem.h"
#include "host/contracts/IwbhwResourceTreeAccess.h"
#include "resources/ResourceService.h"
#include "resources/TargetHardware.h"

#include <gtest/gtest.h>

namespace {

using qv::com::ComPtr;
using test::Heard;
using test::TakeText;
using wbhost::resources::ResourceService;
using wbhost::resources::ResourceTree;

constexpr uint32_t kAll = 0xFFFFFFFFu;

const char16_t* const kBoard = uR"(<Target name="Board">
  <Connector name="C0">
    <DigitalLine name="DIO0"><Line>0</Line><Pins><Pin name="P1"/></Pins></DigitalLine>
    <DigitalLine name="DIO1"><Line>1</Line></DigitalLine>
  </Connector>
  <DigitalLine name="A/B"><Line>slash</Line></DigitalLine>
  <:Link name="Clock">C0/DIO0</:Link>
</Target>)";

class ResourceTreeTest : public ::testing::Test {
protected:
    void SetUp() override {
        target_ = service_.LoadTargetText(kBoard);
        ASSERT_NE(target_, nullptr);
        ASSERT_TRUE(target_->problems.empty());
        tree_ = target_->tree.get();
    }
    wbhw::ResTreeNode& At(std::u16string_view path) {
        wbhw::ResTreeNode* node = tree_->Find(path);
        EXPECT_NE(node, nullptr) << std::string(path.begin(), path.end());
        return *node;
    }
    ComPtr<IwbhwResourceTreeNode> Object(std::u16string_view path) {
        ComPtr<IwbhwResourceTreeNode> object;
        EXPECT_EQ(tree_->NodeObject(&At(path), object.Put()), S_OK);
        return object;
    }
    // FindNode from the root: the status, the matched length and the found node's path.
    struct Answer {
        HRESULT status;
        uint32_t matched;
        std::u16string path;
        bool operator==(const Answer&) const = default;
    };
    Answer Find(const char16_t* path) {
        Answer answer{E_FAIL, 12345, u""};
        ComPtr<IwbhwResourceTreeNode> node;
        answer.status = Object(u"")->FindNode(path, &answer.matched, node.Put());
        BSTR text = nullptr;
        if (node)
            node->GetPath(&text);
        answer.path = TakeText(text);
        return answer;
    }
    // Registers OBSERVER on the node at each path with the mask and kind given.
    void Watch(test::RecordingObserver* observer, std::initializer_list<std::u16string_view> paths,
               uint32_t mask = kAll, uint32_t kind = 7) {
        for (auto path : paths)
            ASSERT_EQ(Object(path)->AddObserver(observer, mask, kind), S_OK);
    }

    ResourceService service_;
    wbhost::resources::Target* target_ = nullptr;
    ResourceTree* tree_ = nullptr;
};

TEST_F(ResourceTreeTest, RenameTellsTheNodeItsParentAndEveryDescendantUnlessAmbiguous) {
    auto observer = test::NewObserver();
    Watch(observer.Get(), {u"C0", u"C0/DIO0", u"C0/DIO0/Pins", u"C0/DIO0/Pins/P1", u"C0/DIO1"});
    const auto renamedObject = Object(u"C0/DIO0");

    ASSERT_EQ(tree_->Rename(At(u"C0/DIO0"), u"Clock"), S_OK);

    const std::vector<Heard> expected = {
        {u"/C0/Clock", 0x2, 7},
        {u"/C0", 0x200, 7},
        {u"/C0/Clock/Pins", 0x20, 7},
        {u"/C0/Clock/Pins/P1", 0x20, 7},
    };
    EXPECT_EQ(observer->heard, expected);
    // The node keeps its place, its entries and its COM object; the old name names nothing.
    EXPECT_EQ(tree_->Find(u"C0/DIO0"), nullptr);
    EXPECT_EQ(*At(u"C0/Clock").TextAt(u"Line"), u"0");
    EXPECT_EQ(Object(u"C0/Clock").Get(), renamedObject.Get());
    EXPECT_EQ(At(u"C0").Begin()->Name(), u"Clock");

    // Names that would make a path ambiguous are refused; a change of case only is a rename.
    EXPECT_EQ(tree_->Rename(At(u"C0/Clock"), u"dio1"), E_INVALIDARG);
    EXPECT_EQ(tree_->Rename(At(u"C0/Clock"), u""), E_INVALIDARG);
    EXPECT_EQ(tree_->Rename(At(u"C0/Clock"), u"clock"), S_OK);
    EXPECT_EQ(At(u"C0/Clock").Name(), u"clock");
}

TEST_F(ResourceTreeTest, RemovalWarnsDetachesThenTellsTheParentAsInsertionDoes) {
    auto observer = test::NewObserver();
    Watch(observer.Get(), {u"C0", u"C0/DIO0", u"C0/DIO0/Pins/P1"});
    const auto removedObject = Object(u"C0/DIO0");

    ASSERT_EQ(Object(u"C0").As<IwbhwResourceTreeAccess>()->RemoveSubTree(u"DIO0"), S_OK);

    const std::vector<Heard> expected = {
        {u"/C0/DIO0", 0x400, 7},
        {u"/C0/DIO0/Pins/P1", 0x400, 7},
        {u"/C0/DIO0/Pins/P1", 0x1, 7},
        {u"/C0/DIO0", 0x1, 7},
        {u"/C0", 0x80, 7},
    };
    EXPECT_EQ(observer->heard, expected);
    EXPECT_EQ(tree_->Find(u"C0/DIO0"), nullptr);
    // A held object of a removed node answers failures, never touches freed memory.
    BSTR name = nullptr;
    EXPECT_EQ(removedObject->GetName(&name), E_FAIL);
    EXPECT_EQ(name, nullptr);
    EXPECT_EQ(Object(u"C0").As<IwbhwResourceTreeAccess>()->RemoveSubTree(u"DIO0"), S_FALSE);
    // Inserting adds the document below and tells the parent.
    observer->heard.clear();
    const auto access = Object(u"C0").As<IwbhwResourceTreeAccess>();

    ASSERT_EQ(access->InsertSubTree(u"<DigitalLine name=\"DIO2\"><Line>2</Line></DigitalLine>"),
              S_OK);
    EXPECT_EQ(observer->heard, (std::vector<Heard>{{u"/C0", 0x100, 7}}));
    EXPECT_EQ(*At(u"C0/DIO2").TextAt(u"Line"), u"2");

    // A document that does not load leaves nothing half-built behind and says so.
    observer->heard.clear();
    const size_t before = At(u"C0").EntryCount();
    EXPECT_EQ(access->InsertSubTree(u"<DigitalLine name=\"DIO3\"><Line>3</DigitalLine>"), E_FAIL);
    EXPECT_EQ(At(u"C0").EntryCount(), before);
    EXPECT_TRUE(observer->heard.empty());
}

TEST_F(ResourceTreeTest, PropertiesRaiseAddedChangedRemovedAndDisplayNameBits) {
    auto observer = test::NewObserver();
    Watch(observer.Get(), {u"C0", u"C0/DIO1"});
    const auto line = Object(u"C0/DIO1");

    EXPECT_EQ(line->SetAttribute(u"Line", u"9"), S_OK);
    EXPECT_EQ(line->SetAttribute(u"Note", u"spare"), S_OK);
    EXPECT_EQ(line->SetAttribute(u"DisplayName", u"Spare line"), S_OK);
    const std::vector<Heard> expected = {
        {u"/C0/DIO1", 0x4, 7},
        {u"/C0/DIO1", 0x8, 7},
        {u"/C0/DIO1", 0x8 | 0x2, 7},
        {u"/C0", 0x200, 7},
    };
    EXPECT_EQ(observer->heard, expected);
    // A child is not a property: nothing is set, nobody is told.
    observer->heard.clear();
    EXPECT_EQ(Object(u"C0")->SetAttribute(u"DIO1", u"x"), S_FALSE);
    EXPECT_TRUE(observer->heard.empty());

    BSTR value = nullptr;
    EXPECT_EQ(line->GetAttribute(u"note", &value), S_OK);
    EXPECT_EQ(TakeText(value), u"spare");
    EXPECT_EQ(line->GetAttribute(u"Missing", &value), S_FALSE);
    EXPECT_EQ(value, nullptr);

    // Removal: the value bit, and for the display name the same bits as setting it.
    observer->heard.clear();
    EXPECT_EQ(tree_->RemoveAttribute(At(u"C0/DIO1"), u"note"), S_OK);
    EXPECT_EQ(tree_->RemoveAttribute(At(u"C0/DIO1"), u"displayname"), S_OK);
    EXPECT_EQ(tree_->RemoveAttribute(At(u"C0/DIO1"), u"Note"), S_FALSE);
    EXPECT_EQ(tree_->RemoveAttribute(At(u"C0"), u"DIO1"), S_FALSE); // a child stays
    EXPECT_EQ(observer->heard,
              (std::vector<Heard>{
                  {u"/C0/DIO1", 0x10, 7}, {u"/C0/DIO1", 0x10 | 0x2, 7}, {u"/C0", 0x200, 7}}));
    EXPECT_EQ(line->GetAttribute(u"Note", &value), S_FALSE);
}

TEST_F(ResourceTreeTest, MasksKindsSilencingAndRemovalsBelowANodeDecideWhoHears) {
    auto observer = test::NewObserver();
    const auto line = Object(u"C0/DIO1");
    ASSERT_EQ(line->AddObserver(observer.Get(), 0x4, 1), S_OK);
    ASSERT_EQ(line->AddObserver(observer.Get(), 0x8 | 0x4, 2), S_OK);

    line->SetAttribute(u"Line", u"5"); // changed: both kinds, each only its own bits
    line->SetAttribute(u"New", u"1");  // added: kind 2 only
    EXPECT_EQ(
        observer->heard,
        (std::vector<Heard>{{u"/C0/DIO1", 0x4, 1}, {u"/C0/DIO1", 0x4, 2}, {u"/C0/DIO1", 0x8, 2}}));

    observer->heard.clear();
    uint32_t saved = 99;
    ASSERT_EQ(line->SaveNotificationState(&saved), S_OK);
    EXPECT_EQ(saved, 0u);
    line->SetAttribute(u"Line", u"6");
    EXPECT_TRUE(observer->heard.empty());
    ASSERT_EQ(line->RestoreNotificationState(saved), S_OK);
    line->SetAttribute(u"Line", u"7");
    EXPECT_EQ(observer->heard.size(), 2u);

    EXPECT_EQ(line->RemoveObserver(observer.Get(), 1, 0), S_OK);
    EXPECT_EQ(line->RemoveObserver(observer.Get(), 1, 0), S_FALSE);
    // Removing every kind below a node leaves other observers alone.
    auto items = test::NewObserver();
    auto other = test::NewObserver();
    Watch(items.Get(), {u"C0/DIO0", u"C0/DIO1"}, kAll, 3);
    Watch(items.Get(), {u"C0/DIO1"}, kAll, 4);
    Watch(other.Get(), {u"C0/DIO1"});

    EXPECT_EQ(Object(u"C0")->RemoveObserver(items.Get(), 0xFFFFFFFFu, 1), S_OK);
    Object(u"C0/DIO0")->SetAttribute(u"Line", u"8");
    Object(u"C0/DIO1")->SetAttribute(u"Line", u"8");
    EXPECT_TRUE(items->heard.empty());
    EXPECT_EQ(other->heard.size(), 1u);
}

TEST_F(ResourceTreeTest, AnObserverMayEditTheTreeWhileBeingTold) {
    auto observer = test::NewObserver();
    Watch(observer.Get(), {u"C0/DIO0", u"C0/DIO1"}, 0x400);
    // Told that DIO0 goes, the observer removes its sibling too, as an item that cleans up
    // after itself might.
    observer->onEvent = [&](IwbhwResourceTreeNode*, uint32_t) {
        Object(u"C0").As<IwbhwResourceTreeAccess>()->RemoveSubTree(u"DIO1");
    };
    ASSERT_EQ(Object(u"C0").As<IwbhwResourceTreeAccess>()->RemoveSubTree(u"DIO0"), S_OK);
    EXPECT_TRUE(At(u"C0").IsEmpty());
}

TEST_F(ResourceTreeTest, FoundPathsMatchWholeMissesCountTheNamesThatLedRelativeFromANode) {
    EXPECT_EQ(Find(u"C0/DIO0"), (Answer{S_OK, 7, u"/C0/DIO0"}));
    EXPECT_EQ(Find(u"c0/dio0"), (Answer{S_OK, 7, u"/C0/DIO0"}));
    EXPECT_EQ(Find(u""), (Answer{S_OK, 0, u"/"}));
    EXPECT_EQ(Find(u"C0/DIO9"), (Answer{S_FALSE, 2, u""}));
    EXPECT_EQ(Find(u"C0/DIO0/Pins/P9"), (Answer{S_FALSE, 12, u""}));
    EXPECT_EQ(Find(u"Nowhere/DIO0"), (Answer{S_FALSE, 0, u""}));
    // A text entry is not a node.
    EXPECT_EQ(Find(u"C0/DIO0/Line"), (Answer{S_FALSE, 7, u""}));
    // Escapes, links and relative pieces are followed.
    EXPECT_EQ(Find(uR"(A\/B)"), (Answer{S_OK, 4, uR"(/A\/B)"}));
    EXPECT_EQ(Find(uR"(A\/C)"), (Answer{S_FALSE, 0, u""}));
    EXPECT_EQ(Find(u"Clock"), (Answer{S_OK, 5, u"/C0/DIO0"}));
    EXPECT_EQ(Find(u"C0/./DIO0/../../A\\/B"), (Answer{S_OK, 20, uR"(/A\/B)"}));
    EXPECT_EQ(Find(u".."), (Answer{S_FALSE, 0, u""}));

    // From a node, lookups are relative unless they start at the root.
    const auto connector = Object(u"C0");
    ComPtr<IwbhwResourceTreeNode> line;
    EXPECT_EQ(connector->FindNode(u"DIO0", nullptr, line.Put()), S_OK);
    uint32_t matched = 0;
    EXPECT_EQ(connector->FindNode(u"/C0/DIO0", &matched, line.Put()), S_OK);
    EXPECT_EQ(matched, 8u);
    EXPECT_EQ(connector->FindNode(u"C0/DIO0", &matched, line.Put()), S_FALSE);
    EXPECT_EQ(line.Get(), nullptr);
}

TEST_F(ResourceTreeTest, ChildrenAttributesAndTypesAreTheNodesEntries) {
    uint32_t count = 0;
    IwbhwResourceTreeNode** children = nullptr;
    const auto release = [&] {
        for (uint32_t i = 0; i < count; ++i)
            children[i]->Release();
        CoTaskMemFree(children);
    };
    ASSERT_EQ(Object(u"C0")->GetChildrenOfType(u"digitalline", &count, &children), S_OK);
    ASSERT_EQ(count, 2u);
    BSTR type = nullptr, name = nullptr, value = nullptr;
    EXPECT_EQ(children[1]->GetElementType(&type), S_OK);
    EXPECT_EQ(TakeText(type), u"DigitalLine");
    EXPECT_EQ(children[1]->GetAttributeAt(0, &name, &value), S_OK);
    EXPECT_EQ(TakeText(name) + u"=" + TakeText(value), u"Line=1");
    EXPECT_EQ(children[1]->GetAttributeAt(1, &name, &value), S_FALSE);
    release();
    // Links are followed by lookups but are not children.
    ASSERT_EQ(Object(u"")->GetChildren(&count, &children), S_OK);
    EXPECT_EQ(count, 2u);
    release();
}

std::vector<std::u16string> List(IwbhwTargetResources& hardware, const char16_t* ioInterface,
                                 const char16_t* filter) {
    BSTR* names = nullptr;
    uint32_t count = 0;
    EXPECT_EQ(hardware.ListResourceNames(ioInterface, filter, &names, &count), S_OK);
    std::vector<std::u16string> list;
    for (uint32_t i = 0; i < count; ++i)
        list.push_back(TakeText(names[i]));
    CoTaskMemFree(names);
    return list;
}

TEST(TargetHardware, ListsTheNodesOfTheInterfaceThatPassAFilterOfKeysListsIgnoringUnknownKeys) {
    wbhost::resources::ResourceService service;
    const auto* target = service.LoadTargetText(uR"(<Target>
      <Line name="DIO0"><IOInterface>DigitalLine</IOInterface><Protocols>IOResource</Protocols></Line>
      <Line name="DIO1"><IOInterface>digitalline</IOInterface>
        <Protocols>IOResource, Reserved</Protocols></Line>
      <Line name="AI0"><IOInterface>AnalogInput</IOInterface><Protocols>IOResource</Protocols></Line>
      <Line name="Doc"><IOInterface>DigitalLine</IOInterface></Line>
    </Target>)");
    ASSERT_NE(target, nullptr);
    IwbhwTargetResources& hardware = *target->hardware.Get();
    const char16_t* const standard = u"include_protocols=IOResource,exclude_protocols=";
    EXPECT_EQ(List(hardware, u"DigitalLine", standard),
              (std::vector<std::u16string>{u"/DIO0", u"/DIO1"}));
    EXPECT_EQ(
        List(hardware, u"DigitalLine", u"include_protocols=IOResource,exclude_protocols=reserved"),
        std::vector<std::u16string>{u"/DIO0"});
    EXPECT_EQ(List(hardware, u"", standard).size(), 3u);
    EXPECT_TRUE(List(hardware, u"Counter", standard).empty());
    BSTR* names = nullptr;
    EXPECT_EQ(hardware.ListResourceNames(u"", standard, &names, nullptr), E_POINTER);
    // The filter continues a keys list and ignores unknown keys.
    using wbhost::resources::ProtocolFilter;
    const auto filter =
        ProtocolFilter::Parse(u"include_protocols=A,B,colour=red,exclude_protocols=C");
    EXPECT_EQ(filter.include, (std::vector<std::u16string>{u"A", u"B"}));
    EXPECT_EQ(filter.exclude, std::vector<std::u16string>{u"C"});
    EXPECT_TRUE(filter.Passes({u"b", u"a"}));
    EXPECT_FALSE(filter.Passes({u"A"}));
    EXPECT_FALSE(filter.Passes({u"A", u"B", u"c"}));
    EXPECT_TRUE(ProtocolFilter::Parse(u"").Passes({}));
}

} // namespace
