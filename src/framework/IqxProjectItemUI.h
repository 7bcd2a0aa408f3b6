// The project-tree side of an item object: renames, properties, overlays, removal queries.
#pragma once

#include "com/Bstr.h"
#include "com/IUnknown.h"

struct IwbProjectItem;

struct IqxProjectItemUI : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("CCAC84A4-B4CE-452A-8286-89E841C04F8D");

    // S_OK accepts NAME as the item's new name, S_FALSE rejects it (a null NAME is rejected).
    virtual HRESULT ValidateNewName(const char16_t* name) = 0;
    // Shows the item's properties dialog.
    virtual HRESULT ShowProperties() = 0;
    // Refreshes the item's icon overlays (the framework asks when the tree is redrawn).
    virtual HRESULT UpdateOverlays() = 0;
    // The overlay images now shown: COUNT BSTRs in a CoTaskMemAlloc array (null when none).
    virtual HRESULT GetOverlays(uint32_t* count, BSTR** images) = 0;
    // S_OK when the item may be removed (or cut), S_FALSE when it may not.
    virtual HRESULT QueryCanRemove() = 0;
    // The host project item the object stands for, with a reference; 1 and null while it is not
    // bound to one. Null ITEM gives E_POINTER.
    virtual HRESULT GetProjectItem(IwbProjectItem** item) = 0;
};
