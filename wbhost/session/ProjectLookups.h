// How runners and the runtime find things in the open project: through a link the session
// points at its project and clears when it closes, so a runner or resolver that outlives the
// project answers "none" instead of reaching freed items.
#pragma once

#include "project/Project.h"
#include "runner/HostProgramRunner.h"
#include "runtime/HostObjects.h"

#include <memory>

namespace wbhost::session {

// The open project, or null when none is.
struct ProjectLink {
    project::Project* project = nullptr;
};

// Finds items of LINK's project by identifier; 1 and null when there is no project or no such
// item.
runner::ProjectItemFinder FinderFor(std::shared_ptr<const ProjectLink> link);

// Answers the target item behind an application reference: a refnum of a target's resource tree,
// or of a project item (or of the object a provider made for one) at or below a target. Unknown
// refnums answer kWBArgErr; no project, or an object outside every target, kWBGenericErr.
runtime::TargetItemResolver ResolverFor(std::shared_ptr<const ProjectLink> link);

} // namespace wbhost::session
