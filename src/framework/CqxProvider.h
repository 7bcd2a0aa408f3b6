// The framework's provider base: implements IqxProvider over hooks that a concrete provider
// overrides; the base declines to create anything and names no type.
#pragma once

#include "com/ComPtr.h"
#include "com/InterfaceList.h"
#include "framework/CqxpItemInfo.h"
#include "framework/IqxProvider.h"

#include <vector>

class CqxProvider : public IqxProvider {
public:
    using Interfaces = qv::com::InterfaceList<IqxProvider>;

    HRESULT Initialize(IUnknown* site) override;
    HRESULT CreateItem(const GUID& type, IUnknown* outer, IUnknown** item) override;
    HRESULT CreateItemFromState(const GUID& type, IUnknown* outer, IUnknown* state,
                                IUnknown** item) override;
    HRESULT ValidateCandidate(IUnknown* candidate) override;
    HRESULT GetItemTypes(uint32_t* count, GUID** types) override;
    HRESULT GetParentTypes(uint32_t* count, GUID** types) override;
    HRESULT GetTypeName(const GUID& type, BSTR* name) override;
    HRESULT GetClassId(CLSID* clsid) override;

    // Adds a reference unless the provider is already being destroyed (the object template
    // implements it); lets the provider list hand out only live providers.
    virtual bool TryAddRef() = 0;

protected:
    CqxProvider() = default;
    // Leaves the module's provider list (and stops being its current provider).
    virtual ~CqxProvider();

    // The framework's root object given to Initialize (no reference added); null before.
    IUnknown* ProjectRoot() const { return site_.Get(); }

    // Creates an item for REQUEST; the base declines with CLASS_E_CLASSNOTAVAILABLE.
    virtual HRESULT CreateItemHook(const CqxItemRequest& request, IUnknown** item);
    // Whether CANDIDATE belongs to this provider; the base answers S_FALSE.
    virtual HRESULT ValidateCandidateHook(IUnknown* candidate);
    // Appends the item types the provider creates; the base has none.
    virtual void ListItemTypesHook(std::vector<GUID>& types);
    // Appends the parent types of those item types; the base has none.
    virtual void ListParentTypesHook(std::vector<GUID>& types);
    // The display name of TYPE; the base answers E_FAIL for every type.
    virtual HRESULT TypeNameHook(const GUID& type, BSTR* name);
    // The provider's class identifier; the base answers GUID_NULL.
    virtual CLSID ClassIdHook();

private:
    HRESULT CreateFor(const CqxItemRequest& request, IUnknown** item);
    qv::com::ComPtr<IUnknown> site_;
};
