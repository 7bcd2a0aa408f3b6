// The interface through which the project framework talks to a project provider.
#pragma once

#include "com/Bstr.h"
#include "com/IUnknown.h"

// Null out-parameters give E_POINTER; arrays handed out come from CoTaskMemAlloc.
struct IqxProvider : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("B7352CE0-DAEF-11D2-954B-006097B77FC1");

    // Initialises the provider once, after creation; SITE is the framework's root object, from
    // which services (the program runner) are obtained. A null SITE gives E_INVALIDARG.
    virtual HRESULT Initialize(IUnknown* site) = 0;
    // Creates the item object of TYPE (GUID_NULL: of any type that accepts the request), inside
    // OUTER when it is not null; CLASS_E_CLASSNOTAVAILABLE when no type handles it.
    virtual HRESULT CreateItem(const GUID& type, IUnknown* outer, IUnknown** item) = 0;
    // As CreateItem, for an item being reloaded with its saved STATE (may be null).
    virtual HRESULT CreateItemFromState(const GUID& type, IUnknown* outer, IUnknown* state,
                                        IUnknown** item) = 0;
    // S_OK when CANDIDATE (an item object) agrees that it belongs to this provider, S_FALSE when
    // it does not, or is null.
    virtual HRESULT ValidateCandidate(IUnknown* candidate) = 0;
    // The item types this provider creates: COUNT GUIDs (TYPES null when there are none).
    virtual HRESULT GetItemTypes(uint32_t* count, GUID** types) = 0;
    // The parent types its item types require, as GetItemTypes.
    virtual HRESULT GetParentTypes(uint32_t* count, GUID** types) = 0;
    // The display name of item type TYPE as a new BSTR; E_FAIL for a type without a name.
    virtual HRESULT GetTypeName(const GUID& type, BSTR* name) = 0;
    // The provider's class identifier.
    virtual HRESULT GetClassId(CLSID* clsid) = 0;
};
