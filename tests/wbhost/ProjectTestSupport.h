// What the project tests share: a scratch folder with a target description, small COM objects
// standing in for provider-made item objects and selectors, and a session with the build's
// module and a project whose items the module makes.
#pragma once

#include "TestObjects.h"
#include "cli/HostedModule.h"
#include "com/ComObject.h"
#include "com/ComPtr.h"
#include "host/contracts/IwbProjectItem.h"
#include "host/contracts/IwbProjectItemScope.h"
#include "host/contracts/IwbProjectItemSelector.h"
#include "items/TIOItemInterfaces.h"
#include "kern/Utf8.h"
#include "provider/TIOIdentifiers.h"
#include "session/HostSession.h"
#include "support/ScratchFolder.h"

#include <functional>
#include <gtest/gtest.h>
#include <string>

namespace projecttest {

using ScratchFolder = ::test::ScratchFolder;

inline constexpr const char* kDescription = R"(<Target>
  <Line name="DIO0"><IOInterface>DigitalLine</IOInterface><Protocols>IOResource</Protocols></Line>
  <Line name="AI0"><IOInterface>AnalogInput</IOInterface><Protocols>IOResource</Protocols></Line>
</Target>
)";

// An item object that is a name scope, as a provider's sub-target might be.
class ScopeObjectImpl : public IwbProjectItemScope {
public:
    using Interfaces = qv::com::InterfaceList<IwbProjectItemScope>;
    virtual ~ScopeObjectImpl() = default;
};

// A plain item object that keeps its item, as providers' objects do.
class PlainObjectImpl : public IwbProjectItemSelector {
public:
    using Interfaces = qv::com::InterfaceList<IwbProjectItemSelector>;
    explicit PlainObjectImpl(IwbProjectItem* item)
        : item(qv::com::ComPtr<IwbProjectItem>::Share(item)) {}
    virtual ~PlainObjectImpl() = default;
    HRESULT SelectItem(IwbProjectItem*) override { return S_FALSE; }
    qv::com::ComPtr<IwbProjectItem> item;
};

// A selector that runs a function for each item.
class SelectorImpl : public IwbProjectItemSelector {
public:
    using Interfaces = qv::com::InterfaceList<IwbProjectItemSelector>;
    explicit SelectorImpl(std::function<HRESULT(IwbProjectItem*)> body) : body_(std::move(body)) {}
    virtual ~SelectorImpl() = default;
    HRESULT SelectItem(IwbProjectItem* item) override { return body_(item); }

private:
    std::function<HRESULT(IwbProjectItem*)> body_;
};

template <class Impl, class... Args> qv::com::ComPtr<CQVComObject<Impl>> Make(Args&&... args) {
    CQVComObject<Impl>* made = nullptr;
    CQVComObject<Impl>::CreateInstance(&made, std::forward<Args>(args)...);
    return qv::com::ComPtr<CQVComObject<Impl>>::Adopt(made);
}

// The attribute-set text a new I/O item is made with: its "resource" attribute is RESOURCE.
inline std::u16string ItemBag(std::u16string_view resource) {
    return u"<AttributeSet name=\"\">\n<Attribute name=\"resource\">\n<Value>" +
           std::u16string(resource) + u"</Value>\n</Attribute>\n</AttributeSet>\n";
}

inline std::u16string NameOf(IwbProjectItem* item) {
    BSTR name = nullptr;
    item->GetName(&name);
    return test::TakeText(name);
}

using test::TakeText;

// The string NAME of BAG, which must hold one.
inline std::u16string StringOf(IwbProjectPropertyBag& bag, const char16_t* name) {
    BSTR text = nullptr;
    EXPECT_EQ(bag.GetString(name, &text), S_OK) << qv::kern::WideToUtf8(name);
    return TakeText(text);
}

// A session with the build's module and a new project "P" whose target "T" is made from the
// board text the test names; items are made through the project as the host's tree makes them.
class ModuleProjectTest : public ::testing::Test {
protected:
    using ProjectItem = wbhost::project::ProjectItem;
    using Property = wbhost::project::Property;

    // Opens the session and the project with the target "T" described by BOARD.
    void Open(const char* board) {
        std::string error;
        ASSERT_TRUE(session.Open(WBT_MODULE_PATH, &error)) << error;
        ASSERT_TRUE(session.NewProject(u"P", &error)) << error;
        target = AddTarget(u"T", board);
        ASSERT_TRUE(target);
    }
    // Another target NAME described by BOARD.
    qv::com::ComPtr<ProjectItem> AddTarget(const std::u16string& name, const char* board) {
        std::string error;
        auto added = Project().AddTarget(
            name, scratch.Write(qv::kern::WideToUtf8(name) + ".xml", board), &error);
        EXPECT_TRUE(added) << error;
        return added;
    }

    wbhost::project::Project& Project() { return *session.Project(); }
    wbhost::project::TargetObject& Target() { return *Project().TargetOf(*target.Get()); }
    wbhost::resources::ResourceTree& Tree() { return *Target().Target().tree; }
    wbhw::ResTreeNode& Node(std::u16string_view path) {
        wbhw::ResTreeNode* node = Tree().Find(path);
        EXPECT_NE(node, nullptr) << "no node at the path";
        return node != nullptr ? *node : Tree().Root();
    }
    template <class Fn> Fn* Export(const char* name) {
        Fn* fn = session.Module()->Find<Fn>(name);
        EXPECT_NE(fn, nullptr) << name;
        return fn;
    }

    // A new I/O item NAME below PARENT (the target when null) whose stored bag uses RESOURCE,
    // or that has no bag when RESOURCE is null.
    ProjectItem* AddItem(std::u16string name, const char16_t* resource,
                         ProjectItem* parent = nullptr) {
        wbhost::project::PropertyBag::Map properties;
        if (resource != nullptr)
            properties[u"tioAttrBag"] = Property{Property::Kind::String, ItemBag(resource), 0};
        qv::com::ComPtr<ProjectItem> made;
        EXPECT_EQ(Project().CreateItem(parent ? *parent : *target.Get(), tio::kIOItemType,
                                       std::move(name), properties, &made),
                  S_OK);
        return made.Get();
    }
    ProjectItem* AddFolder(std::u16string name, ProjectItem* parent = nullptr) {
        qv::com::ComPtr<ProjectItem> made;
        EXPECT_EQ(Project().CreateItem(parent ? *parent : *target.Get(), wbproj::kFolderType,
                                       std::move(name), {}, &made),
                  S_OK);
        return made.Get();
    }
    // The item at PATH (names below PARENT, the target when null); null when absent.
    ProjectItem* At(const std::vector<std::u16string>& path, ProjectItem* parent = nullptr) {
        ProjectItem* at = parent ? parent : target.Get();
        for (const auto& name : path) {
            ProjectItem* next = nullptr;
            for (const auto& child : at->Children())
                next = child->Name() == name ? child.Get() : next;
            if (next == nullptr)
                return nullptr;
            at = next;
        }
        return at;
    }

    template <class I> static qv::com::ComPtr<I> As(ProjectItem* item) {
        return qv::com::QueryAs<I>(item->Object());
    }
    static int32_t Int(ProjectItem* item, const char16_t* name, int32_t absent = -1) {
        int32_t value = absent;
        return item->Bag().GetInt(name, &value) == S_OK ? value : absent;
    }
    // The status the item stored with its properties.
    static int32_t Status(ProjectItem* item) { return Int(item, u"tioResourceStatus"); }
    static std::u16string StoredBag(ProjectItem* item) {
        return StringOf(item->Bag(), u"tioAttrBag");
    }
    static std::u16string Resource(ProjectItem* item) {
        BSTR path = nullptr;
        As<IwbhwResourceItemUI>(item)->GetResourcePath(&path);
        return TakeText(path);
    }

    ScratchFolder scratch;
    wbhost::session::HostSession session;
    qv::com::ComPtr<ProjectItem> target;
};

} // namespace projecttest
