// The provider's overrides of the framework base, and its project attachment.
#include "provider/TIOProvider.h"

#include "attribute_bag/ItemResourceContext.h"
#include "com/CallGuard.h"
#include "com/ComInit.h"
#include "framework/IqxProjectItemValidator.h"
#include "items/TIOStrings.h"
#include "provider/TIOIdentifiers.h"
#include "provider/TIOItemRegistry.h"
#include "provider/TIOModule.h"
#include "provider/TIONameControl.h"

using qv::com::ComPtr;

HRESULT TIOProvider::Initialize(IUnknown* site) {
    const HRESULT hr = CqxProvider::Initialize(site);
    projectRoot_ = ProjectRoot();
    tio::ModuleInstance();
    return hr;
}

HRESULT TIOProvider::GetSite(IUnknown** site) {
    if (!site) {
        return E_POINTER;
    }
    *site = projectRoot_;
    if (!projectRoot_) {
        return E_UNEXPECTED;
    }
    projectRoot_->AddRef();
    return S_OK;
}

HRESULT TIOProvider::CreateItemHook(const CqxItemRequest& request, IUnknown** item) {
    return tio::ItemRegistry().Create(request, item);
}

HRESULT TIOProvider::ValidateCandidateHook(IUnknown* candidate) {
    if (!candidate) {
        return S_FALSE;
    }
    const auto validator = qv::com::QueryAs<IqxProjectItemValidator>(candidate);
    if (!validator) {
        return S_FALSE;
    }
    auto* self = static_cast<IUnknown*>(static_cast<IqxProvider*>(this));
    return validator->ValidateAgainst(self) == S_OK ? S_OK : S_FALSE;
}

void TIOProvider::ListItemTypesHook(std::vector<GUID>& types) {
    tio::ItemRegistry().ListTypes(types);
}

void TIOProvider::ListParentTypesHook(std::vector<GUID>& types) {
    tio::ItemRegistry().ListParentTypes(types);
}

HRESULT TIOProvider::TypeNameHook(const GUID& type, BSTR* name) {
    return tio::ItemRegistry().TypeName(type, tio::LoadModuleString, name);
}

CLSID TIOProvider::ClassIdHook() {
    return tio::kProviderClassId;
}

HRESULT TIOProvider::CheckItem(IwbProjectItem* item) {
    if (item == nullptr)
        return E_POINTER;
    return qv::com::GuardCall([&]() -> HRESULT {
        GUID type{};
        if (const HRESULT hr = item->GetTypeGuid(&type); FAILED(hr))
            return hr;
        if (IsEqualGUID(type, wbhw::item_type::kPassThrough))
            return S_FALSE;
        ItemResourceContext context;
        return context.Fill(item, true);
    });
}

HRESULT TIOProvider::AttachTo(IUnknown* project) {
    CoInitialize(nullptr);
    // Share before dropping the old one: attaching the same project again must not free it.
    host_ = ComPtr<IUnknown>::Share(project);
    return S_OK;
}

HRESULT TIOProvider::Attach(IUnknown* project) {
    return AttachTo(project);
}

HRESULT TIOProvider::AttachReloaded(IUnknown* project) {
    return AttachTo(project);
}

HRESULT TIOProvider::ProjectReady() {
    return S_OK;
}

HRESULT TIOProvider::Detach() {
    host_.Reset();
    CoUninitialize();
    return S_OK;
}

HRESULT TIOProvider::ProjectSaving() {
    return S_OK;
}

HRESULT TIOProvider::ProjectSaved() {
    return S_OK;
}

HRESULT TIOProvider::ListCategories(uint32_t* count, BSTR** categories) {
    return tio::namecontrol::ListCategories(count, categories);
}

HRESULT TIOProvider::ListNames(WBRefNum appRef, WBVariant data, uint32_t* count, BSTR** names,
                               WBHandle* nameList, int32_t* status) {
    return tio::namecontrol::ListNames(appRef, data, count, names, nameList, status);
}

HRESULT TIOProvider::CheckTarget(WBRefNum appRef, WBHandle* nameList, int32_t* status) {
    return tio::namecontrol::CheckTarget(appRef, nameList, status);
}

HRESULT TIOProvider::Configure(uint64_t value, int32_t* status) {
    return tio::namecontrol::Configure(projectRoot_, value, status);
}

HRESULT TIOProvider::Query(uint32_t mode, WBRefNum appRef, WBVariant input, WBVariant output,
                           int32_t* status) {
    return tio::namecontrol::Query(mode, appRef, input, output, status);
}

HRESULT TIOProvider::OnSelect(WbNameControlEvent* event) {
    return tio::namecontrol::OnSelect(projectRoot_, event);
}
