// Offered by items whose compiled code depends on their configuration.
#pragma once

#include "com/Bstr.h"
#include "com/IUnknown.h"

struct IwbCompileConfiguration : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("5E0C7A41-2B7D-4F61-9C1E-7D3A2F90B6C4");

    // A new BSTR in TEXT that changes exactly when code compiled against the item must change
    // (empty for an item on its way out). Never fails but for a null TEXT (E_POINTER).
    virtual HRESULT GetCompileConfiguration(BSTR* text) = 0;
};
