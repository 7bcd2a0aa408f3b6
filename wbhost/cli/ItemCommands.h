// The work behind `wbhost item PROJECT --target T ITEM ACTION ...`: one item of a target acted
// on as the project tree acts on it. Each action lives in a file of its own under cli/item and
// registers itself (ItemActionRegistrar); the frame opens the project, finds the item, runs the
// action and saves only when the action changed something.
#pragma once

#include "cli/HostOptions.h"

#include <functional>
#include <iosfwd>
#include <map>
#include <string>
#include <vector>

namespace wbhost::cli {

// What an action works on. The project is open (and locked) in SESSION.
struct ItemActionContext {
    const HostOptions& host;
    session::HostSession& session;
    project::Project& project;
    project::ProjectItem& target;
    project::ProjectItem& item;
    const std::vector<std::string>& arguments;         // after the action's name
    const std::map<std::string, std::string>& options; // the action's options given
    std::ostream& out;
    std::ostream& err;
};

// How an action ended: nothing to save, a change to save, or refused (told on ERR; the project
// is not saved, so every file stays as it was).
enum class ItemOutcome { Unchanged, Changed, Refused };

// An option of one action ("--to-target"), taking one value.
struct ItemActionOption {
    std::string name;      // with its dashes
    std::string valueName; // for the usage ("TARGET")
    std::string help;
};

struct ItemAction {
    std::string name;      // the word after ITEM ("rename")
    std::string arguments; // for the usage ("NEWNAME")
    std::string help;      // one line
    size_t minArguments = 0;
    size_t maxArguments = 0;
    std::vector<ItemActionOption> options;
    std::function<ItemOutcome(ItemActionContext&)> run;
};

// Registers ACTION from a static object of the action's file.
struct ItemActionRegistrar {
    explicit ItemActionRegistrar(ItemAction action);
};

// The registered actions, by name.
const std::map<std::string, ItemAction>& ItemActions();

// What `wbhost item` was asked.
struct ItemRequest {
    std::string target; // the target's name
    std::string item;   // the item's place below it ("Folder/Name")
    std::string action;
    std::vector<std::string> arguments;
    std::map<std::string, std::string> options; // action options given, by name
};

// Checks REQUEST against its action (known action, count of arguments, options it takes);
// false with the reason in ERROR.
bool CheckItemRequest(const ItemRequest& request, std::string& error);

// Opens PROJECTPATH, finds the target and item of REQUEST, runs its action and saves the
// project atomically when the action changed something. kExitOk when it did its work (changed
// or not); kExitFailed, every file left as it was, when the project, target or item cannot be
// found, the action is refused or the save fails.
int RunItem(const HostOptions& options, const std::string& projectPath, const ItemRequest& request,
            std::ostream& out, std::ostream& err);

} // namespace wbhost::cli
