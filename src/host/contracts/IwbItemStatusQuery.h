// Offered by some host item objects: whether the item is in a state that has no resource
// context (an item that answers true is skipped by resource lookups).
#pragma once

#include "com/IUnknown.h"

struct IwbItemStatusQuery : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("85B4BAC4-01A9-4131-B06A-45C030F6B28C");

    // S_OK (true) or S_FALSE (false).
    virtual HRESULT QueryStatus() = 0;
};
