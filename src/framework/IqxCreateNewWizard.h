// The create-new wizard of a provider: describes the items it can add and adds them.
#pragma once

#include "com/Bstr.h"
#include "com/IUnknown.h"

#include <cstddef>

// What the framework asks the wizard to do: the parent item (by identifier) for new items.
struct QxCreateNewRequest {
    uint32_t size = sizeof(QxCreateNewRequest);
    uint32_t flags = 0;
    GUID parentItemId{};
};
static_assert(sizeof(QxCreateNewRequest) == 24, "create-new request layout");

// One kind of new item the wizard offers; arrays come from CoTaskMemAlloc and each display name
// is freed with SysFreeString.
struct QxNewItemDescription {
    GUID itemType;
    int32_t position; // -1: no particular position
    uint32_t reserved;
    BSTR displayName;
    uint64_t icon; // a host icon handle, 0 for none
};
static_assert(sizeof(QxNewItemDescription) == 40 && offsetof(QxNewItemDescription, icon) == 32,
              "new-item description layout");

struct IqxCreateNewWizard : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("6A1F8F17-4BE6-4B57-8414-A1621A8C6FD8");

    // Runs the wizard for REQUEST and creates the items the user chose; S_OK also when the user
    // cancels. A null REQUEST gives E_POINTER.
    virtual HRESULT Run(const QxCreateNewRequest* request) = 0;
    // The new items the wizard offers for REQUEST: COUNT descriptions (null when none).
    virtual HRESULT GetNewItemDescriptions(const QxCreateNewRequest* request, uint32_t* count,
                                           QxNewItemDescription** descriptions) = 0;
};
