// The project's item-object map.
#include "project/ItemUIMap.h"

namespace wbhost::project {

HRESULT ItemUIMap::GetItemUI(const QxItemInfoRecord* record, IUnknown** itemUI) {
    if (record == nullptr || itemUI == nullptr)
        return E_POINTER;
    *itemUI = nullptr;
    if (record->size != sizeof(QxItemInfoRecord) || record->item == nullptr)
        return E_INVALIDARG;
    return record->item->GetObject(itemUI);
}

} // namespace wbhost::project
