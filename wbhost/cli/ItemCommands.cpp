// The frame of `wbhost item`.
#include "cli/ItemCommands.h"

#include "cli/ExitStatus.h"
#include "cli/HostText.h"
#include "cli/ItemPlace.h"

#include <ostream>

namespace wbhost::cli {
namespace {

std::map<std::string, ItemAction>& Registry() {
    static std::map<std::string, ItemAction> actions;
    return actions;
}

} // namespace

ItemActionRegistrar::ItemActionRegistrar(ItemAction action) {
    std::string name = action.name;
    Registry().emplace(std::move(name), std::move(action));
}

const std::map<std::string, ItemAction>& ItemActions() {
    return Registry();
}

bool CheckItemRequest(const ItemRequest& request, std::string& error) {
    const auto found = ItemActions().find(request.action);
    if (found == ItemActions().end()) {
        error = "unknown item action \"" + request.action + "\" (";
        for (const auto& [name, action] : ItemActions())
            error += (error.back() == '(' ? "" : ", ") + name;
        error += ")";
        return false;
    }
    const ItemAction& action = found->second;
    const std::string usage = "usage: item PROJECT --target T ITEM " + action.name +
                              (action.arguments.empty() ? "" : " " + action.arguments);
    const size_t count = request.arguments.size();
    if (count < action.minArguments || count > action.maxArguments) {
        error = usage;
        return false;
    }
    for (const auto& [name, value] : request.options) {
        bool known = false;
        for (const ItemActionOption& option : action.options)
            known = known || option.name == name;
        if (!known) {
            error = name + " does not go with " + action.name + "; " + usage;
            return false;
        }
    }
    return true;
}

int RunItem(const HostOptions& options, const std::string& projectPath, const ItemRequest& request,
            std::ostream& out, std::ostream& err) {
    std::string error;
    if (!CheckItemRequest(request, error)) {
        err << "wbhost: " << error << "\n";
        return kExitFailed;
    }
    session::HostSession session;
    project::ProjectItem* const target =
        OpenProjectTarget(options, session, projectPath, request.target, err);
    if (target == nullptr)
        return kExitFailed;
    project::Project& project = *session.Project();
    project::ProjectItem* item = ItemAt(*target, FromUtf8(request.item));
    if (item == nullptr) {
        err << "wbhost: target \"" << request.target << "\" has no item \"" << request.item
            << "\"\n";
        return kExitFailed;
    }
    ItemActionContext context{options,           session,         project, *target, *item,
                              request.arguments, request.options, out,     err};
    const ItemOutcome outcome = ItemActions().at(request.action).run(context);
    if (outcome == ItemOutcome::Refused)
        return kExitFailed;
    if (outcome == ItemOutcome::Changed && !session.Save(projectPath, &error)) {
        err << "wbhost: " << error << "\n";
        return kExitFailed;
    }
    FinishSession(options, session, out);
    return kExitOk;
}

} // namespace wbhost::cli
