// The framework's handle on an item of the project tree, as host programs reach it through a
// refnum: it leads to the item's project-tree side.
#pragma once

#include "com/IUnknown.h"

struct IqxProjectItemUI;

struct IqxItem : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("B62F77EA-FB68-4E99-9F8C-64A07AC20C53");

    // The item's project-tree side, with a reference. Null ITEMUI gives E_POINTER.
    virtual HRESULT GetProjectItemUI(IqxProjectItemUI** itemUI) = 0;
};
