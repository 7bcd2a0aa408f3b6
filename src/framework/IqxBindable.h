// Offered by item and wizard objects: binding to the project item they stand for.
#pragma once

#include "com/IUnknown.h"

struct IwbProjectItem;

struct IqxBindable : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("FFFF07C9-D1B8-4AC8-A256-3E1C9B451D8C");

    // Binds the object to ITEM (an item: the host item behind it; a wizard: the parent item under
    // which it creates). A null ITEM gives E_INVALIDARG.
    virtual HRESULT Bind(IwbProjectItem* item) = 0;
};
