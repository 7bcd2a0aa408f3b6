// Drag and drop in the project tree, asked of the item being dropped on.
#pragma once

#include "com/IUnknown.h"

struct IwbProjectDragDrop : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("E2A7C5B9-31D6-4C8E-9F04-7B6D5A8C2E13");

    // S_OK when DRAGGED (the framework's data object) may be dropped on the item, S_FALSE when
    // not.
    virtual HRESULT DropAllowed(IUnknown* dragged) = 0;
    // Drops DRAGGED on the item; HANDLED (optional) receives 1 when the item took care of it,
    // 0 when the framework should do its default move.
    virtual HRESULT Drop(IUnknown* dragged, int32_t* handled) = 0;
};

// The framework's data object of a drag: the project items being dragged.
struct IqxDragData : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("4D8B2F6A-7C15-4E93-A0B1-9E3C5D7F2A48");

    // How many items are dragged.
    virtual HRESULT GetCount(uint32_t* count) = 0;
};
