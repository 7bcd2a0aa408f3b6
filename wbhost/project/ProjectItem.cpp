// The host's project item.
#include "project/ProjectItem.h"

#include "com/CallGuard.h"
#include "host/contracts/IwbProjectItemScope.h"
#include "host/contracts/IwbProjectItemSelector.h"
#include "host/contracts/IwbProjectItemUIMap.h"
#include "kern/Collate.h"
#include "kern/Guid.h"
#include "project/HostItemObject.h"
#include "project/Project.h"

#include <algorithm>

namespace wbhost::project {

using qv::com::ComPtr;

ProjectItem::ProjectItem(Project* project, const GUID& type, const GUID& id, std::u16string name)
    : project_(project), type_(type), id_(id), name_(std::move(name)),
      sequence_(project != nullptr ? project->NextSequence() : 0) {}

HRESULT ProjectItem::FinalConstruct() {
    CQVComObject<PropertyBag>* bag = nullptr;
    const HRESULT hr = CQVComObject<PropertyBag>::CreateInstance(&bag);
    bag_ = ComPtr<PropertyBag>::Adopt(bag);
    return hr;
}

HRESULT ProjectItem::GetName(BSTR* name) {
    if (name == nullptr)
        return E_POINTER;
    *name = qv::com::AllocBstr(name_);
    return *name ? S_OK : E_OUTOFMEMORY;
}

HRESULT ProjectItem::SetName(const char16_t* name) {
    if (name == nullptr)
        return E_POINTER;
    // An unnamed item could not be found by name nor shown; refuse it.
    if (*name == u'\0')
        return E_INVALIDARG;
    return qv::com::GuardCall([&] {
        if (parent_ == nullptr) {
            name_ = name;
            return S_OK;
        }
        // The new name is indexed before the old one goes, so a failure leaves both as they were.
        auto& index = parent_->childrenByName_;
        auto [first, last] = index.equal_range(name_);
        const auto old = std::find_if(first, last, [&](const auto& e) { return e.second == this; });
        index.emplace(name, this);
        if (old != last)
            index.erase(old);
        name_ = name;
        return S_OK;
    });
}

HRESULT ProjectItem::GetTypeGuid(GUID* type) {
    if (type == nullptr)
        return E_POINTER;
    *type = type_;
    return S_OK;
}

HRESULT ProjectItem::GetParent(IwbProjectItem** parent) {
    if (parent == nullptr)
        return E_POINTER;
    *parent = parent_;
    if (parent_ == nullptr)
        return S_FALSE;
    parent_->AddRef();
    return S_OK;
}

HRESULT ProjectItem::FindChild(const char16_t* name, IwbProjectItem** child) {
    if (name == nullptr || child == nullptr)
        return E_POINTER;
    *child = nullptr;
    const auto found = childrenByName_.find(std::u16string_view(name));
    if (found == childrenByName_.end())
        return S_FALSE;
    *child = found->second;
    (*child)->AddRef();
    return S_OK;
}

HRESULT ProjectItem::CreateChild(const GUID& type, const char16_t* name, IwbProjectItem** child) {
    if (child != nullptr)
        *child = nullptr;
    if (name == nullptr)
        return E_POINTER;
    if (*name == u'\0')
        return E_INVALIDARG;
    if (project_ == nullptr)
        return E_UNEXPECTED; // the item was closed with its project
    return qv::com::GuardCall([&]() -> HRESULT {
        ComPtr<ProjectItem> made;
        const HRESULT hr = project_->CreateItem(*this, type, name, {}, &made);
        if (SUCCEEDED(hr) && child != nullptr)
            *child = made.Detach();
        return hr;
    });
}

HRESULT ProjectItem::GetObject(IUnknown** object) {
    if (object == nullptr)
        return E_POINTER;
    object_.CopyTo(object);
    return object_ ? S_OK : S_FALSE;
}

HRESULT ProjectItem::GetPropertyBag(IwbProjectPropertyBag** bag) {
    if (bag == nullptr)
        return E_POINTER;
    *bag = bag_.Get();
    bag_->AddRef();
    return S_OK;
}

HRESULT ProjectItem::Refresh(uint32_t updateCode) {
    return qv::com::GuardCall([&] {
        refreshes_.push_back(updateCode);
        return S_OK;
    });
}

HRESULT ProjectItem::Select() {
    ++selects_;
    return S_OK;
}

HRESULT ProjectItem::Show(int32_t show) {
    lastShow_ = show;
    return S_OK;
}

HRESULT ProjectItem::GetFlags(uint32_t* flags) {
    if (flags == nullptr)
        return E_POINTER;
    *flags = flags_;
    return S_OK;
}

HRESULT ProjectItem::SetFlags(uint32_t flags) {
    flags_ = flags;
    return S_OK;
}

HRESULT ProjectItem::EnumerateItems(IwbProjectItemSelector* selector, IwbProjectItem** selected) {
    if (selected != nullptr)
        *selected = nullptr;
    if (selector == nullptr)
        return E_POINTER;
    return qv::com::GuardCall([&]() -> HRESULT {
        // The selector may add or remove items while it is asked: walk a held copy.
        const std::vector<ComPtr<ProjectItem>> children = children_;
        for (const auto& child : children) {
            const HRESULT answer = selector->SelectItem(child.Get());
            if (FAILED(answer))
                return answer;
            if (answer == S_OK) {
                if (selected != nullptr) {
                    *selected = child.Get();
                    child->AddRef();
                }
                return S_OK;
            }
            if (qv::com::QueryAs<IwbProjectItemScope>(child->object_.Get()))
                continue;
            const HRESULT below = child->EnumerateItems(selector, selected);
            if (below != S_FALSE)
                return below;
        }
        return S_FALSE;
    });
}

HRESULT ProjectItem::GetInfoRecord(QxItemInfoRecord* record) {
    if (record == nullptr)
        return E_POINTER;
    if (record->size != sizeof(QxItemInfoRecord))
        return E_INVALIDARG;
    *record = QxItemInfoRecord{};
    record->flags = flags_;
    record->id = id_;
    record->type = type_;
    record->item = this;
    return S_OK;
}

HRESULT ProjectItem::GetItemUIMap(IwbProjectItemUIMap** map) {
    if (map == nullptr)
        return E_POINTER;
    *map = nullptr;
    if (project_ == nullptr)
        return E_UNEXPECTED;
    project_->UIMap().CopyTo(map);
    return *map ? S_OK : E_UNEXPECTED;
}

ComPtr<ProjectItem> ProjectItem::AddChild(const GUID& type, const GUID& id, std::u16string name) {
    ProjectItemObject* made = nullptr;
    ProjectItemObject::CreateInstance(&made, project_, type, id, std::move(name));
    auto item = ComPtr<ProjectItem>::Adopt(made);
    if (item) {
        item->parent_ = this;
        children_.push_back(item);
        IndexChild(item.Get());
    }
    return item;
}

bool ProjectItem::RemoveChild(ProjectItem* child) {
    const ComPtr<ProjectItem> held = ReleaseChild(child);
    if (!held)
        return false;
    held->Close();
    return true;
}

ComPtr<ProjectItem> ProjectItem::ReleaseChild(ProjectItem* child) {
    const auto it = std::find_if(children_.begin(), children_.end(),
                                 [&](const auto& each) { return each.Get() == child; });
    if (it == children_.end())
        return {};
    ComPtr<ProjectItem> held = std::move(*it);
    UnindexChild(child);
    children_.erase(it);
    held->parent_ = nullptr;
    return held;
}

void ProjectItem::AdoptChild(ComPtr<ProjectItem> child) {
    if (!child)
        return;
    child->parent_ = this;
    ProjectItem* const adopted = child.Get();
    children_.push_back(std::move(child));
    IndexChild(adopted);
}

void ProjectItem::IndexChild(ProjectItem* child) {
    try {
        childrenByName_.emplace(child->name_, child);
    } catch (...) {
        children_.pop_back(); // the child was just appended: it is not kept unfindable
        throw;
    }
}

void ProjectItem::UnindexChild(ProjectItem* child) noexcept {
    auto [first, last] = childrenByName_.equal_range(child->name_);
    const auto it = std::find_if(first, last, [&](const auto& e) { return e.second == child; });
    if (it != last)
        childrenByName_.erase(it);
}

void ProjectItem::Close() {
    project_ = nullptr;
    parent_ = nullptr;
    // Objects often hold their own item; dropping them first breaks that cycle. The host's own
    // objects do not hold it, so they are told it is gone.
    ComPtr<IUnknown> object = std::move(object_);
    if (const auto own = qv::com::QueryAs<IwbHostItemObject>(object.Get()))
        static_cast<HostItemObject*>(own.Get())->Forget();
    object.Reset();
    std::vector<ComPtr<ProjectItem>> children = std::move(children_);
    children_.clear();
    childrenByName_.clear();
    for (const auto& child : children)
        child->Close();
}

} // namespace wbhost::project
