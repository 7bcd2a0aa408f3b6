// The host's project item: a node of the project tree with its name, type, identifier, flag
// word, properties and the object its provider made for it.
#pragma once

#include "com/ComObject.h"
#include "com/ComPtr.h"
#include "host/contracts/IwbProjectItem.h"
#include "kern/Collate.h"
#include "project/PropertyBag.h"

#include <map>
#include <string>
#include <vector>

namespace wbhost::project {

class Project;

class ProjectItem : public IwbProjectItem {
public:
    using Interfaces = qv::com::InterfaceList<IwbProjectItem>;
    // An item of PROJECT (not owning; cleared by Close) with TYPE, identifier ID and NAME,
    // shown, without parent or object.
    ProjectItem(Project* project, const GUID& type, const GUID& id, std::u16string name);
    virtual ~ProjectItem() = default;
    // Makes the property bag.
    HRESULT FinalConstruct();

    HRESULT GetName(BSTR* name) override;
    HRESULT SetName(const char16_t* name) override;
    HRESULT GetTypeGuid(GUID* type) override;
    HRESULT GetParent(IwbProjectItem** parent) override;
    HRESULT FindChild(const char16_t* name, IwbProjectItem** child) override;
    HRESULT CreateChild(const GUID& type, const char16_t* name, IwbProjectItem** child) override;
    HRESULT GetObject(IUnknown** object) override;
    HRESULT GetPropertyBag(IwbProjectPropertyBag** bag) override;
    HRESULT Refresh(uint32_t updateCode) override;
    HRESULT Select() override;
    HRESULT Show(int32_t show) override;
    HRESULT GetFlags(uint32_t* flags) override;
    HRESULT SetFlags(uint32_t flags) override;
    HRESULT EnumerateItems(IwbProjectItemSelector* selector, IwbProjectItem** selected) override;
    HRESULT GetInfoRecord(QxItemInfoRecord* record) override;
    HRESULT GetItemUIMap(IwbProjectItemUIMap** map) override;

    // Host side.
    const std::u16string& Name() const noexcept { return name_; }
    const GUID& Type() const noexcept { return type_; }
    const GUID& Id() const noexcept { return id_; }
    uint32_t Flags() const noexcept { return flags_; }
    ProjectItem* Parent() const noexcept { return parent_; }
    const std::vector<qv::com::ComPtr<ProjectItem>>& Children() const noexcept { return children_; }
    PropertyBag& Bag() noexcept { return *bag_.Get(); }
    const PropertyBag& Bag() const noexcept { return *bag_.Get(); }
    IUnknown* Object() const noexcept { return object_.Get(); }
    void SetObject(qv::com::ComPtr<IUnknown> object) { object_ = std::move(object); }
    // The resource description a target item was loaded from; empty for other items.
    const std::string& DescriptionFile() const noexcept { return descriptionFile_; }
    void SetDescriptionFile(std::string path) { descriptionFile_ = std::move(path); }
    // Appends a new child of TYPE with ID and NAME and answers it (null without memory); no
    // object is made for it.
    qv::com::ComPtr<ProjectItem> AddChild(const GUID& type, const GUID& id, std::u16string name);
    // Removes CHILD from the children and closes it; false when it is not a child.
    bool RemoveChild(ProjectItem* child);
    // Takes CHILD out of the children without closing it (it keeps its children and object)
    // and answers it; empty when it is not a child.
    qv::com::ComPtr<ProjectItem> ReleaseChild(ProjectItem* child);
    // Appends CHILD (taken out of another item) to the children and becomes its parent.
    void AdoptChild(qv::com::ComPtr<ProjectItem> child);
    // Lets go of the object, the children (closing them) and the parent and project links, so
    // references still held elsewhere reach a detached item instead of freed memory.
    void Close();

    // Where the item stands in the order items came into its project.
    uint64_t Sequence() const noexcept { return sequence_; }
    void SetSequence(uint64_t sequence) noexcept { sequence_ = sequence; }

    // The status of the last attempt to make and bind the item's object (S_OK when it bound or
    // the item needs none).
    HRESULT BindStatus() const noexcept { return bindStatus_; }
    void SetBindStatus(HRESULT status) noexcept { bindStatus_ = status; }

    // What the project tree was asked to do, for tests.
    const std::vector<uint32_t>& Refreshes() const noexcept { return refreshes_; }
    int SelectCount() const noexcept { return selects_; }
    int32_t LastShow() const noexcept { return lastShow_; }

private:
    // Keeps CHILD (one of the children) findable by its name / stops doing so.
    void IndexChild(ProjectItem* child);
    void UnindexChild(ProjectItem* child) noexcept;

    Project* project_;
    ProjectItem* parent_ = nullptr;
    const GUID type_;
    const GUID id_;
    std::u16string name_;
    uint32_t flags_ = wbproj::kShownFlag;
    qv::com::ComPtr<PropertyBag> bag_;
    qv::com::ComPtr<IUnknown> object_;
    std::vector<qv::com::ComPtr<ProjectItem>> children_;
    // The children by name, without regard to case, so that FindChild stays cheap below a target
    // of thousands of items (bulk creation looks every new name up). Whatever adds, removes or
    // renames a child keeps it in step (IndexChild, UnindexChild).
    std::multimap<std::u16string, ProjectItem*, qv::kern::LessNoCase> childrenByName_;
    std::string descriptionFile_;
    uint64_t sequence_;
    HRESULT bindStatus_ = S_OK;
    std::vector<uint32_t> refreshes_;
    int selects_ = 0;
    int32_t lastShow_ = 0;
};

using ProjectItemObject = CQVComObject<ProjectItem>;

} // namespace wbhost::project
