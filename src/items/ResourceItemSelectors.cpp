// Selectors over the resource items below a name scope.
#include "items/ResourceItemSelectors.h"

#include "com/CallGuard.h"
#include "host/ProjectItemQueries.h"

namespace wbhw {

HRESULT ResourceItemUISelector::SelectItem(IwbProjectItem* item) {
    if (item == nullptr)
        return E_POINTER;
    return qv::com::GuardCall([&]() -> HRESULT {
        const auto object = qv::host::ItemObject(*item);
        const auto resourceItem = qv::com::QueryAs<IwbhwResourceItemUI>(object.Get());
        return resourceItem ? Select(*item, *resourceItem.Get()) : S_FALSE;
    });
}

} // namespace wbhw

HRESULT ExistingItemSelector::Select(IwbProjectItem& item, IwbhwResourceItemUI&) {
    if (!qv::kern::EqualsNoCase(qv::host::ItemName(item), Name()))
        return S_FALSE;
    found_ = qv::com::ComPtr<IwbProjectItem>::Share(&item);
    return S_OK;
}

HRESULT ExistingNamesBuilder::Select(IwbProjectItem& item, IwbhwResourceItemUI&) {
    names_.insert(qv::host::ItemName(item));
    return S_FALSE;
}
