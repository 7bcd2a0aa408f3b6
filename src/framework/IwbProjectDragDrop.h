// Drag and drop in the project tree, asked of the item being dragged.
#pragma once

#include "com/IUnknown.h"

struct IwbProjectItem;

struct IwbProjectDragDrop : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("E2A7C5B9-31D6-4C8E-9F04-7B6D5A8C2E13");

    // Drops the item. FIRST, SECOND and THIRD are the host's numbers of the drop, FOURTH a
    // further host argument, EFFECTS the effects the drop allows; EFFECT (optional) receives the
    // effect the item took on (the base: 1, the item handled it).
    virtual HRESULT Drop(int32_t first, int32_t second, int32_t third, int32_t fourth,
                         uint32_t effects, uint32_t* effect) = 0;
    // S_OK when the item, dragged as DRAGGED (the framework's data object), may be dropped under
    // TARGET; S_FALSE when not.
    virtual HRESULT DropAllowed(IUnknown* dragged, IwbProjectItem* target) = 0;
};

// Told of the item once a drop has put it in its new place.
struct IwbProjectDragDropped : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("FD77ACDE-EB3A-4222-A756-CB650F0E1F91");

    // The item was dropped and now stands where the drop put it.
    virtual HRESULT Dropped() = 0;
};

// The framework's data object of a drag: the project items being dragged.
struct IqxDragData : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("4D8B2F6A-7C15-4E93-A0B1-9E3C5D7F2A48");

    // How many items are dragged.
    virtual HRESULT GetCount(uint32_t* count) = 0;
};
