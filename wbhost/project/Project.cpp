// The embedded host's project.
#include "project/Project.h"

#include "framework/IqxBindable.h"
#include "framework/IqxItemUI.h"
#include "framework/IwbChildValidator.h"
#include "framework/IwbProjectItemObserver.h"
#include "kern/Guid.h"
#include "kern/Utf8.h"
#include "project/AtomicFile.h"
#include "project/HexStatus.h"
#include "project/HostItemObject.h"
#include "project/ItemUIMap.h"

#include <algorithm>
#include <functional>
#include <unordered_map>
#include <unordered_set>

namespace wbhost::project {

using qv::com::ComPtr;

namespace {
void SetError(std::string* error, std::string message) {
    if (error != nullptr)
        *error = std::move(message);
}

// Gives ITEM the host's own object (the project root and folders have no provider).
void GiveFolderObject(ProjectItem& item) {
    FolderObjectInstance* made = nullptr;
    if (FAILED(FolderObjectInstance::CreateInstance(&made, &item)))
        throw std::bad_alloc();
    item.SetObject(ComPtr<IUnknown>::Adopt(made->GetUnknown()));
}

// Tells the object of ITEM, and first those below it, that they are being removed; answers the
// first failure.
HRESULT AnnounceRemoval(ProjectItem& item) {
    HRESULT first = S_OK;
    for (const auto& child : item.Children()) {
        const HRESULT hr = AnnounceRemoval(*child.Get());
        if (SUCCEEDED(first) && FAILED(hr))
            first = hr;
    }
    if (const auto object = qv::com::QueryAs<IqxItemUI>(item.Object())) {
        const HRESULT hr = object->Remove();
        if (SUCCEEDED(first) && FAILED(hr))
            first = hr;
    }
    return first;
}
// The target at or above ITEM; null when there is none.
const ProjectItem* TargetAbove(const ProjectItem& item) {
    for (const ProjectItem* at = &item; at != nullptr; at = at->Parent()) {
        if (IsEqualGUID(at->Type(), kTargetType))
            return at;
    }
    return nullptr;
}

// Tells the objects of ITEM and of everything below it (ITEM's first) that EVENT moved them; the
// first failure is answered after all were told.
HRESULT AnnounceMove(ProjectItem& item, const WbProjectItemEvent& event) {
    HRESULT first = S_OK;
    if (const auto observer = qv::com::QueryAs<IwbProjectItemObserver>(item.Object()))
        first = observer->OnProjectItemEvents(1, &event);
    // The list may change while an object is told; walk a held copy.
    const auto children = item.Children();
    for (const auto& child : children) {
        const HRESULT hr = AnnounceMove(*child.Get(), event);
        if (SUCCEEDED(first) && FAILED(hr))
            first = hr;
    }
    return first;
}
} // namespace

Project::Project(resources::ResourceService& service, std::u16string name) : service_(service) {
    ProjectItemObject* root = nullptr;
    ProjectItemObject::CreateInstance(&root, this, kProjectType, qv::kern::MakeGUID(),
                                      std::move(name));
    root_ = ComPtr<ProjectItem>::Adopt(root);
    CQVComObject<ItemUIMap>* map = nullptr;
    CQVComObject<ItemUIMap>::CreateInstance(&map);
    uiMap_ = ComPtr<IwbProjectItemUIMap>::Adopt(map);
    if (!root_ || !uiMap_)
        throw std::bad_alloc();
    GiveFolderObject(*root_.Get());
}

Project::~Project() {
    DetachProviders();
    for (const auto& target : targets_) {
        if (TargetObject* object = TargetOf(*target.Get())) {
            object->Clear();
            // The items' watches and reservations hold the items; the trees were this
            // project's alone.
            object->Target().tree->Shutdown();
        }
    }
    root_->Close();
}

TargetObject* Project::TargetOf(const ProjectItem& item) const {
    const bool isTarget = std::any_of(targets_.begin(), targets_.end(),
                                      [&](const auto& each) { return each.Get() == &item; });
    if (!isTarget)
        return nullptr;
    const auto change = qv::com::QueryAs<IwbTargetItemChange>(item.Object());
    return change ? static_cast<TargetObject*>(change.Get()) : nullptr;
}

ComPtr<ProjectItem> Project::AddTarget(std::u16string name, const std::string& description,
                                       std::string* error) {
    ComPtr<ProjectItem> item = root_->AddChild(kTargetType, qv::kern::MakeGUID(), std::move(name));
    if (!item)
        throw std::bad_alloc();
    if (FAILED(AttachTarget(*item.Get(), description, error))) {
        root_->RemoveChild(item.Get());
        return {};
    }
    return item;
}

HRESULT Project::AttachTarget(ProjectItem& item, const std::string& description,
                              std::string* error) {
    int32_t status = 0;
    resources::Target* target =
        description.empty() ? nullptr : service_.LoadTargetFile(description, &status);
    if (target == nullptr) {
        SetError(error, "cannot load the resource description \"" + description + "\" of \"" +
                            qv::kern::WideToUtf8(item.Name()) + "\"");
        return E_FAIL;
    }
    TargetObjectInstance* made = nullptr;
    if (FAILED(TargetObjectInstance::CreateInstance(&made, &item, target)))
        throw std::bad_alloc();
    auto object = ComPtr<TargetObjectInstance>::Adopt(made);
    item.SetObject(ComPtr<IUnknown>::Share(object->GetUnknown()));
    item.SetDescriptionFile(description);
    targets_.push_back(ComPtr<ProjectItem>::Share(&item));
    return S_OK;
}

HRESULT Project::MakeObject(ProjectItem& item, bool reloaded) {
    if (IsEqualGUID(item.Type(), wbproj::kFolderType)) {
        GiveFolderObject(item);
        return S_OK;
    }
    if (IsEqualGUID(item.Type(), kTargetType) || IsEqualGUID(item.Type(), kProjectType))
        return E_INVALIDARG;
    if (!factory_)
        return S_OK;
    ComPtr<IUnknown> object;
    IUnknown* const state = reloaded ? static_cast<IUnknown*>(&item.Bag()) : nullptr;
    HRESULT hr = factory_(item, item.Type(), state, object);
    if (SUCCEEDED(hr) && object) {
        // As the framework does: the item knows its object before the object is initialised
        // (once) and bound, since binding walks up from the item through the item objects. An
        // object that does not bind stays, so the item keeps its behaviour and its status.
        item.SetObject(object);
        if (const auto itemUI = object.As<IqxItemUI>())
            hr = itemUI->Initialize();
        if (const auto bindable = object.As<IqxBindable>(); SUCCEEDED(hr) && bindable)
            hr = bindable->Bind(&item);
    }
    item.SetBindStatus(FAILED(hr) ? hr : S_OK);
    return FAILED(hr) ? hr : S_OK;
}

HRESULT Project::CreateItem(ProjectItem& parent, const GUID& type, std::u16string name,
                            const PropertyBag::Map& properties, ComPtr<ProjectItem>* made) {
    ComPtr<ProjectItem> item = parent.AddChild(type, qv::kern::MakeGUID(), std::move(name));
    if (!item)
        return E_OUTOFMEMORY;
    for (const auto& [key, property] : properties)
        item->Bag().Put(key, property);
    if (const HRESULT hr = MakeObject(*item.Get(), !properties.empty()); FAILED(hr)) {
        // A child whose object refused it would be saved with no behaviour: drop it.
        AnnounceRemoval(*item.Get());
        parent.RemoveChild(item.Get());
        return hr;
    }
    if (made != nullptr)
        *made = std::move(item);
    return S_OK;
}

HRESULT Project::RemoveItem(ProjectItem& item) {
    ProjectItem* const parent = item.Parent();
    if (parent == nullptr || IsEqualGUID(item.Type(), kTargetType))
        return E_INVALIDARG;
    if (FindById(item.Id()) != &item)
        return S_FALSE;
    // Held: the parent's list holds the last reference the host has.
    const ComPtr<ProjectItem> held = ComPtr<ProjectItem>::Share(&item);
    const HRESULT announced = AnnounceRemoval(item);
    parent->RemoveChild(&item);
    return FAILED(announced) ? announced : S_OK;
}

HRESULT Project::MoveItem(ProjectItem& item, ProjectItem& newParent) {
    ProjectItem* const oldParent = item.Parent();
    if (oldParent == nullptr || IsEqualGUID(item.Type(), kTargetType))
        return E_INVALIDARG;
    if (FindById(item.Id()) != &item || FindById(newParent.Id()) != &newParent)
        return S_FALSE;
    for (const ProjectItem* at = &newParent; at != nullptr; at = at->Parent()) {
        if (at == &item)
            return E_INVALIDARG; // into itself
    }
    if (oldParent == &newParent)
        return S_OK;
    if (const HRESULT allowed = AllowsChild(newParent, item.Type()); allowed != S_OK)
        return FAILED(allowed) ? allowed : E_ACCESSDENIED;
    const bool otherTarget = TargetAbove(*oldParent) != TargetAbove(newParent);
    newParent.AdoptChild(oldParent->ReleaseChild(&item));
    // Items that change target ask for their resources there now, behind the items already
    // there; reopening binds in this order, so it must say so, or the statuses would turn.
    if (otherTarget)
        Resequence(item);
    const WbProjectItemEvent event{wbproj::item_event::kMoved, &item, oldParent, &newParent};
    return AnnounceMove(item, event);
}

void Project::Resequence(ProjectItem& item) {
    item.SetSequence(NextSequence());
    for (const auto& child : item.Children())
        Resequence(*child.Get());
}

HRESULT Project::AllowsChild(ProjectItem& parent, const GUID& type) {
    for (const auto& provider : providers_) {
        const auto validator = qv::com::QueryAs<IwbChildValidator>(provider.Get());
        if (!validator)
            continue;
        // The common answer, then the provider's own check of the place.
        if (const HRESULT hr = validator->ValidateChild(&parent, type); hr != S_OK)
            return hr;
        if (const HRESULT hr = validator->CheckItem(&parent); hr != S_OK)
            return hr;
    }
    return S_OK;
}

ProjectItem* Project::FindById(const GUID& id) {
    std::function<ProjectItem*(ProjectItem&)> find = [&](ProjectItem& item) -> ProjectItem* {
        if (IsEqualGUID(item.Id(), id))
            return &item;
        for (const auto& child : item.Children())
            if (ProjectItem* found = find(*child.Get()))
                return found;
        return nullptr;
    };
    return find(*root_.Get());
}

SavedProject Project::Snapshot() const {
    // Items are written in the order they came into the project (a parent always before its
    // children), and reopening makes and binds them in that order: whichever item reserved a
    // resource first reserves it first again, so every item comes back with its status.
    std::vector<const ProjectItem*> items;
    std::function<void(const ProjectItem&)> collect = [&](const ProjectItem& item) {
        items.push_back(&item);
        for (const auto& child : item.Children())
            collect(*child.Get());
    };
    collect(*root_.Get());
    std::stable_sort(items.begin(), items.end(), [](const ProjectItem* a, const ProjectItem* b) {
        return a->Sequence() < b->Sequence();
    });
    // A moved item may now lie below a folder made after it. The folders on its way are
    // written just before it then, so parents still come first and the items keep their order.
    std::vector<const ProjectItem*> ordered;
    std::unordered_set<const ProjectItem*> placed;
    std::function<void(const ProjectItem*)> place = [&](const ProjectItem* item) {
        if (item == nullptr || placed.count(item) != 0)
            return;
        place(item->Parent());
        placed.insert(item);
        ordered.push_back(item);
    };
    for (const ProjectItem* item : items)
        place(item);
    std::unordered_map<const ProjectItem*, size_t> indexOf;
    SavedProject saved;
    for (const ProjectItem* item : ordered) {
        SavedItem entry;
        entry.id = item->Id();
        entry.type = item->Type();
        entry.flags = item->Flags();
        entry.name = item->Name();
        entry.parent =
            item->Parent() != nullptr ? indexOf.at(item->Parent()) : SavedItem::kNoParent;
        entry.descriptionFile = item->DescriptionFile();
        entry.properties = item->Bag().Properties();
        indexOf.emplace(item, saved.items.size());
        saved.items.push_back(std::move(entry));
    }
    return saved;
}

HRESULT Project::AttachProvider(ComPtr<IwbProjectProvider> provider, bool reloaded) {
    if (!provider)
        return E_POINTER;
    IUnknown* const project = &Root();
    const HRESULT hr = reloaded ? provider->AttachReloaded(project) : provider->Attach(project);
    if (FAILED(hr))
        return hr;
    providers_.push_back(std::move(provider));
    return S_OK;
}

void Project::DetachProviders() {
    // Taken out first: a provider that detaches may reach the project again.
    auto providers = std::move(providers_);
    providers_.clear();
    for (auto each = providers.rbegin(); each != providers.rend(); ++each)
        (*each)->Detach();
}

bool Project::Save(const std::string& path, std::string* error,
                   const std::function<bool()>& beforeRename) {
    // Another file (a new project's, or a copy's) is locked before anything else: replacing it
    // in the middle of another process's change would lose that change.
    ProjectLock other;
    const bool held = !lock_.Path().empty() && lock_.Path() == path;
    if (!held && !other.Acquire(path, error))
        return false;
    ProjectLock& lock = held ? lock_ : other;
    // Providers write their items' last state into the properties now, so the snapshot is taken
    // only after every one of them agreed.
    for (const auto& provider : providers_) {
        if (const HRESULT hr = provider->ProjectSaving(); FAILED(hr)) {
            SetError(error, "a provider refused to save the project to \"" + path + "\" (status " +
                                HexStatus(hr) + ")");
            return false;
        }
    }
    if (!WriteFileAtomically(path, FormatProject(Snapshot()), error, beforeRename, &lock))
        return false;
    if (!held)
        lock_ = std::move(other);
    // The file is in place whatever a provider answers now.
    for (const auto& provider : providers_)
        provider->ProjectSaved();
    return true;
}

std::unique_ptr<Project> Project::Open(const std::string& path, resources::ResourceService& service,
                                       std::string* error, ObjectFactory factory) {
    ProjectLock lock;
    if (!lock.Acquire(path, error))
        return nullptr;
    std::string text;
    if (!ReadWholeFile(path, text, error))
        return nullptr;
    SavedProject saved;
    std::string message;
    if (!ParseProject(text, saved, &message)) {
        SetError(error, path + ": " + message);
        return nullptr;
    }
    auto project = std::make_unique<Project>(service, saved.items.front().name);
    project->factory_ = std::move(factory);
    if (!project->Build(saved, &message)) {
        SetError(error, path + ": " + message);
        return nullptr;
    }
    project->lock_ = std::move(lock);
    return project;
}

bool Project::Build(const SavedProject& saved, std::string* error) {
    // The root keeps its saved identity: items refer to their parents by identifier.
    ProjectItemObject* root = nullptr;
    ProjectItemObject::CreateInstance(&root, this, saved.items[0].type, saved.items[0].id,
                                      saved.items[0].name);
    if (root == nullptr)
        throw std::bad_alloc();
    root_->Close();
    root_ = ComPtr<ProjectItem>::Adopt(root);
    GiveFolderObject(*root_.Get());
    std::vector<ProjectItem*> made{root_.Get()};
    for (size_t i = 0; i < saved.items.size(); ++i) {
        const SavedItem& entry = saved.items[i];
        ComPtr<ProjectItem> item;
        if (i == 0) {
            item = root_;
        } else {
            item = made[entry.parent]->AddChild(entry.type, entry.id, entry.name);
            if (!item)
                throw std::bad_alloc();
            made.push_back(item.Get());
        }
        item->SetFlags(entry.flags);
        for (const auto& [name, property] : entry.properties)
            item->Bag().Put(name, property);
        if (i == 0)
            continue;
        if (!IsEqualGUID(entry.type, kTargetType)) {
            // An item that does not bind stays as it was read: its status says why, and saving
            // writes back what it had.
            MakeObject(*item.Get(), true);
            continue;
        }
        if (FAILED(AttachTarget(*item.Get(), entry.descriptionFile, error)))
            return false;
    }
    return true;
}

} // namespace wbhost::project
