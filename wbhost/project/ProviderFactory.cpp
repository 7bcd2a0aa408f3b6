// Item objects made by a module's provider.
#include "project/ProviderFactory.h"

#include "com/TaskMem.h"

#include <algorithm>
#include <vector>

namespace wbhost::project {

namespace {

std::vector<GUID> ItemTypes(IqxProvider& provider) {
    uint32_t count = 0;
    GUID* types = nullptr;
    if (FAILED(provider.GetItemTypes(&count, &types)))
        return {};
    std::vector<GUID> list(types, types + (types ? count : 0));
    CoTaskMemFree(types);
    return list;
}

} // namespace

Project::ObjectFactory ProviderFactory(qv::com::ComPtr<IqxProvider> provider) {
    return [provider](IwbProjectItem&, const GUID& type, IUnknown* savedState,
                      qv::com::ComPtr<IUnknown>& object) -> HRESULT {
        if (!provider)
            return S_OK;
        const auto types = ItemTypes(*provider.Get());
        const bool known = std::any_of(types.begin(), types.end(),
                                       [&](const GUID& each) { return IsEqualGUID(each, type); });
        if (!known)
            return S_OK;
        IUnknown* made = nullptr;
        const HRESULT hr = savedState
                               ? provider->CreateItemFromState(type, nullptr, savedState, &made)
                               : provider->CreateItem(type, nullptr, &made);
        auto held = qv::com::ComPtr<IUnknown>::Adopt(made);
        if (FAILED(hr))
            return hr;
        if (!held)
            return E_UNEXPECTED;
        object = std::move(held);
        return S_OK;
    };
}

} // namespace wbhost::project
