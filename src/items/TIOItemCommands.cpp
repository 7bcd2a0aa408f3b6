// What a Tangent I/O item offers in the project tree's context menu, and the commands behind it.
#include "items/TIOItemCommands.h"

#include "attribute_bag/ItemResourceContext.h"
#include "com/CallGuard.h"
#include "host/StatusError.h"
#include "items/TIOInstanceItemUI.h"
#include "items/TIOStrings.h"

using qv::com::GuardCall;
using qv::host::ResourceNode;
using qv::host::StatusError;

namespace {

// The node and attribute of a target's tree whose presence takes the select-resource entry
// away from every item of the target.
constexpr std::u16string_view kSelectResourceOptions = u"TIOItemSelectResourceDialog";
constexpr std::u16string_view kRemoveOption = u"Remove";

constexpr uint32_t kCommandEntry = 2;
constexpr uint32_t kSelectResourceFlags = 14;
constexpr uint32_t kExplainErrorFlags = 0x10E;
constexpr uint32_t kExplainErrorGroup = 3;
constexpr uint32_t kExplainErrorPosition = 6000000;

} // namespace

void TIOInstanceItemUI::AddMenuEntries(std::vector<CqxMenuEntry>& entries) {
    ItemResourceContext context;
    if (HostItem() == nullptr || context.Fill(HostItem()) != S_OK || !context.Root())
        QV_THROW(StatusError(E_FAIL));
    const ResourceNode options = context.Root().Find(kSelectResourceOptions);
    const bool removed = options && options.Attribute(kRemoveOption).has_value();
    if (!removed && qv::host::CheckStatus(IsPhysical()) != S_OK) {
        CqxMenuEntry entry;
        entry.text = tio::ModuleString(tio::kStrSelectResourceMenu);
        entry.flags = kSelectResourceFlags;
        entry.kind = kCommandEntry;
        entry.command = tio::kSelectResourceCommand;
        entries.push_back(std::move(entry));
    }
    if (resourceStatus_ == tio::status::kMissing || resourceStatus_ == tio::status::kConflict) {
        CqxMenuEntry entry;
        entry.text = tio::ModuleString(tio::kStrExplainErrorMenu);
        entry.flags = kExplainErrorFlags;
        entry.kind = kCommandEntry;
        entry.group = kExplainErrorGroup;
        entry.position = kExplainErrorPosition;
        entry.command = tio::kExplainErrorCommand;
        entries.push_back(std::move(entry));
    }
}

HRESULT TIOInstanceItemUI::ExecuteCommand(const GUID& command) {
    HRESULT hr = S_FALSE;
    if (IsEqualGUID(command, tio::kSelectResourceCommand))
        hr = RunSelectResourceDialog();
    else if (IsEqualGUID(command, tio::kExplainErrorCommand))
        hr = RunExplainErrorDialog();
    else
        return S_FALSE;
    return FAILED(hr) ? hr : S_OK;
}

HRESULT TIOInstanceItemUI::QueryCanRemove() {
    return CanGo();
}

HRESULT TIOInstanceItemUI::QueryCanCut() {
    return CanGo();
}

// A physical item stands for hardware that is there whatever the project says: it stays.
HRESULT TIOInstanceItemUI::CanGo() {
    const HRESULT physical = IsPhysical();
    if (FAILED(physical))
        return physical;
    return physical == S_OK ? S_FALSE : S_OK;
}
