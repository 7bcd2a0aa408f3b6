// The object the host keeps behind its own items (the project root, folders and targets), so
// that every item on the way from an I/O item up to its target has an object to ask, as the
// module's resource lookups expect, and so that a host program holding a refnum of one reaches
// its item as it reaches the framework's items.
#pragma once

#include "com/ComObject.h"
#include "com/ComPtr.h"
#include "framework/IqxItem.h"
#include "framework/IqxProjectItemUI.h"
#include "host/contracts/IwbProjectItem.h"

namespace wbhost::project {

// What the host's own item objects answer: the project item they stand for.
struct IwbHostItemObject : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("A3E1F5C7-2B4D-4E69-8F10-6C7B9D2E4A35");

    // The project item behind the object, with a reference; 1 and null once it was closed.
    virtual HRESULT GetProjectItem(IwbProjectItem** item) = 0;
};

class HostItemObject : public IwbHostItemObject, public IqxItem, public IqxProjectItemUI {
public:
    using Interfaces = qv::com::InterfaceList<IwbHostItemObject, IqxItem, IqxProjectItemUI>;
    // The object of ITEM; it does not hold ITEM (the item holds its object).
    explicit HostItemObject(IwbProjectItem* item) : item_(item) {}
    virtual ~HostItemObject() = default;

    // Answers both IwbHostItemObject and IqxProjectItemUI.
    HRESULT GetProjectItem(IwbProjectItem** item) override;
    // IqxItem: the object is its own project-tree side.
    HRESULT GetProjectItemUI(IqxProjectItemUI** itemUI) override;
    // IqxProjectItemUI: the host's containers take any non-empty name, have no properties
    // dialog and no overlays, and may be removed.
    HRESULT ValidateNewName(const char16_t* name) override;
    HRESULT ShowProperties() override { return E_NOTIMPL; }
    HRESULT UpdateOverlays() override { return S_OK; }
    HRESULT GetOverlays(uint32_t* count, BSTR** images) override;
    HRESULT QueryCanRemove() override { return S_OK; }

    // The item is going: the object answers "none" from now on.
    void Forget() noexcept { item_ = nullptr; }

private:
    IwbProjectItem* item_;
};

// The objects of folders and the project root.
using FolderObjectInstance = CQVComObject<HostItemObject>;

} // namespace wbhost::project
