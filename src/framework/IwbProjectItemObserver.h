// Told by the host of changes to project items: an item object hears what happened to its own
// item (and, for a folder moved with it, to the folder above it).
#pragma once

#include "com/IUnknown.h"

struct IwbProjectItem;

namespace wbproj::item_event {
// The item (or a folder above it) was moved to another parent.
inline constexpr uint32_t kMoved = 8;
} // namespace wbproj::item_event

// One change. Items are the host's; no reference is handed over with the event.
struct WbProjectItemEvent {
    uint32_t kind = 0;
    IwbProjectItem* item = nullptr;      // the item that changed (for a move: the one moved)
    IwbProjectItem* oldParent = nullptr; // for a move: where it was
    IwbProjectItem* newParent = nullptr; // for a move: where it is now
};

struct IwbProjectItemObserver : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("5B0E7D3C-94A1-4F62-8C1D-2E6F9A3B7C05");

    // COUNT events, in the order they happened; the items are already where the events put them.
    virtual HRESULT OnProjectItemEvents(uint32_t count, const WbProjectItemEvent* events) = 0;
};
