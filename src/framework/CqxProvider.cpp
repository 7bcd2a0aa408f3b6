// The provider base: argument checks, exception guards and array hand-out around the hooks.
#include "framework/CqxProvider.h"

#include "com/CallGuard.h"
#include "com/TaskMem.h"
#include "framework/CqxProviderList.h"

using qv::com::GuardCall;

CqxProvider::~CqxProvider() {
    CqxProviderList::Module().Remove(this);
}

HRESULT CqxProvider::Initialize(IUnknown* site) {
    if (!site) {
        return E_INVALIDARG;
    }
    site_ = qv::com::ComPtr<IUnknown>::Share(site);
    return S_OK;
}

HRESULT CqxProvider::CreateFor(const CqxItemRequest& request, IUnknown** item) {
    if (!item) {
        return E_POINTER;
    }
    *item = nullptr;
    return GuardCall([&] { return CreateItemHook(request, item); });
}

HRESULT CqxProvider::CreateItem(const GUID& type, IUnknown* outer, IUnknown** item) {
    CqxItemRequest request;
    request.type = type;
    request.outer = outer;
    request.provider = this;
    return CreateFor(request, item);
}

HRESULT CqxProvider::CreateItemFromState(const GUID& type, IUnknown* outer, IUnknown* state,
                                         IUnknown** item) {
    CqxItemRequest request;
    request.type = type;
    request.outer = outer;
    request.savedState = state;
    request.provider = this;
    return CreateFor(request, item);
}

HRESULT CqxProvider::ValidateCandidate(IUnknown* candidate) {
    return GuardCall([&] { return ValidateCandidateHook(candidate); });
}

HRESULT CqxProvider::GetItemTypes(uint32_t* count, GUID** types) {
    return GuardCall([&] {
        std::vector<GUID> list;
        ListItemTypesHook(list);
        return qv::com::CopyToTaskMem(list, types, count);
    });
}

HRESULT CqxProvider::GetParentTypes(uint32_t* count, GUID** types) {
    return GuardCall([&] {
        std::vector<GUID> list;
        ListParentTypesHook(list);
        return qv::com::CopyToTaskMem(list, types, count);
    });
}

HRESULT CqxProvider::GetTypeName(const GUID& type, BSTR* name) {
    if (!name) {
        return E_POINTER;
    }
    *name = nullptr;
    return GuardCall([&] { return TypeNameHook(type, name); });
}

HRESULT CqxProvider::GetClassId(CLSID* clsid) {
    if (!clsid) {
        return E_POINTER;
    }
    return GuardCall([&] {
        *clsid = ClassIdHook();
        return S_OK;
    });
}

HRESULT CqxProvider::CreateItemHook(const CqxItemRequest&, IUnknown**) {
    return CLASS_E_CLASSNOTAVAILABLE;
}

HRESULT CqxProvider::ValidateCandidateHook(IUnknown*) {
    return S_FALSE;
}

void CqxProvider::ListItemTypesHook(std::vector<GUID>&) {}

void CqxProvider::ListParentTypesHook(std::vector<GUID>&) {}

HRESULT CqxProvider::TypeNameHook(const GUID&, BSTR*) {
    return E_FAIL;
}

CLSID CqxProvider::ClassIdHook() {
    return GUID_NULL;
}
