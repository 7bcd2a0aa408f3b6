// The node interface the hardware-resource service gives out for a resource-tree refnum.
#pragma once

#include "com/Bstr.h"
#include "com/IUnknown.h"

// Nodes found through FindNode are used through this same interface.
struct IwbhwResourceTreeAccess : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("238663B5-BA4F-4A53-82EE-986B3E80C8F2");

    // The descendant at PATH: 0 and the node, 1 and null when PATH names none. MATCHED
    // (optional) receives how many characters of PATH named existing nodes; RESERVED is 0.
    virtual HRESULT FindNode(const char16_t* path, uint32_t* matched, uint32_t reserved,
                             IwbhwResourceTreeAccess** node) = 0;
    // The node's subtree as text, in the service's own dump form.
    virtual HRESULT Dump(BSTR* text) = 0;
    // The protocols the node supports: COUNT texts in a CoTaskMemAlloc array of BSTRs.
    virtual HRESULT GetSupportedProtocols(uint32_t* count, BSTR** protocols) = 0;
    // Sets property NAME of the node to VALUE.
    virtual HRESULT SetProperty(const char16_t* name, const char16_t* value) = 0;
    // Adds the resource-tree XML text XML beneath the node.
    virtual HRESULT InsertSubTree(const char16_t* xml) = 0;
    // Removes the child subtree called NAME; 1 when there is no such child.
    virtual HRESULT RemoveSubTree(const char16_t* name) = 0;
};
