// Offered by the object of a project item that owns a resource tree (a hardware target).
#pragma once

#include "com/IUnknown.h"

struct IwbhwResourceTreeNode;

struct IwbhwResourceTreeProvider : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("369BE95D-FD55-4708-8915-F710BE89AC12");

    // The root of the target's resource tree, with a reference; E_POINTER for a null ROOT.
    virtual HRESULT GetResourceTreeRoot(IwbhwResourceTreeNode** root) = 0;
};
