// What a provider was given at initialisation, for the objects it created: the framework's root
// object, from which services such as the program runner are obtained.
#pragma once

#include "com/IUnknown.h"

struct IqxProviderSite : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("415BB41E-6523-407B-BCA5-69623C0C2B8C");

    // The root object given to the provider's Initialize, with a reference; E_UNEXPECTED (and
    // null) before initialisation, E_POINTER for a null slot.
    virtual HRESULT GetSite(IUnknown** site) = 0;
};
