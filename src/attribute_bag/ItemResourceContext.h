// Where an item's resources live: the ancestor project item whose object owns a resource tree
// (a hardware target), found by walking up from the item through the host's item-object map.
#pragma once

#include "com/ComPtr.h"
#include "host/ResourceNode.h"
#include "host/contracts/IwbProjectItem.h"
#include "host/contracts/IwbhwResourceTreeProvider.h"

class ItemResourceContext {
public:
    // Walks up from ITEM (itself first) to the first item whose object offers a resource tree.
    // Answers 0 when one was found; 1 when none was and ALLOWMISSINGOWNER, else E_FAIL; E_FAIL
    // too when ITEM's object says it has no resource context, or the host gives no object for
    // an item on the way. Other failures of the host are answered as they come.
    HRESULT Fill(IwbProjectItem* item, bool allowMissingOwner = false);

    // The item the context was filled from (no reference added); null before.
    IwbProjectItem* Item() const noexcept { return item_.Get(); }
    // The ancestor that owns the resource tree; null when none was found.
    IwbProjectItem* Owner() const noexcept { return owner_.Get(); }
    // The owner's object (any interface of it); null when none was found.
    IUnknown* OwnerObject() const noexcept { return ownerObject_.Get(); }
    // The root of the owner's tree, fetched from the owner on first use and kept; empty when
    // there is no owner. A failing fetch throws qv::host::StatusError.
    const qv::host::ResourceNode& Root();

private:
    qv::com::ComPtr<IwbProjectItem> item_;
    qv::com::ComPtr<IwbProjectItem> owner_;
    qv::com::ComPtr<IUnknown> ownerObject_;
    qv::com::ComPtr<IwbhwResourceTreeProvider> provider_;
    qv::host::ResourceNode root_;
};
