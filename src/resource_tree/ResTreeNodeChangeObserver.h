// The change bits of resource-tree nodes and the interface through which nodes report them.
#pragma once

#include <cstdint>

namespace wbhw {

class ResTreeNode;

// The changes a node reports, as bits of one 32-bit set.
enum ResTreeChange : uint32_t {
    kDetached = 0x001,                // raised on a removed child just before it is deleted
    kDisplayNameChanged = 0x002,      // the node's "DisplayName" text was set
    kValueChanged = 0x004,            // a text entry's value was set
    kValueAdded = 0x008,              // a text entry was added
    kValueRemoved = 0x010,            // a text entry was removed
    kAncestorChanged = 0x020,         // forwarded from the parent
    kReservationChanged = 0x040,      // forwarded from a reserved node
    kChildRemoved = 0x080,            // a child or link entry was removed
    kChildAdded = 0x100,              // a child or link entry was added
    kChildDisplayNameChanged = 0x200, // a child's "DisplayName" was set (raised on the parent)
    kDetaching = 0x400,               // raised on a removed child before its children go
};

// Every change bit at once.
inline constexpr uint32_t kAllChanges = 0xFFFFFFFFu;
// The cookie that RemoveObserver reads as "every registration of the observer".
inline constexpr uint32_t kAnyCookie = 0xFFFFFFFFu;

// Receives the changes of the nodes it is registered with.
class ResTreeNodeChangeObserver {
public:
    virtual ~ResTreeNodeChangeObserver() = default;
    // NODE changed by the bits CHANGES (called when they share a bit with the registration's
    // mask; all bits of the delivery are passed); COOKIE is the value given at registration.
    virtual void OnNodeChanged(ResTreeNode* node, uint32_t changes, uint32_t cookie) = 0;
    // A query kept for the host's observers; every observer of this module answers false.
    virtual bool IsDeferredObserver() const { return false; }
};

} // namespace wbhw
