// `wbhost item ... move [DESTFOLDER] [--to-target T2]`: the project tree's move of an item (or
// a folder with what is below it) to another folder of its target or to another target. The
// items hear the move; those that now belong to another target bind to its tree.
#include "cli/HostText.h"
#include "cli/ItemCommands.h"
#include "cli/ItemPlace.h"
#include "cli/ItemStates.h"
#include "cli/NewItemChecks.h"
#include "project/HexStatus.h"
#include "project/Project.h"
#include "provider/TIOIdentifiers.h"

#include <functional>
#include <ostream>

namespace wbhost::cli {
namespace {

using project::ProjectItem;

// The folder (or target) PLACE names below TARGET ("" or "/": the target); null with the reason
// on ERR.
ProjectItem* Destination(ProjectItem& target, const std::string& place, std::ostream& err) {
    if (place.empty() || place == "/")
        return &target;
    ProjectItem* found = ItemAt(target, FromUtf8(place));
    if (found == nullptr) {
        err << "wbhost: target \"" << ToUtf8(target.Name()) << "\" has no folder \"" << place
            << "\"\n";
        return nullptr;
    }
    if (!IsEqualGUID(found->Type(), wbproj::kFolderType)) {
        err << "wbhost: \"" << place << "\" is no folder\n";
        return nullptr;
    }
    return found;
}

// Whether ITEM may join DESTINATION below DESTTARGET by the host's rules: no two items of one
// folder, and no two I/O items of one target, share a name. False with the reason on ERR.
bool NameFree(const ProjectItem& item, const ProjectItem& destination,
              const ProjectItem& destTarget, const ProjectItem& target, std::ostream& err) {
    if (const ProjectItem* sibling = ChildNamed(destination, item.Name())) {
        err << "wbhost: \"" << ToUtf8(destination.Name()) << "\" already has an item called \""
            << ToUtf8(sibling->Name()) << "\"\n";
        return false;
    }
    if (&destTarget == &target)
        return true;
    // Names of I/O items below the moved one (a folder) must be free there too.
    const NameSet taken = IOItemNames(destTarget);
    const std::function<const ProjectItem*(const ProjectItem&)> clash =
        [&](const ProjectItem& at) -> const ProjectItem* {
        if (IsEqualGUID(at.Type(), tio::kIOItemType) && taken.count(at.Name()) != 0)
            return &at;
        for (const auto& child : at.Children()) {
            if (const ProjectItem* found = clash(*child.Get()))
                return found;
        }
        return nullptr;
    };
    if (const ProjectItem* named = clash(item)) {
        err << "wbhost: target \"" << ToUtf8(destTarget.Name())
            << "\" already has an I/O item called \"" << ToUtf8(named->Name()) << "\"\n";
        return false;
    }
    return true;
}

ItemOutcome Move(ItemActionContext& context) {
    ProjectItem& item = context.item;
    const auto toTarget = context.options.find("--to-target");
    ProjectItem* destTarget = toTarget == context.options.end()
                                  ? &context.target
                                  : FindTarget(context.project, toTarget->second, context.err);
    const std::string place = context.arguments.empty() ? std::string() : context.arguments[0];
    ProjectItem* destination =
        destTarget != nullptr ? Destination(*destTarget, place, context.err) : nullptr;
    if (destination == nullptr)
        return ItemOutcome::Refused;
    if (destination == item.Parent()) {
        context.out << "\"" << ToUtf8(item.Name()) << "\" is there already\n";
        return ItemOutcome::Unchanged;
    }
    if (!NameFree(item, *destination, *destTarget, context.target, context.err))
        return ItemOutcome::Refused;
    const HRESULT hr = context.project.MoveItem(item, *destination);
    if (hr == E_ACCESSDENIED) {
        context.err << "wbhost: the module does not let \"" << ToUtf8(item.Name())
                    << "\" go under \"" << ToUtf8(destination->Name()) << "\"\n";
        return ItemOutcome::Refused;
    }
    if (hr == E_INVALIDARG || hr == S_FALSE) {
        context.err << "wbhost: \"" << ToUtf8(item.Name()) << "\" cannot go into itself\n";
        return ItemOutcome::Refused;
    }
    if (FAILED(hr))
        context.err << "warning: an item's object answered the move with status " << HexStatus(hr)
                    << "\n";
    context.out << "moved \"" << ToUtf8(item.Name()) << "\" to "
                << (destination == destTarget ? "target" : "folder") << " \""
                << ToUtf8(destination->Name()) << "\"\n";
    for (const ProjectItem* target : {&context.target, destTarget}) {
        context.out << "items of target \"" << ToUtf8(target->Name()) << "\" now:\n";
        PrintItemStates(*target, context.out);
        if (target == destTarget)
            break;
    }
    return ItemOutcome::Changed;
}

const ItemActionRegistrar kMove({"move",
                                 "[DESTFOLDER]",
                                 "move the item to a folder (/ for the target itself), with "
                                 "--to-target to another target",
                                 0,
                                 1,
                                 {{"--to-target", "TARGET", "the target to move the item to"}},
                                 Move});

} // namespace
} // namespace wbhost::cli
