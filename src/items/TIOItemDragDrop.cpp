// Drag and drop of a Tangent I/O item in the project tree: where it may go, the drop handed to
// the module's drop program with the item's place as a chain text, and the rebind after it.
#include "attribute_bag/ItemResourceContext.h"
#include "com/CallGuard.h"
#include "com/TaskMem.h"
#include "host/ProjectItemQueries.h"
#include "host/StatusError.h"
#include "items/TIOInstanceItemUI.h"
#include "items/TIOItemCommands.h"
#include "items/TIOProgramCall.h"
#include "kern/GuidText.h"

using qv::com::ComPtr;
using qv::com::GuardCall;
using qv::host::CheckStatus;
using qv::host::StatusError;

namespace {

// Terminals of the drop program.
namespace drop {
constexpr uint32_t kThird = 0, kFirst = 5, kSecond = 7, kIdentifier = 9, kChain = 11;
} // namespace drop

// Effect bits of a drop, and the effects the item reports.
constexpr uint32_t kRunsProgram = 0x2;
constexpr uint32_t kDeclined = 0x4;
constexpr uint32_t kEffectHandled = 1, kEffectDeclined = 2, kEffectNone = 4;

// The target that owns ITEM's resource tree; null when none does.
ComPtr<IwbProjectItem> OwningTargetOf(IwbProjectItem* item) {
    ItemResourceContext context;
    if (item == nullptr || CheckStatus(context.Fill(item, true)) != S_OK)
        return {};
    return ComPtr<IwbProjectItem>::Share(context.Owner());
}

// The scope list an item reports, freed whatever happens to it.
struct ScopeList {
    uint32_t count = 0;
    GUID* types = nullptr;
    BSTR* names = nullptr;
    ~ScopeList() {
        for (uint32_t i = 0; names != nullptr && i < count; ++i)
            SysFreeString(names[i]);
        CoTaskMemFree(names);
        CoTaskMemFree(types);
    }
};

} // namespace

HRESULT TIOInstanceItemUI::DropAllowed(IUnknown* dragged, IwbProjectItem* target) {
    const HRESULT base = BaseHWItemUI::DropAllowed(dragged, target);
    if (base != S_OK)
        return FAILED(base) ? base : S_FALSE;
    if (target == nullptr || HostItem() == nullptr)
        return S_FALSE;
    return GuardCall([&]() -> HRESULT {
        const ComPtr<IwbProjectItem> destination = OwningTargetOf(target);
        if (!destination)
            return S_FALSE;
        if (CheckStatus(IsPhysical()) != S_OK)
            return S_OK;
        // A physical item stands for hardware of its own target: it moves only within it.
        ComPtr<IwbProjectItem> parent;
        CheckStatus(HostItem()->GetParent(parent.Put()));
        const ComPtr<IwbProjectItem> current = OwningTargetOf(parent.Get());
        return current && current.Get() == destination.Get() ? S_OK : S_FALSE;
    });
}

HRESULT TIOInstanceItemUI::Drop(int32_t first, int32_t second, int32_t third, int32_t fourth,
                                uint32_t effects, uint32_t* effect) {
    if (effect != nullptr)
        *effect = 0;
    auto report = [&](uint32_t done, HRESULT answer) {
        if (effect != nullptr)
            *effect = done;
        return answer;
    };
    if (fourth == 0 && (effects & kRunsProgram) != 0) {
        const HRESULT hr = GuardCall([&] {
            RunDropProgram(first, second, third);
            return S_OK;
        });
        return FAILED(hr) ? hr : report(kEffectHandled, S_OK);
    }
    if ((effects & kDeclined) != 0)
        return fourth == 0 ? report(kEffectDeclined, S_FALSE) : E_FAIL;
    return effects == 0 ? report(kEffectNone, S_FALSE) : E_FAIL;
}

void TIOInstanceItemUI::RunDropProgram(int32_t first, int32_t second, int32_t third) {
    if (HostItem() == nullptr)
        QV_THROW(StatusError(E_UNEXPECTED));
    const std::u16string chain = DropChainText();
    tio::ProgramCall call(tio::ProviderRoot(Provider()).Get(), tio::kDragAndDropProgram);
    call.SetInt32(drop::kThird, third);
    call.SetInt32(drop::kFirst, first);
    call.SetInt32(drop::kSecond, second);
    call.SetString(drop::kIdentifier, ItemIdentifierText());
    call.SetString(drop::kChain, chain);
    call.Run();
}

// "NAME.{TYPE}>>" for each item above this one down from its target (as the item's object
// reports them), closed by this item's "NAME.{TYPE}".
std::u16string TIOInstanceItemUI::DropChainText() {
    ComPtr<IUnknown> object;
    CheckStatus(HostItem()->GetObject(object.Put()));
    const auto scope = qv::com::QueryAs<IwbTIOItemScope>(object.Get());
    if (!scope)
        QV_THROW(StatusError(E_NOINTERFACE));
    ScopeList list;
    CheckStatus(scope->GetScope(&list.count, &list.types, &list.names));
    std::u16string chain;
    for (uint32_t i = 0; i < list.count; ++i) {
        chain += qv::com::BstrToString(list.names[i]) + u"." +
                 qv::kern::GuidToString(list.types[i]) + u">>";
    }
    return chain + HostItemName() + u"." + qv::kern::GuidToString(qv::host::ItemType(*HostItem()));
}

HRESULT TIOInstanceItemUI::Dropped() {
    if (const HRESULT hr = BaseHWItemUI::Dropped(); FAILED(hr))
        return hr;
    // The drop may have taken the item to another target: bind where it now is.
    return BindToResource(nullptr, 0, 0);
}
