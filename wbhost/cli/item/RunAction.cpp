// `wbhost item ... run COMMAND`: one of the item's commands, by name or GUID, as the project
// tree runs it when its menu entry is chosen; its dialogs answer from the session.
#include "cli/HostText.h"
#include "cli/item/ItemRequests.h"
#include "framework/IqxItemUI.h"
#include "items/TIOItemCommands.h"
#include "kern/GuidText.h"
#include "kern/exception/Exception.h"

#include <optional>
#include <ostream>
#include <utility>
#include <vector>

namespace wbhost::cli {
namespace {

// COMMAND as a GUID: a name the host knows, or the GUID's text; nothing when it is neither.
std::optional<GUID> CommandGuid(const std::string& command) {
    if (command == "select-resource")
        return tio::kSelectResourceCommand;
    if (command == "explain-error")
        return tio::kExplainErrorCommand;
    try {
        return qv::kern::StringToGuid(std::string_view(command));
    } catch (const qv::kern::exception::Exception&) {
        return std::nullopt;
    }
}

// Every item below and including ITEM with how often the project tree was asked to select it.
void CountSelections(const project::ProjectItem& item,
                     std::vector<std::pair<const project::ProjectItem*, int>>& counts) {
    counts.emplace_back(&item, item.SelectCount());
    for (const auto& child : item.Children())
        CountSelections(*child.Get(), counts);
}

// Tells which items the command had the project tree select and bring into view.
void TellSelections(ItemActionContext& context,
                    const std::vector<std::pair<const project::ProjectItem*, int>>& before) {
    for (const auto& [item, count] : before) {
        if (item->SelectCount() > count)
            context.out << "the project tree selects and shows \"" << ToUtf8(item->Name())
                        << "\"\n";
    }
}

ItemOutcome Run(ItemActionContext& context) {
    const std::string& command = context.arguments.front();
    const std::optional<GUID> guid = CommandGuid(command);
    if (!guid) {
        context.err << "wbhost: \"" << command
                    << "\" is no command: give select-resource, explain-error or a command GUID "
                       "such as {A117026A-AD51-4C63-8341-085C842D9F23}\n";
        return ItemOutcome::Refused;
    }
    const auto object = ItemObjectAs<IqxItemUI>(context, "run commands");
    if (!object)
        return ItemOutcome::Refused;
    const std::string before = SavedForm(context.project);
    const std::u16string name = context.item.Name();
    std::vector<std::pair<const project::ProjectItem*, int>> selections;
    CountSelections(context.project.Root(), selections);
    const HRESULT hr = object->ExecuteCommand(*guid);
    if (FAILED(hr))
        return RefuseWithStatus(context, "the command " + command, hr);
    if (hr != S_OK) {
        context.err << "wbhost: the item has no command " << command << "\n";
        return ItemOutcome::Refused;
    }
    TellSelections(context, selections);
    if (context.item.Name() != name)
        context.out << "\"" << ToUtf8(name) << "\" is now called \"" << ToUtf8(context.item.Name())
                    << "\"\n";
    const bool changed = SavedForm(context.project) != before;
    context.out << "ran " << command << " on \"" << ToUtf8(name) << "\""
                << (changed ? "" : "; nothing changed") << "\n";
    return changed ? ItemOutcome::Changed : ItemOutcome::Unchanged;
}

const ItemActionRegistrar kRun({"run",
                                "COMMAND",
                                "run a command of the item: select-resource, explain-error or a "
                                "command GUID",
                                1,
                                1,
                                {},
                                Run});

} // namespace
} // namespace wbhost::cli
