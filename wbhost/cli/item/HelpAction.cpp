// `wbhost item ... help`: the help the item names for itself, as the project tree's help key
// asks for it: the file (absolute), the topic and the localized context.
#include "cli/HostText.h"
#include "cli/item/ItemRequests.h"
#include "framework/IqxItemUI.h"

#include <ostream>

namespace wbhost::cli {
namespace {

ItemOutcome Help(ItemActionContext& context) {
    const auto object = ItemObjectAs<IqxItemUI>(context, "give help");
    if (!object)
        return ItemOutcome::Refused;
    BSTR path = nullptr;
    BSTR topic = nullptr;
    BSTR localized = nullptr;
    const HRESULT hr = object->GetHelp(&path, &topic, &localized);
    const qv::com::UniqueBstr heldPath(path), heldTopic(topic), heldContext(localized);
    if (FAILED(hr))
        return RefuseWithStatus(context, "asking the item for help", hr);
    if (hr != S_OK) {
        context.err << "wbhost: the item has no help\n";
        return ItemOutcome::Refused;
    }
    context.out << "path: " << ToUtf8(qv::com::BstrToString(path)) << "\n"
                << "topic: " << ToUtf8(qv::com::BstrToString(topic)) << "\n"
                << "context: " << ToUtf8(qv::com::BstrToString(localized)) << "\n";
    return ItemOutcome::Unchanged;
}

const ItemActionRegistrar
    kHelp({"help", "", "show the item's help: file, topic and localized context", 0, 0, {}, Help});

} // namespace
} // namespace wbhost::cli
