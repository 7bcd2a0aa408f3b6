// The host's data object of a drag in the project tree: the items being dragged, handed to the
// dragged item's drop checks.
#pragma once

#include "com/ComObject.h"
#include "com/ComPtr.h"
#include "framework/IwbProjectDragDrop.h"
#include "host/contracts/IwbProjectItem.h"

#include <vector>

namespace wbhost::project {

class DragDataImpl : public IqxDragData {
public:
    using Interfaces = qv::com::InterfaceList<IqxDragData>;

    // A drag of ITEMS (each held with a reference while the drag lasts).
    explicit DragDataImpl(std::vector<qv::com::ComPtr<IwbProjectItem>> items)
        : items_(std::move(items)) {}
    virtual ~DragDataImpl() = default;

    HRESULT GetCount(uint32_t* count) override {
        if (!count)
            return E_POINTER;
        *count = static_cast<uint32_t>(items_.size());
        return S_OK;
    }

private:
    std::vector<qv::com::ComPtr<IwbProjectItem>> items_;
};
using DragData = CQVComObject<DragDataImpl>;

} // namespace wbhost::project
