// Observer of a host resource-tree node, and the event bits nodes report to it.
#pragma once

#include "com/IUnknown.h"

namespace wbhw::node_event {
// The event bits of resource-tree node changes; an observer hears only the bits of its mask.
inline constexpr uint32_t kDetached = 0x1;           // the node was detached or destroyed
inline constexpr uint32_t kDisplayName = 0x2;        // its display name changed
inline constexpr uint32_t kValueChanged = 0x4;       // an attribute value changed
inline constexpr uint32_t kValueAdded = 0x8;         // an attribute was added
inline constexpr uint32_t kValueRemoved = 0x10;      // an attribute was removed
inline constexpr uint32_t kFromAncestor = 0x20;      // forwarded from an ancestor
inline constexpr uint32_t kFromReservation = 0x40;   // forwarded from a reservation change
inline constexpr uint32_t kChildRemoved = 0x80;      // a child was removed
inline constexpr uint32_t kChildAdded = 0x100;       // a child was added
inline constexpr uint32_t kChildDisplayName = 0x200; // a child's display name changed
inline constexpr uint32_t kAboutToBeRemoved = 0x400; // the node is about to be removed
} // namespace wbhw::node_event

// Implemented by whoever watches nodes (the I/O item); called on the thread that changes the
// tree, possibly while the caller is itself inside a call to the tree.
struct IwbhwResourceTreeNodeObserver : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("9680ABD8-9238-40F4-9D5E-91D3A527FCD5");

    // NODE (ask it for IwbhwResourceTreeNode) changed by EVENTS (bits within the registration's
    // mask); KIND is the number the observer registered with.
    virtual HRESULT OnNodeEvent(IUnknown* node, uint32_t events, uint32_t kind) = 0;
};
