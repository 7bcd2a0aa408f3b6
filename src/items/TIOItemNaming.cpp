// The Tangent I/O item's name rules: trimmed names, the invalid characters, and names unique
// among the resource items of the item's name scope.
#include "attribute_bag/ItemResourceContext.h"
#include "com/CallGuard.h"
#include "com/PutBstr.h"
#include "host/ProjectItemQueries.h"
#include "host/StatusError.h"
#include "host/contracts/IwbProjectItemScope.h"
#include "items/ResourceItemSelectors.h"
#include "items/TIOInstanceItemUI.h"
#include "items/TIOProgramCall.h"
#include "kern/Collate.h"
#include "resource_tree/ListText.h"

using qv::com::ComPtr;
using qv::com::GuardCall;
using qv::host::CheckStatus;
using qv::host::ItemObject;
using qv::host::ItemParent;

namespace {

// Whether ITEM's object marks it as a name scope.
bool IsItemScope(IwbProjectItem& item) {
    return static_cast<bool>(qv::com::QueryAs<IwbProjectItemScope>(ItemObject(item).Get()));
}

} // namespace

std::u16string TIOInstanceItemUI::HostItemName() const {
    if (HostItem() == nullptr)
        QV_THROW(qv::host::StatusError(E_UNEXPECTED));
    return qv::host::ItemName(*HostItem());
}

HRESULT TIOInstanceItemUI::ValidateNewName(const char16_t* name) {
    if (name == nullptr)
        return S_FALSE;
    return GuardCall([&]() -> HRESULT {
        const std::u16string_view trimmed = wbhw::TrimBlanks(name);
        // The characters are checked before the item's own name: the comparison ignores
        // control characters, so "Le<U+0001>vel" would pass as "Level" in another case.
        for (const char16_t c : trimmed) {
            if (c < u' ' || InvalidNameChars().find(c) != std::u16string::npos)
                return S_FALSE;
        }
        if (qv::kern::EqualsNoCase(trimmed, HostItemName()))
            return S_OK;
        // A name of blanks only would leave the item without a name to show or find.
        if (trimmed.empty())
            return S_FALSE;
        ComPtr<IwbProjectItem> scope;
        CheckStatus(FindNameScope(HostItem(), scope.Put()));
        return CheckStatus(IsNameInUse(scope.Get(), trimmed)) == S_OK ? S_FALSE : S_OK;
    });
}

HRESULT TIOInstanceItemUI::FindNameScope(IwbProjectItem* item, IwbProjectItem** scope) {
    if (item == nullptr || scope == nullptr)
        return E_POINTER;
    *scope = nullptr;
    return GuardCall([&]() -> HRESULT {
        for (ComPtr<IwbProjectItem> at = ItemParent(*item); at; at = ItemParent(*at.Get())) {
            if (IsItemScope(*at.Get())) {
                *scope = at.Detach();
                return S_OK;
            }
        }
        ItemResourceContext context;
        CheckStatus(context.Fill(item));
        *scope = ComPtr<IwbProjectItem>::Share(context.Owner()).Detach();
        return S_OK;
    });
}

HRESULT TIOInstanceItemUI::IsNameInUse(IwbProjectItem* scope, std::u16string_view name) {
    if (scope == nullptr)
        return E_POINTER;
    return GuardCall([&]() -> HRESULT {
        ComPtr<IwbProjectItem> found;
        CQVComObject<ExistingItemSelector>* made = nullptr;
        CheckStatus(
            CQVComObject<ExistingItemSelector>::CreateInstance(&made, std::u16string(name), found));
        const auto selector = ComPtr<IwbProjectItemSelector>::Adopt(made);
        ComPtr<IwbProjectItem> selected;
        return CheckStatus(scope->EnumerateItems(selector.Get(), selected.Put())) == S_OK ? S_OK
                                                                                          : S_FALSE;
    });
}

std::u16string TIOInstanceItemUI::UniqueNameInScope(std::u16string_view proposed) {
    if (HostItem() == nullptr)
        QV_THROW(qv::host::StatusError(E_UNEXPECTED));
    ComPtr<IwbProjectItem> scope;
    CheckStatus(FindNameScope(HostItem(), scope.Put()));
    wbhw::NameSet taken;
    CQVComObject<ExistingNamesBuilder>* made = nullptr;
    CheckStatus(CQVComObject<ExistingNamesBuilder>::CreateInstance(&made, taken));
    const auto builder = ComPtr<IwbProjectItemSelector>::Adopt(made);
    CheckStatus(scope->EnumerateItems(builder.Get(), nullptr));
    if (taken.count(proposed) == 0)
        return std::u16string(proposed);
    // Taken: the host's program makes a name next to the names there are.
    tio::ProgramCall call(tio::ProviderRoot(Provider()).Get(), u"TIOGenUniqueName.gx");
    call.SetString(0, proposed);
    call.SetStrings(1, std::vector<std::u16string>(taken.begin(), taken.end()));
    call.Run();
    return call.String(4);
}

HRESULT TIOInstanceItemUI::GenerateUniqueName(const char16_t* proposed, BSTR* unique) {
    if (proposed == nullptr || unique == nullptr)
        return E_POINTER;
    *unique = nullptr;
    return GuardCall([&] { return qv::com::PutBstr(UniqueNameInScope(proposed), unique); });
}
