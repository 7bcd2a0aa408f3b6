// Reading a host project item as plain values: its name, parent and object. A failing host
// call throws StatusError with the host's status.
#pragma once

#include "com/ComPtr.h"
#include "host/contracts/IwbProjectItem.h"

#include <string>

namespace qv::host {

std::u16string ItemName(IwbProjectItem& item);
// The type GUID of ITEM.
GUID ItemType(IwbProjectItem& item);
// The parent of ITEM; empty at the project root.
qv::com::ComPtr<IwbProjectItem> ItemParent(IwbProjectItem& item);
// The object behind ITEM; empty when it has none.
qv::com::ComPtr<IUnknown> ItemObject(IwbProjectItem& item);

} // namespace qv::host
