// The helpers of the project tree's requests.
#include "cli/item/ItemRequests.h"

#include "project/HexStatus.h"
#include "project/ProjectFormat.h"

#include <ostream>

namespace wbhost::cli {

ItemOutcome RefuseWithStatus(ItemActionContext& context, const std::string& what, HRESULT status) {
    context.err << "wbhost: " << what << " failed (status " << HexStatus(status)
                << "); nothing was changed\n";
    // The frame prints the program runs only for work that went through; a failed dialog's
    // runs and the references it left (none, or a fault) matter most.
    FinishSession(context.host, context.session, context.out);
    return ItemOutcome::Refused;
}

std::string SavedForm(const project::Project& project) {
    return project::FormatProject(project.Snapshot());
}

} // namespace wbhost::cli
