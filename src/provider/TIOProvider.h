// The Tangent I/O provider: the object through which the project framework learns what the
// plug-in offers, creates its items and attaches it to the host's project.
#pragma once

#include "com/ComPtr.h"
#include "framework/CqxProvider.h"
#include "framework/IqxProviderSite.h"
#include "host/contracts/IwbProjectNameProvider.h"
#include "host/contracts/IwbProjectProvider.h"
#include "items/CommonChildValidatorImpl.h"

class TIOProvider : public CqxProvider,
                    public IwbProjectProvider,
                    public IqxProviderSite,
                    public IwbProjectNameProvider,
                    public wbhw::CommonChildValidatorImpl {
public:
    using Interfaces = CqxProvider::Interfaces::Append<IwbProjectProvider, IqxProviderSite,
                                                       IwbProjectNameProvider, IwbChildValidator>;

    // Runs the base initialisation, keeps the framework's root object and records the module
    // handle; answers the base's result.
    HRESULT Initialize(IUnknown* site) override;

    // IwbProjectProvider: both attach operations take a reference on PROJECT and drop the one
    // held before; Detach drops it. Every operation answers S_OK.
    HRESULT Attach(IUnknown* project) override;
    HRESULT AttachReloaded(IUnknown* project) override;
    HRESULT ProjectReady() override;
    HRESULT Detach() override;
    HRESULT ProjectSaving() override;
    HRESULT ProjectSaved() override;

    // IqxProviderSite: the root object, for the items' program runs.
    HRESULT GetSite(IUnknown** site) override;

    // IwbProjectNameProvider: the I/O name controls' names and programs (TIONameControl).
    HRESULT ListCategories(uint32_t* count, BSTR** categories) override;
    HRESULT ListNames(WBRefNum appRef, WBVariant data, uint32_t* count, BSTR** names,
                      WBHandle* nameList, int32_t* status) override;
    HRESULT Reserved3() override { return S_OK; }
    HRESULT Reserved4() override { return S_OK; }
    HRESULT CheckTarget(WBRefNum appRef, WBHandle* nameList, int32_t* status) override;
    HRESULT Configure(uint64_t value, int32_t* status) override;
    HRESULT Query(uint32_t mode, WBRefNum appRef, WBVariant input, WBVariant output,
                  int32_t* status) override;
    HRESULT OnSelect(WbNameControlEvent* event) override;
    HRESULT Reserved9() override { return S_OK; }

    // IwbChildValidator: the provider's check of a place ITEM: refused (1) for the items of the
    // pass-through type, else 0 when an ancestor of ITEM (or ITEM) owns a resource tree, 1 when
    // none does.
    HRESULT CheckItem(IwbProjectItem* item) override;

    // The framework's root object kept at initialisation (no reference added); null before.
    IUnknown* projectRoot() const { return projectRoot_; }
    // The host's project object held since the last attach; null when detached.
    IUnknown* host() const { return host_.Get(); }

protected:
    TIOProvider() = default;
    ~TIOProvider() override = default;

    HRESULT CreateItemHook(const CqxItemRequest& request, IUnknown** item) override;
    // Null answers S_FALSE; otherwise the candidate's own check against this provider decides.
    HRESULT ValidateCandidateHook(IUnknown* candidate) override;
    void ListItemTypesHook(std::vector<GUID>& types) override;
    void ListParentTypesHook(std::vector<GUID>& types) override;
    HRESULT TypeNameHook(const GUID& type, BSTR* name) override;
    CLSID ClassIdHook() override;

private:
    HRESULT AttachTo(IUnknown* project);

    // The root object lives as long as the framework that initialised us; the base holds the
    // reference.
    IUnknown* projectRoot_ = nullptr;
    qv::com::ComPtr<IUnknown> host_;
};
