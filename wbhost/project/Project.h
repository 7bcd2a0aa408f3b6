// A project of the embedded host: a tree of items under a root (targets with their resource
// trees, folders, and the items providers make), saved to and reopened from a project file.
#pragma once

#include "com/ComPtr.h"
#include "host/contracts/IwbProjectItemUIMap.h"
#include "host/contracts/IwbProjectProvider.h"
#include "project/ProjectFormat.h"
#include "project/ProjectItem.h"
#include "project/ProjectLock.h"
#include "project/TargetObject.h"
#include "resources/ResourceService.h"

#include <functional>
#include <memory>
#include <string>
#include <vector>

namespace wbhost::project {

// Item types of the host's own items.
inline constexpr GUID kProjectType = qv::com::ParseGuid("CD645BF2-83EE-4D8F-9768-1ACEEB221DF0");
inline constexpr GUID kTargetType = qv::com::ParseGuid("9C188982-C57D-47B0-A23B-2662AE1837CC");

class Project {
public:
    // Makes the object of ITEM, whose type is neither a folder nor a target, into OBJECT
    // (left empty: the item has none); the project then initialises and binds it. SAVEDSTATE is
    // the item's reloaded property bag when the project is being opened, null for a new item. A
    // failure refuses the item.
    using ObjectFactory =
        std::function<HRESULT(IwbProjectItem& item, const GUID& type, IUnknown* savedState,
                              qv::com::ComPtr<IUnknown>& object)>;

    // An empty project called NAME whose targets load through SERVICE (which must outlive it).
    explicit Project(resources::ResourceService& service, std::u16string name = u"Project");
    // Detaches the providers, then closes every item, so references held elsewhere reach
    // detached items.
    ~Project();
    Project(const Project&) = delete;
    Project& operator=(const Project&) = delete;

    // The root item (the project itself).
    ProjectItem& Root() noexcept { return *root_.Get(); }
    // Loads the resource description in the file DESCRIPTION and adds it as a target called
    // NAME under the root. Null, with a message in ERROR (may be null), when it does not load.
    qv::com::ComPtr<ProjectItem> AddTarget(std::u16string name, const std::string& description,
                                           std::string* error);
    // The target items, in the order they were added.
    const std::vector<qv::com::ComPtr<ProjectItem>>& Targets() const noexcept { return targets_; }
    // The object of target item ITEM; null for other items.
    TargetObject* TargetOf(const ProjectItem& item) const;

    // Who makes the objects of items of other types (a provider, or a test); none by default.
    void SetObjectFactory(ObjectFactory factory) { factory_ = std::move(factory); }
    // Makes ITEM's object for its type: folders get the host's folder object, targets cannot be
    // made this way (E_INVALIDARG: a target needs its description), others go to the factory,
    // with the item's bag as saved state when RELOADED. An object that was made but did not bind
    // is kept (with the status recorded on ITEM) and the status answered.
    HRESULT MakeObject(ProjectItem& item, bool reloaded = false);
    // Adds an item of TYPE called NAME below PARENT whose properties start as PROPERTIES (what
    // its object reads when it binds), then makes its object. When the object fails, the item
    // is removed again (its object told first) and the failure answered. MADE (optional)
    // receives the item.
    HRESULT CreateItem(ProjectItem& parent, const GUID& type, std::u16string name,
                       const PropertyBag::Map& properties,
                       qv::com::ComPtr<ProjectItem>* made = nullptr);
    // Removes ITEM and everything below it from the project: every object hears its removal
    // (IqxItemUI::Remove), children before their parent, before the items go. E_INVALIDARG for
    // the root or a target (targets stay with their description), S_FALSE for an item of
    // another project. An object's failure is answered after the items are gone.
    HRESULT RemoveItem(ProjectItem& item);
    // Moves ITEM, with everything below it, to the end of NEWPARENT's children, then tells the
    // object of ITEM and of each item below it (IwbProjectItemObserver, a move event naming ITEM
    // and both parents). Every attached provider that validates children is asked first whether
    // ITEM's type may go under NEWPARENT; a refusal answers E_ACCESSDENIED and moves nothing.
    // E_INVALIDARG for the root, a target or a move into ITEM itself; S_FALSE when either item
    // is not of this project; S_OK, telling nobody, when NEWPARENT is ITEM's parent already. An
    // object's failure is answered after the move. Items that change target come last in the
    // order items came into the project (see Snapshot), as they asked for their resources last.
    HRESULT MoveItem(ProjectItem& item, ProjectItem& newParent);
    // Whether every attached provider that validates children lets an item of TYPE go under
    // PARENT: S_OK, S_FALSE (refused) or a provider's failure.
    HRESULT AllowsChild(ProjectItem& parent, const GUID& type);
    // The map from information records to objects.
    const qv::com::ComPtr<IwbProjectItemUIMap>& UIMap() const noexcept { return uiMap_; }
    // The item with identifier ID, or null.
    ProjectItem* FindById(const GUID& id);

    // Attaches PROVIDER to this project (through Attach, or AttachReloaded for a project that was
    // opened from its file, with the root item as the project object) and keeps it, to be told of
    // saves, until DetachProviders. Its failure is answered and it is not kept; null: E_POINTER.
    HRESULT AttachProvider(qv::com::ComPtr<IwbProjectProvider> provider, bool reloaded);
    // Detaches every attached provider, the last attached first. Nothing when none is.
    void DetachProviders();

    // Everything the project file keeps, in the order the items came into the project (parents
    // before children).
    SavedProject Snapshot() const;
    // The next number of the order in which items come into the project.
    uint64_t NextSequence() noexcept { return nextSequence_++; }
    // Writes the project to PATH atomically (see WriteFileAtomically): every attached provider
    // hears ProjectSaving first (a failure stops the save before anything is written and says
    // which status) and, once the file is in place, ProjectSaved. False with a message in ERROR
    // (may be null) when it could not. BEFORERENAME as there. The project keeps its file locked
    // from then on (see ProjectLock); a file it does not hold yet is locked first, waiting for
    // another process's change to it to finish.
    bool Save(const std::string& path, std::string* error,
              const std::function<bool()>& beforeRename = {});
    // Reads the project file PATH into a new project whose targets load through SERVICE and
    // whose other objects FACTORY makes. Null with a message in ERROR (may be null) when the
    // file cannot be read, is malformed or a target's description does not load; nothing else
    // is touched then. An item whose object does not bind stays, with its status recorded and
    // its properties as they were read, so saving the project loses nothing of it. The file is
    // locked before it is read and stays locked, so that no other process changes it before
    // this project's save; another process's lock is waited for (ProjectLock::kWait), then the
    // open is refused.
    static std::unique_ptr<Project> Open(const std::string& path,
                                         resources::ResourceService& service, std::string* error,
                                         ObjectFactory factory = {});

private:
    // Puts ITEM and everything below it (parents first) at the end of the order in which items
    // came into the project.
    void Resequence(ProjectItem& item);
    bool Build(const SavedProject& saved, std::string* error);
    // Loads DESCRIPTION and makes ITEM the target that owns its tree.
    HRESULT AttachTarget(ProjectItem& item, const std::string& description, std::string* error);
    resources::ResourceService& service_;
    qv::com::ComPtr<ProjectItem> root_;
    qv::com::ComPtr<IwbProjectItemUIMap> uiMap_;
    std::vector<qv::com::ComPtr<ProjectItem>> targets_;
    std::vector<qv::com::ComPtr<IwbProjectProvider>> providers_;
    ObjectFactory factory_;
    uint64_t nextSequence_ = 0;
    ProjectLock lock_;
};

} // namespace wbhost::project
