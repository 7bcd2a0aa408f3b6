// The work behind `wbhost project new|list|add-item`: a project file made, shown and given
// items through the loaded module's provider.
#pragma once

#include "cli/HostOptions.h"

#include <iosfwd>
#include <string>
#include <vector>

namespace wbhost::cli {

// Exit codes of the project and edit commands.
enum ProjectExit : int { kProjectOk = 0, kProjectFailed = 1 };

// Creates the project file PROJECTPATH with one target per "NAME=DESCRIPTION" text of TARGETS
// (descriptions kept by absolute path) and writes its item tree to OUT. Refuses, touching
// nothing, when the file exists and REPLACE is false, when a target text is malformed or a
// name repeats, when a description does not load, or when the save fails; loader problems of a
// description that loads are shown on ERR as warnings.
int RunProjectNew(const HostOptions& options, const std::string& projectPath,
                  const std::vector<std::string>& targets, bool replace, std::ostream& out,
                  std::ostream& err);

// Opens PROJECTPATH and writes its item tree to OUT; kProjectFailed when it cannot be opened.
int RunProjectList(const HostOptions& options, const std::string& projectPath, std::ostream& out,
                   std::ostream& err);

// Opens PROJECTPATH and writes it to OUT as JSON (see WriteProjectJson); kProjectFailed when it
// cannot be opened.
int RunProjectJson(const HostOptions& options, const std::string& projectPath, std::ostream& out,
                   std::ostream& err);

// What `project add-item` asks for.
struct AddItemRequest {
    std::string target;   // the target's name
    std::string resource; // the resource's path in the target's tree
    std::string name;     // the item's place and name ("Folder/Name"); empty: the resource's name
    std::vector<std::string> attributes = {}; // further attributes of the item, "ATTRIBUTE=VALUE"
};

// Adds a Tangent I/O item for REQUEST to the project PROJECTPATH as the project tree does: the
// provider's create-new wizard is bound to the target and run, its program answering the item's
// attribute set (unless the session's answers say otherwise: a cancelled wizard adds nothing and
// succeeds, without saving); the module creates the folders and the item. Then saves the project
// and writes the target's items to OUT. Fails, leaving the file as it was, when the target or
// the resource does not exist, the name is empty or taken (below its folder, or by an I/O item
// anywhere in the target), a path part names an item that is no folder, an attribute is
// malformed, or the wizard fails.
int RunAddItem(const HostOptions& options, const std::string& projectPath,
               const AddItemRequest& request, std::ostream& out, std::ostream& err);

// Adds the Tangent I/O items that the item list file LISTPATH names (see ItemList.h) below the
// target TARGET of the project PROJECTPATH in one bulk creation by the module (TIO_CreateMultiple),
// then saves. Every line is checked first (its form, its resource in the target, its name against
// the target's items and the list's other lines, its text in the host's code page): a bad line is
// reported as LISTPATH:LINE:COLUMN and nothing is created. A failing creation saves nothing.
int RunAddItems(const HostOptions& options, const std::string& projectPath,
                const std::string& target, const std::string& listPath, std::ostream& out,
                std::ostream& err);

// Removes the item ITEMPATH ("Folder/Name", folders too, with what is below them) from the
// target TARGET of the project PROJECTPATH as the project tree does: each item's object hears
// its removal (it lets go of its resource) before the item goes; then saves and writes the
// target's items to OUT. Fails, leaving the file as it was, when the target or item is unknown.
int RunRemoveItem(const HostOptions& options, const std::string& projectPath,
                  const std::string& target, const std::string& itemPath, std::ostream& out,
                  std::ostream& err);

} // namespace wbhost::cli
