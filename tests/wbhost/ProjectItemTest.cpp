// The host's project items: tree operations, property bags, enumeration and targets.
#include "ProjectTestSupport.h"
#include "host/contracts/IwbProjectItemUIMap.h"
#include "host/contracts/IwbhwResourceTreeNode.h"
#include "project/HostItemObject.h"
#include "project/Project.h"

#include <gtest/gtest.h>

using namespace projecttest;
using qv::com::ComPtr;
using wbhost::project::Project;

namespace {

ComPtr<IwbProjectItem> Child(IwbProjectItem& parent, const char16_t* name,
                             const GUID& type = wbproj::kFolderType) {
    IwbProjectItem* made = nullptr;
    EXPECT_EQ(parent.CreateChild(type, name, &made), S_OK);
    return ComPtr<IwbProjectItem>::Adopt(made);
}

// Names of the items an enumeration from FROM visits, in order.
std::vector<std::u16string> Walk(IwbProjectItem& from) {
    std::vector<std::u16string> seen;
    auto selector = Make<SelectorImpl>([&](IwbProjectItem* item) {
        seen.push_back(NameOf(item));
        return S_FALSE;
    });
    EXPECT_EQ(from.EnumerateItems(selector.Get(), nullptr), S_FALSE);
    return seen;
}

class ProjectItemTest : public ::testing::Test {
protected:
    ScratchFolder scratch;
    wbhost::resources::ResourceService service;
    std::unique_ptr<Project> project = std::make_unique<Project>(service);
    IwbProjectItem& root = project->Root();
};

TEST_F(ProjectItemTest, TreeOperationsAndPropertiesThatAreTypedAndAnswerFalseWhenAbsent) {
    auto folder = Child(root, u"Folder");
    auto inner = Child(*folder.Get(), u"Inner");
    IwbProjectItem* found = nullptr;
    EXPECT_EQ(root.FindChild(u"FOLDER", &found), S_OK);
    EXPECT_EQ(found, folder.Get());
    found->Release();
    EXPECT_EQ(root.FindChild(u"Inner", &found), S_FALSE); // children only, not descendants
    EXPECT_EQ(found, nullptr);

    IwbProjectItem* parent = nullptr;
    EXPECT_EQ(inner->GetParent(&parent), S_OK);
    EXPECT_EQ(parent, folder.Get());
    parent->Release();
    EXPECT_EQ(root.GetParent(&parent), S_FALSE);
    EXPECT_EQ(parent, nullptr);

    EXPECT_EQ(root.CreateChild(wbproj::kFolderType, u"", nullptr), E_INVALIDARG);
    EXPECT_EQ(inner->SetName(u""), E_INVALIDARG);
    EXPECT_EQ(inner->SetName(u"Renamed"), S_OK);
    EXPECT_EQ(NameOf(inner.Get()), u"Renamed");
    // A renamed child is found by its new name only; a removed one no more.
    EXPECT_EQ(folder->FindChild(u"renamed", &found), S_OK);
    EXPECT_EQ(found, inner.Get());
    found->Release();
    EXPECT_EQ(folder->FindChild(u"Inner", &found), S_FALSE);
    using wbhost::project::ProjectItem;
    EXPECT_TRUE(static_cast<ProjectItem*>(folder.Get())
                    ->RemoveChild(static_cast<ProjectItem*>(inner.Get())));
    EXPECT_EQ(folder->FindChild(u"Renamed", &found), S_FALSE);
    // Duplicate names are the plug-in's business: the host accepts them.
    EXPECT_TRUE(Child(root, u"folder"));
    // Properties are typed, and an absent one answers S_FALSE.
    IwbProjectPropertyBag* bag = nullptr;
    ASSERT_EQ(root.GetPropertyBag(&bag), S_OK);
    BSTR text = reinterpret_cast<BSTR>(1);
    int32_t number = 7;
    EXPECT_EQ(bag->GetString(u"missing", &text), S_FALSE);
    EXPECT_EQ(text, nullptr);
    EXPECT_EQ(bag->GetInt(u"missing", &number), S_FALSE);
    EXPECT_EQ(number, 0);
    EXPECT_EQ(bag->GetBool(u"", &number), E_INVALIDARG);

    EXPECT_EQ(bag->SetString(u"empty", nullptr, 0), S_OK);
    EXPECT_EQ(bag->GetString(u"empty", &text), S_OK); // present, though empty
    EXPECT_EQ(TakeText(text), u"");
    bag->SetInt(u"n", INT32_MIN, 0);
    EXPECT_EQ(bag->GetInt(u"n", &number), S_OK);
    EXPECT_EQ(number, INT32_MIN);
    bag->SetBool(u"b", 42, 0);
    EXPECT_EQ(bag->GetBool(u"b", &number), S_OK);
    EXPECT_EQ(number, 1);
    // Names are exact, and a read of another kind is refused rather than called absent.
    EXPECT_EQ(bag->GetInt(u"N", &number), S_FALSE);
    EXPECT_EQ(bag->GetString(u"n", &text), E_INVALIDARG);
    bag->SetString(u"n", u"now text", 0);
    EXPECT_EQ(StringOf(*bag, u"n"), u"now text");
    bag->Release();
}

TEST_F(ProjectItemTest, InfoRecordAndObjectMap) {
    auto scope = Make<ScopeObjectImpl>();
    project->SetObjectFactory(
        [&](IwbProjectItem&, const GUID&, IUnknown*, ComPtr<IUnknown>& object) {
            object = ComPtr<IUnknown>::Share(scope->GetUnknown());
            return S_OK;
        });
    constexpr GUID kType = qv::com::ParseGuid("11111111-2222-3333-4444-555555555555");
    auto item = Child(root, u"Item", kType);
    QxItemInfoRecord record;
    ASSERT_EQ(item->GetInfoRecord(&record), S_OK);
    EXPECT_TRUE(IsEqualGUID(record.type, kType));
    EXPECT_EQ(record.item, item.Get());
    QxItemInfoRecord again;
    item->GetInfoRecord(&again);
    EXPECT_TRUE(IsEqualGUID(record.id, again.id)); // stable
    again.size = 8;
    EXPECT_EQ(item->GetInfoRecord(&again), E_INVALIDARG);

    IwbProjectItemUIMap* map = nullptr;
    ASSERT_EQ(item->GetItemUIMap(&map), S_OK);
    IUnknown* object = nullptr;
    EXPECT_EQ(map->GetItemUI(&record, &object), S_OK);
    EXPECT_EQ(object, scope->GetUnknown());
    object->Release();
    auto folder = Child(root, u"Folder");
    folder->GetInfoRecord(&record);
    // Folders have the host's own object, which hands back its item.
    ASSERT_EQ(map->GetItemUI(&record, &object), S_OK);
    const auto own = qv::com::QueryAs<wbhost::project::IwbHostItemObject>(object);
    object->Release();
    ASSERT_TRUE(own);
    ComPtr<IwbProjectItem> back;
    EXPECT_EQ(own->GetProjectItem(back.Put()), S_OK);
    EXPECT_EQ(back.Get(), folder.Get());
    record.size = 71;
    EXPECT_EQ(map->GetItemUI(&record, &object), E_INVALIDARG);
    map->Release();
}

TEST_F(ProjectItemTest, EnumerationStopsAtSelectionAndSkipsBelowScopes) {
    auto scope = Make<ScopeObjectImpl>();
    project->SetObjectFactory(
        [&](IwbProjectItem&, const GUID&, IUnknown*, ComPtr<IUnknown>& object) {
            object = ComPtr<IUnknown>::Share(scope->GetUnknown());
            return S_OK;
        });
    constexpr GUID kScopeType = qv::com::ParseGuid("11111111-2222-3333-4444-555555555555");
    auto a = Child(root, u"A");
    Child(*a.Get(), u"A1");
    auto s = Child(*a.Get(), u"S", kScopeType);
    Child(*s.Get(), u"Hidden");
    Child(root, u"B");
    EXPECT_EQ(Walk(root), (std::vector<std::u16string>{u"A", u"A1", u"S", u"B"}));
    // From the scope itself, its own children are walked.
    EXPECT_EQ(Walk(*s.Get()), (std::vector<std::u16string>{u"Hidden"}));

    IwbProjectItem* selected = nullptr;
    int asked = 0;
    auto pick = Make<SelectorImpl>([&](IwbProjectItem* item) {
        ++asked;
        return NameOf(item) == u"A1" ? S_OK : S_FALSE;
    });
    EXPECT_EQ(root.EnumerateItems(pick.Get(), &selected), S_OK);
    EXPECT_EQ(NameOf(selected), u"A1");
    EXPECT_EQ(asked, 2);
    selected->Release();

    auto failing = Make<SelectorImpl>([](IwbProjectItem*) { return E_ABORT; });
    EXPECT_EQ(root.EnumerateItems(failing.Get(), &selected), E_ABORT);
    EXPECT_EQ(selected, nullptr);

    // A selector that adds and removes items while it is asked.
    auto editing = Make<SelectorImpl>([&](IwbProjectItem* item) {
        if (NameOf(item) == u"A")
            root.CreateChild(wbproj::kFolderType, u"Late", nullptr);
        if (NameOf(item) == u"A1")
            static_cast<wbhost::project::ProjectItem&>(*a.Get()).RemoveChild(
                static_cast<wbhost::project::ProjectItem*>(item));
        return S_FALSE;
    });
    EXPECT_EQ(root.EnumerateItems(editing.Get(), nullptr), S_FALSE);
    EXPECT_EQ(Walk(root), (std::vector<std::u16string>{u"A", u"S", u"B", u"Late"}));
}

TEST_F(ProjectItemTest, TargetsOfferTheirTreeAndHearItemChangesRefusedObjectsDropTheirItem) {
    std::string error;
    auto target = project->AddTarget(u"Target", scratch.Write("t.xml", kDescription), &error);
    ASSERT_TRUE(target) << error;
    EXPECT_FALSE(project->AddTarget(u"Other", scratch.File("none.xml"), &error));
    EXPECT_NE(error.find("none.xml"), std::string::npos);
    EXPECT_EQ(project->Targets().size(), 1u);
    EXPECT_EQ(project->Root().Children().size(), 1u); // the failed target left nothing

    IUnknown* object = nullptr;
    ASSERT_EQ(target->GetObject(&object), S_OK);
    auto provider = qv::com::QueryAs<IwbhwResourceTreeProvider>(object);
    ASSERT_TRUE(provider);
    IwbhwResourceTreeNode* rootNode = nullptr;
    EXPECT_EQ(provider->GetResourceTreeRoot(&rootNode), S_OK);
    ASSERT_NE(rootNode, nullptr);
    rootNode->Release();
    EXPECT_TRUE(qv::com::QueryAs<IwbProjectItemScope>(object));

    auto change = qv::com::QueryAs<IwbTargetItemChange>(object);
    object->Release();
    auto item = Child(*target.Get(), u"Item");
    change->ItemChanged(item.Get());
    int32_t previous = -1;
    change->SuspendChangeHandling(1, &previous);
    EXPECT_EQ(previous, 0);
    change->ItemChanged(item.Get());
    change->SuspendChangeHandling(1, &previous);
    EXPECT_EQ(previous, 1); // nested suspension sees the outer one
    change->RestoreChangeHandling(previous);
    EXPECT_EQ(project->TargetOf(*target.Get())->Suspended(), true);
    change->RestoreChangeHandling(0);
    change->ItemChanged(item.Get());
    const auto* host = project->TargetOf(*target.Get());
    EXPECT_EQ(host->Changed().size(), 2u);
    EXPECT_EQ(host->SuspendedChanges(), 1);
    EXPECT_EQ(project->TargetOf(static_cast<wbhost::project::ProjectItem&>(*item.Get())), nullptr);
    // Refused objects drop the item, and closing frees cycles.
    const long before = qv::com::LiveObjectCount();
    {
        wbhost::resources::ResourceService own;
        auto closing = std::make_unique<Project>(own);
        constexpr GUID kType = qv::com::ParseGuid("11111111-2222-3333-4444-555555555555");
        closing->SetObjectFactory(
            [&](IwbProjectItem& item, const GUID&, IUnknown*, ComPtr<IUnknown>& object) -> HRESULT {
                if (NameOf(&item) == u"Refused")
                    return E_ACCESSDENIED;
                object = ComPtr<IUnknown>::Share(Make<PlainObjectImpl>(&item)->GetUnknown());
                return S_OK;
            });
        IwbProjectItem* refused = nullptr;
        EXPECT_EQ(closing->Root().CreateChild(kType, u"Refused", &refused), E_ACCESSDENIED);
        EXPECT_EQ(refused, nullptr);
        EXPECT_TRUE(closing->Root().Children().empty());
        // An object holding its item, and an item held past the project.
        auto kept = Child(closing->Root(), u"Kept", kType);
        closing.reset();
        IwbProjectItem* parent = nullptr;
        EXPECT_EQ(kept->GetParent(&parent), S_FALSE);
        EXPECT_EQ(kept->CreateChild(wbproj::kFolderType, u"x", nullptr), E_UNEXPECTED);
    }
    EXPECT_EQ(qv::com::LiveObjectCount(), before);
}

} // namespace
