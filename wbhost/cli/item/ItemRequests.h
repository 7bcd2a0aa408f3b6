// What the project tree's requests to an item share on the command line: the item's object
// asked for one of its interfaces, a status told as the host tells it, and whether a request
// changed what the project would save.
#pragma once

#include "cli/ItemCommands.h"
#include "com/ComPtr.h"
#include "project/Project.h"

#include <string>

namespace wbhost::cli {

// The item's object as I; when it has none, or it does not offer I, says so on ERR (the object
// cannot do WHAT) and answers null.
template <class I> qv::com::ComPtr<I> ItemObjectAs(ItemActionContext& context, const char* what) {
    auto object = qv::com::QueryAs<I>(context.item.Object());
    if (!object)
        context.err << "wbhost: the item's object cannot " << what << "\n";
    return object;
}

// Tells on ERR that WHAT failed with STATUS, prints the program runs when they were asked for,
// and refuses.
ItemOutcome RefuseWithStatus(ItemActionContext& context, const std::string& what, HRESULT status);

// What the project would save now, to compare before and after a request: the request changed
// something exactly when the two differ.
std::string SavedForm(const project::Project& project);

} // namespace wbhost::cli
