// The object the host keeps behind its own container items (the project root and folders), so
// that every item on the way from an I/O item up to its target has an object to ask, as the
// module's resource lookups expect.
#pragma once

#include "com/ComObject.h"
#include "com/ComPtr.h"
#include "host/contracts/IwbProjectItem.h"

namespace wbhost::project {

// What the host's own item objects answer: the project item they stand for.
struct IwbHostItemObject : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("A3E1F5C7-2B4D-4E69-8F10-6C7B9D2E4A35");

    // The project item behind the object, with a reference; 1 and null once it was closed.
    virtual HRESULT GetProjectItem(IwbProjectItem** item) = 0;
};

class FolderObject : public IwbHostItemObject {
public:
    using Interfaces = qv::com::InterfaceList<IwbHostItemObject>;
    // The object of ITEM; it does not hold ITEM (the item holds its object).
    explicit FolderObject(IwbProjectItem* item) : item_(item) {}
    virtual ~FolderObject() = default;

    HRESULT GetProjectItem(IwbProjectItem** item) override;
    // The item is going: the object answers "none" from now on.
    void Forget() noexcept { item_ = nullptr; }

private:
    IwbProjectItem* item_;
};

using FolderObjectInstance = CQVComObject<FolderObject>;

} // namespace wbhost::project
