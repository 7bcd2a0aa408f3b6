// The project item information record, and the host object that maps records to item objects.
#pragma once

#include "com/IUnknown.h"

#include <cstddef>

struct IwbProjectItem;

// Describes one project item; the caller sets size to sizeof(QxItemInfoRecord) before asking.
struct QxItemInfoRecord {
    uint32_t size = sizeof(QxItemInfoRecord);
    uint32_t flags = 0;
    GUID id{};                        // the item's identifier, stable across saves
    GUID type{};                      // the item's type
    IwbProjectItem* item = nullptr;   // the described item (no reference)
    uint64_t reserved[3] = {0, 0, 0}; // kept zero
};
static_assert(sizeof(QxItemInfoRecord) == 72, "the information record is 72 bytes");
static_assert(offsetof(QxItemInfoRecord, id) == 8 && offsetof(QxItemInfoRecord, item) == 40,
              "information record layout");

struct IwbProjectItemUIMap : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("219E4BAA-6CAE-43C3-BF22-40A8BB86B9A6");

    // The item-UI object of the item RECORD describes; 1 and null when it has none; E_INVALIDARG
    // when the record's size is not 72.
    virtual HRESULT GetItemUI(const QxItemInfoRecord* record, IUnknown** itemUI) = 0;
};
