// The project's map from item information records to the items' objects.
#pragma once

#include "com/ComObject.h"
#include "host/contracts/IwbProjectItem.h"
#include "host/contracts/IwbProjectItemUIMap.h"

namespace wbhost::project {

class ItemUIMap : public IwbProjectItemUIMap {
public:
    using Interfaces = qv::com::InterfaceList<IwbProjectItemUIMap>;
    virtual ~ItemUIMap() = default;
    // The object of RECORD's item: 1 and null when it has none; E_POINTER for null arguments,
    // E_INVALIDARG for a record of another size or without an item.
    HRESULT GetItemUI(const QxItemInfoRecord* record, IUnknown** itemUI) override;
};

} // namespace wbhost::project
