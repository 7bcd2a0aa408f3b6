// `wbhost item ... drop-check DEST`: whether the project tree would let the item be dropped
// under DEST (a target, or a folder below one as TARGET/FOLDER/...), as it asks the dragged
// item while the mouse is over DEST.
#include "cli/HostText.h"
#include "cli/ItemPlace.h"
#include "cli/item/ItemRequests.h"
#include "framework/IwbProjectDragDrop.h"
#include "project/DragData.h"

#include <ostream>

namespace wbhost::cli {
namespace {

// The item DEST names: a target, or a place below one.
project::ProjectItem* Destination(ItemActionContext& context, const std::string& dest) {
    const size_t slash = dest.find('/');
    project::ProjectItem* target =
        FindTarget(context.project, std::string_view(dest).substr(0, slash), context.err);
    if (target == nullptr || slash == std::string::npos)
        return target;
    project::ProjectItem* place = ItemAt(*target, FromUtf8(dest.substr(slash + 1)));
    if (place == nullptr)
        context.err << "wbhost: the target \"" << ToUtf8(target->Name()) << "\" has nothing at \""
                    << dest.substr(slash + 1) << "\"\n";
    return place;
}

ItemOutcome DropCheck(ItemActionContext& context) {
    const std::string& dest = context.arguments.front();
    project::ProjectItem* destination = Destination(context, dest);
    if (destination == nullptr)
        return ItemOutcome::Refused;
    const auto dragged = ItemObjectAs<IwbProjectDragDrop>(context, "be dragged");
    if (!dragged)
        return ItemOutcome::Refused;
    project::DragData* data = nullptr;
    if (const HRESULT made = project::DragData::CreateInstance(
            &data, std::vector{qv::com::ComPtr<IwbProjectItem>::Share(&context.item)});
        FAILED(made))
        return RefuseWithStatus(context, "making the drag", made);
    const auto drag = qv::com::ComPtr<project::DragData>::Adopt(data);
    const HRESULT answer = dragged->DropAllowed(drag->GetUnknown(), destination);
    if (FAILED(answer))
        return RefuseWithStatus(context, "asking the item", answer);
    const std::string item = ToUtf8(context.item.Name());
    if (answer != S_OK) {
        context.err << "wbhost: \"" << item << "\" may not be dropped under \"" << dest << "\"\n";
        return ItemOutcome::Refused;
    }
    context.out << "\"" << item << "\" may be dropped under \"" << dest << "\"\n";
    return ItemOutcome::Unchanged;
}

const ItemActionRegistrar kDropCheck({"drop-check",
                                      "DEST",
                                      "tell whether the item may be dropped under DEST (TARGET or "
                                      "TARGET/FOLDER...)",
                                      1,
                                      1,
                                      {},
                                      DropCheck});

} // namespace
} // namespace wbhost::cli
