// `wbhost item ... menu`: the item's context-menu entries, each with the command it runs.
#include "cli/HostText.h"
#include "cli/item/ItemRequests.h"
#include "com/TaskMem.h"
#include "framework/IqxItemUI.h"
#include "kern/GuidText.h"

#include <ostream>

namespace wbhost::cli {
namespace {

ItemOutcome Menu(ItemActionContext& context) {
    const auto object = ItemObjectAs<IqxItemUI>(context, "show a menu");
    if (!object)
        return ItemOutcome::Refused;
    uint32_t count = 0;
    QxMenuEntry* entries = nullptr;
    if (const HRESULT hr = object->GetContextMenu(&count, &entries); FAILED(hr))
        return RefuseWithStatus(context, "asking the item for its menu", hr);
    for (uint32_t i = 0; i < count; ++i) {
        const QxMenuEntry& entry = entries[i];
        context.out << ToUtf8(qv::com::BstrToString(entry.text)) << "  "
                    << qv::kern::GuidToNarrowString(entry.command) << "  flags " << entry.flags
                    << ", kind " << entry.kind << ", group " << entry.group << ", position "
                    << entry.position << "\n";
        SysFreeString(entry.text);
    }
    CoTaskMemFree(entries);
    if (count == 0)
        context.out << "no menu entries\n";
    return ItemOutcome::Unchanged;
}

const ItemActionRegistrar kMenu(
    {"menu", "", "list the item's context-menu entries with their command GUIDs", 0, 0, {}, Menu});

} // namespace
} // namespace wbhost::cli
