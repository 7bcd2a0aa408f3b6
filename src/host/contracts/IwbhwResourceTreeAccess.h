// The node interface the hardware-resource service gives out for a resource-tree refnum.
#pragma once

#include "com/Bstr.h"
#include "com/IUnknown.h"

// Nodes found through FindNode are used through this same interface.
struct IwbhwResourceTreeAccess : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("238663B5-BA4F-4A53-82EE-986B3E80C8F2");

    // The descendant at PATH: 0 and the node. 1 when PATH names none; then, only when MATCHED is
    // asked for, *NODE is the deepest node that the leading part of PATH names (the node asked
    // when no piece of PATH names one), so that a caller can act on where the path leaves the
    // tree; without MATCHED, *NODE is null. So a caller asking whether PATH names a node tests the
    // answer, never the node. MATCHED (optional) receives how many characters of PATH named
    // existing nodes: up to the end of the last piece that did, the separator after it not
    // counted. RESERVED is 0.
    virtual HRESULT FindNode(const char16_t* path, uint32_t* matched, uint32_t reserved,
                             IwbhwResourceTreeAccess** node) = 0;
    // The node's subtree as text, in the service's own dump form.
    virtual HRESULT Dump(BSTR* text) = 0;
    // The protocols the node supports: COUNT texts in a CoTaskMemAlloc array of BSTRs.
    virtual HRESULT GetSupportedProtocols(uint32_t* count, BSTR** protocols) = 0;
    // Sets property NAME of the node to VALUE: 0 set, 1 not set. NAME is read as the rest of a
    // path after what FindNode matched, so it can be passed as it stands: one leading "/" is
    // dropped and "\/" and "\\" stand for "/" and a backslash. A name that is then empty, "."
    // or "..", that still holds a separator (more than one piece of the path named nothing), or
    // that names a child of the node is not set.
    virtual HRESULT SetProperty(const char16_t* name, const char16_t* value) = 0;
    // Adds the resource-tree XML text XML beneath the node.
    virtual HRESULT InsertSubTree(const char16_t* xml) = 0;
    // Removes the child subtree called NAME; 1 when there is no such child.
    virtual HRESULT RemoveSubTree(const char16_t* name) = 0;
};
