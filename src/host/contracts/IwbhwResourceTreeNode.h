// A node of a host resource tree (a target's lines, channels and their definitions).
#pragma once

#include "com/Bstr.h"
#include "com/IUnknown.h"

struct IwbhwResourceTreeNodeObserver;
struct IwbProjectItem;

// Every text handed out is a new BSTR the caller frees; every node or item handed out carries a
// reference; arrays come from CoTaskMemAlloc. Null out-parameters give E_POINTER.
struct IwbhwResourceTreeNode : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("2C4AABA8-4550-479D-B84A-06FBE9204F97");

    // The node's name.
    virtual HRESULT GetName(BSTR* name) = 0;
    // The node's path from the tree root ("/"-separated, "/" inside names escaped).
    virtual HRESULT GetPath(BSTR* path) = 0;
    // The node's element type ("Method", "AttributeSet", ...).
    virtual HRESULT GetElementType(BSTR* type) = 0;
    // Attribute NAME: 0 and its value, or 1 and a null value when absent.
    virtual HRESULT GetAttribute(const char16_t* name, BSTR* value) = 0;
    // The attribute at INDEX in the node's order: 0 with name and value, 1 past the last one.
    virtual HRESULT GetAttributeAt(uint32_t index, BSTR* name, BSTR* value) = 0;
    // Sets (adds or replaces) attribute NAME; observers hear value added or changed.
    virtual HRESULT SetAttribute(const char16_t* name, const char16_t* value) = 0;
    // The parent node; 1 and null at the root.
    virtual HRESULT GetParent(IwbhwResourceTreeNode** parent) = 0;
    // All children in order: COUNT nodes in a CoTaskMemAlloc array (null when there are none).
    virtual HRESULT GetChildren(uint32_t* count, IwbhwResourceTreeNode*** children) = 0;
    // The children of element type TYPE, in order, as GetChildren.
    virtual HRESULT GetChildrenOfType(const char16_t* type, uint32_t* count,
                                      IwbhwResourceTreeNode*** children) = 0;
    // The descendant at the relative PATH: 0 and the node, or 1 and null when none; MATCHED
    // (optional) receives how many characters of PATH named existing nodes.
    virtual HRESULT FindNode(const char16_t* path, uint32_t* matched,
                             IwbhwResourceTreeNode** node) = 0;
    // Registers OBSERVER for the event bits of MASK under KIND (a number handed back on each
    // call); a second registration with the same kind replaces the mask.
    virtual HRESULT AddObserver(IwbhwResourceTreeNodeObserver* observer, uint32_t mask,
                                uint32_t kind) = 0;
    // Removes OBSERVER's registration of KIND; kind 0xFFFFFFFF with WHOLESUBTREE non-zero removes
    // every registration of OBSERVER on this node and below. 1 when there was none.
    virtual HRESULT RemoveObserver(IwbhwResourceTreeNodeObserver* observer, uint32_t kind,
                                   int32_t wholeSubtree) = 0;
    // Saves the node's notification state into STATE and silences its notifications.
    virtual HRESULT SaveNotificationState(uint32_t* state) = 0;
    // Restores the notification state saved by SaveNotificationState.
    virtual HRESULT RestoreNotificationState(uint32_t state) = 0;
    // The node's value text (empty when it has none).
    virtual HRESULT GetValue(BSTR* value) = 0;
    // Reserves the node for ITEM with MODE (3 for I/O items): 0 granted, 1 held by another item.
    virtual HRESULT Reserve(IwbProjectItem* item, uint32_t mode) = 0;
    // 0 when the node is reserved for ITEM, 1 when it is not.
    virtual HRESULT QueryReservation(IwbProjectItem* item) = 0;
    // Releases ITEM's reservation; 1 when ITEM held none.
    virtual HRESULT ReleaseReservation(IwbProjectItem* item) = 0;
    // The project items other than EXCEPT (may be null) that reserve the node, as GetChildren.
    virtual HRESULT GetReservingItems(IwbProjectItem* except, uint32_t* count,
                                      IwbProjectItem*** items) = 0;
};
