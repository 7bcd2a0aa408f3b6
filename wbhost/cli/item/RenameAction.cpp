// `wbhost item ... rename NEWNAME`: the project tree's rename. The item's object judges the new
// name first (its name rules); the host then keeps its own rule that no two items of one
// folder share a name.
#include "cli/HostText.h"
#include "cli/ItemCommands.h"
#include "cli/ItemPlace.h"
#include "framework/IqxProjectItemUI.h"
#include "project/HexStatus.h"

#include <ostream>

namespace wbhost::cli {
namespace {

// NAME without the blanks the project tree drops around a typed name.
std::u16string TrimName(std::u16string_view name) {
    constexpr std::u16string_view kBlanks = u" \t\r\n";
    const size_t first = name.find_first_not_of(kBlanks);
    if (first == std::u16string_view::npos)
        return {};
    return std::u16string(name.substr(first, name.find_last_not_of(kBlanks) - first + 1));
}

ItemOutcome Rename(ItemActionContext& context) {
    project::ProjectItem& item = context.item;
    const std::string old = ToUtf8(item.Name());
    const std::u16string asked = FromUtf8(context.arguments.front());
    if (const auto rules = qv::com::QueryAs<IqxProjectItemUI>(item.Object())) {
        const HRESULT answer = rules->ValidateNewName(asked.c_str());
        if (answer != S_OK) {
            context.err << "wbhost: the module refuses to rename \"" << old << "\" to \""
                        << context.arguments.front() << "\"";
            if (FAILED(answer))
                context.err << " (status " << HexStatus(answer) << ")";
            else
                context.err << ": a name holds none of \\ ' \" < > | and no control character, "
                               "and no other I/O item of its scope carries it, in any case";
            context.err << "\n";
            return ItemOutcome::Refused;
        }
    }
    const std::u16string name = TrimName(asked);
    if (name.empty()) {
        context.err << "wbhost: an item needs a name\n";
        return ItemOutcome::Refused;
    }
    const project::ProjectItem* sibling =
        item.Parent() != nullptr ? ChildNamed(*item.Parent(), name) : nullptr;
    if (sibling != nullptr && sibling != &item) {
        context.err << "wbhost: \"" << ToUtf8(item.Parent()->Name())
                    << "\" already has an item called \"" << ToUtf8(sibling->Name()) << "\"\n";
        return ItemOutcome::Refused;
    }
    if (name == item.Name()) {
        context.out << "\"" << old << "\" keeps its name\n";
        return ItemOutcome::Unchanged;
    }
    if (const HRESULT hr = item.SetName(name.c_str()); FAILED(hr)) {
        context.err << "wbhost: cannot rename \"" << old << "\" (status " << HexStatus(hr) << ")\n";
        return ItemOutcome::Refused;
    }
    item.Refresh(wbproj::kUpdateRenamed);
    context.out << "renamed \"" << old << "\" to \"" << ToUtf8(name) << "\"\n";
    return ItemOutcome::Changed;
}

const ItemActionRegistrar kRename({"rename",
                                   "NEWNAME",
                                   "rename the item; its module's name rules decide first",
                                   1,
                                   1,
                                   {},
                                   Rename});

} // namespace
} // namespace wbhost::cli
