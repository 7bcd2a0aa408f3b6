// Called by the host for each item of an enumeration (IwbProjectItem::EnumerateItems).
#pragma once

#include "com/IUnknown.h"

struct IwbProjectItem;

struct IwbProjectItemSelector : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("2CB592BA-3405-485D-941E-4F740D5A08FC");

    // S_OK selects ITEM and ends the walk; S_FALSE goes on; a failure ends the walk with it.
    virtual HRESULT SelectItem(IwbProjectItem* item) = 0;
};
