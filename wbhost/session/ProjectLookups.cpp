// Lookups in the open project for runners and the runtime.
#include "session/ProjectLookups.h"

#include "runtime/RefnumTable.h"

#include <functional>

namespace wbhost::session {

using project::Project;
using project::ProjectItem;
using qv::com::ComPtr;

namespace {

bool IsIdentity(IUnknown* object, IUnknown* identity) {
    return object != nullptr && qv::com::QueryAs<IUnknown>(object).Get() == identity;
}

// The item that is IDENTITY, or whose object is, below and including ITEM.
ProjectItem* FindByIdentity(ProjectItem& item, IUnknown* identity) {
    if (IsIdentity(static_cast<IwbProjectItem*>(&item), identity) ||
        IsIdentity(item.Object(), identity))
        return &item;
    for (const auto& child : item.Children())
        if (ProjectItem* found = FindByIdentity(*child.Get(), identity))
            return found;
    return nullptr;
}

ProjectItem* TargetByTreeRefnum(const Project& project, WBRefNum refnum) {
    for (const auto& target : project.Targets()) {
        const project::TargetObject* object = project.TargetOf(*target.Get());
        if (object != nullptr && object->Target().refnum == refnum)
            return target.Get();
    }
    return nullptr;
}

ProjectItem* EnclosingTarget(const Project& project, ProjectItem* item) {
    while (item != nullptr && project.TargetOf(*item) == nullptr)
        item = item->Parent();
    return item;
}

} // namespace

runner::ProjectItemFinder FinderFor(std::shared_ptr<const ProjectLink> link) {
    return [link](const GUID& id, IwbProjectItem** item) -> HRESULT {
        *item = nullptr;
        ProjectItem* found = link->project ? link->project->FindById(id) : nullptr;
        if (found == nullptr)
            return S_FALSE;
        found->AddRef();
        *item = found;
        return S_OK;
    };
}

runtime::TargetItemResolver ResolverFor(std::shared_ptr<const ProjectLink> link) {
    return [link](WBRefNum appRef, void** item) -> WBErr {
        *item = nullptr;
        ComPtr<IUnknown> object;
        if (FAILED(runtime::RefnumTable::Instance().Query(appRef, IUnknown::iid, object.PutVoid())))
            return kWBArgErr;
        Project* const project = link->project;
        if (project == nullptr)
            return kWBGenericErr;
        ProjectItem* target = TargetByTreeRefnum(*project, appRef);
        if (target == nullptr)
            target = EnclosingTarget(*project, FindByIdentity(project->Root(), object.Get()));
        if (target == nullptr)
            return kWBGenericErr;
        target->AddRef();
        *item = static_cast<IwbProjectItem*>(target);
        return kWBNoErr;
    };
}

} // namespace wbhost::session
