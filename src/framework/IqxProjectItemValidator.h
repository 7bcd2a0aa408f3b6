// Offered by item objects: whether the item belongs to a given provider.
#pragma once

#include "com/IUnknown.h"

struct IqxProjectItemValidator : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("A66D0169-95AC-4E40-90FA-034E3061B608");

    // S_OK when the item was made by PROVIDER (same object identity), S_FALSE otherwise or when
    // PROVIDER is null.
    virtual HRESULT ValidateAgainst(IUnknown* provider) = 0;
};
