// The common child validation of hardware items.
#include "items/CommonChildValidatorImpl.h"

#include "com/CallGuard.h"
#include "host/ProjectItemQueries.h"
#include "host/StatusError.h"
#include "host/contracts/IwbChildPlacement.h"
#include "kern/GuidText.h"
#include "resource_tree/HostDefinition.h"

namespace wbhw {

using qv::com::ComPtr;
using qv::com::GuardCall;
using qv::com::QueryAs;
using qv::host::CheckStatus;
using qv::host::ItemType;

namespace {

// The property NAME of CANDIDATE's object; a candidate without properties, or without that one,
// throws E_FAIL.
std::u16string CandidateProperty(IUnknown* candidate, std::u16string_view name) {
    const auto properties = QueryAs<IwbItemObjectProperties>(candidate);
    if (!properties)
        QV_THROW(qv::host::StatusError(E_FAIL));
    BSTR value = nullptr;
    const std::u16string key(name);
    const HRESULT hr = properties->GetProperty(key.c_str(), &value);
    const qv::com::UniqueBstr held(value);
    if (CheckStatus(hr) != S_OK)
        QV_THROW(qv::host::StatusError(E_FAIL));
    return qv::com::BstrToString(value);
}

// The common answer for an item of TYPE below PARENT, walking up through folders.
HRESULT CommonAnswer(ComPtr<IwbProjectItem> parent, const GUID& type) {
    while (parent) {
        const GUID parentType = ItemType(*parent.Get());
        if (IsEqualGUID(parentType, item_type::kAlwaysAllows))
            return S_OK;
        if (IsEqualGUID(parentType, item_type::kFolder) ||
            IsEqualGUID(parentType, item_type::kPassThrough)) {
            parent = qv::host::ItemParent(*parent.Get());
            continue;
        }
        const auto object = qv::host::ItemObject(*parent.Get());
        if (IsEqualGUID(type, item_type::kTarget)) {
            const auto decides = QueryAs<IwbTargetPlacementValidator>(object.Get());
            return decides ? decides->AllowsTargetType(type) : S_FALSE;
        }
        if (IsEqualGUID(parentType, item_type::kRestricted))
            return IsEqualGUID(type, item_type::kRestrictedChild) ? S_OK : S_FALSE;
        const auto decides = QueryAs<IwbChildTypeValidator>(object.Get());
        return decides ? decides->AllowsChildType(type) : S_FALSE;
    }
    return S_FALSE;
}

// Whether ITEM's object holds a sub-scope that takes children; false when ITEM is null.
bool AcceptsChildren(IwbProjectItem* item) {
    if (item == nullptr)
        return false;
    const auto container = QueryAs<IwbSubScopeContainer>(qv::host::ItemObject(*item).Get());
    return container && CheckStatus(container->AcceptsChildren()) == S_OK;
}

} // namespace

HRESULT CommonChildValidatorImpl::ValidateChild(IwbProjectItem* parent, const GUID& type) {
    return GuardCall([&] { return CommonAnswer(ComPtr<IwbProjectItem>::Share(parent), type); });
}

HRESULT CommonChildValidatorImpl::ValidateChildInScope(IwbProjectItem* parent, const GUID& type) {
    return GuardCall([&]() -> HRESULT {
        if (parent == nullptr ||
            !QueryAs<IwbSubScopeContainer>(qv::host::ItemObject(*parent).Get()))
            return S_FALSE;
        // The sub-scope must go on above the parent and take children there too.
        if (!AcceptsChildren(qv::host::ItemParent(*parent).Get()))
            return S_FALSE;
        return CommonAnswer(ComPtr<IwbProjectItem>::Share(parent), type);
    });
}

HRESULT CommonChildValidatorImpl::CheckPlacement(IwbProjectItem* parent, IUnknown* candidate,
                                                 int32_t* allowed) {
    if (parent == nullptr || candidate == nullptr)
        return E_POINTER;
    return GuardCall([&]() -> HRESULT {
        // A text that is no GUID throws, which answers a failure.
        const GUID type = qv::kern::StringToGuid(CandidateProperty(candidate, u"Type"));
        if (CheckStatus(ValidateChildInScope(parent, type)) != S_OK) {
            if (allowed != nullptr)
                *allowed = 0;
            return E_FAIL;
        }
        if (!IsEqualGUID(type, item_type::kTarget))
            return S_FALSE;
        const std::u16string targetClass = CandidateProperty(candidate, u"Target Class");
        const auto service = QueryAs<IwbProjectResourceService>(candidate);
        if (!service)
            return E_FAIL;
        ComPtr<IwbhwResourceTreeNode> root;
        CheckStatus(service->GetResourceTree(root.Put()));
        const qv::host::ResourceNode tree(root.Get());
        HostDefinition required;
        const std::u16string host = qv::kern::GuidToString(ItemType(*parent));
        if (const HRESULT found = FindHostDefinition(tree, host, required); found != S_OK)
            return found;
        return IsHostSupported(required, tree, targetClass) ? S_FALSE : E_FAIL;
    });
}

} // namespace wbhw
