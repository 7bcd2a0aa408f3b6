// What host item objects answer when the module's child validation asks them: whether a type
// may go below them, whether they take children within a sub-scope, and for a target being
// placed, its properties and its project's resource tree. Answers are 0 (yes) and 1 (no) unless
// a failure status.
#pragma once

#include "com/Bstr.h"
#include "com/IUnknown.h"

struct IwbhwResourceTreeNode;

// Offered by the object of a parent that decides which item types go below it.
struct IwbChildTypeValidator : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("292FB8B8-5290-4D0A-B6A8-269CAD0E9415");

    virtual HRESULT AllowsChildType(const GUID& type) = 0;
};

// Offered by the object of a parent that decides where targets go.
struct IwbTargetPlacementValidator : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("053A6C8C-056D-4164-9549-8E9B5C14F84D");

    virtual HRESULT AllowsTargetType(const GUID& type) = 0;
};

// Offered by objects of items that hold a sub-scope of children.
struct IwbSubScopeContainer : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("4FA77803-5C83-4BA2-AA76-E2EF72969839");

    // Whether items may be placed below the container.
    virtual HRESULT AcceptsChildren() = 0;
};

// Named properties of an item's object: "Type" (the item type GUID as text) and, for targets,
// "Target Class" (the path of the node describing the target's class in its resource tree).
struct IwbItemObjectProperties : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("B19DBCB0-623E-4404-908B-2EE1A9CA0F25");

    // The property NAME in VALUE (a new BSTR); 1 and null when the object has none.
    virtual HRESULT GetProperty(const char16_t* name, BSTR* value) = 0;
};

// The project's resource tree, where its FPGA hosts are described.
struct IwbProjectResourceService : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("F1B2FBB4-18BD-4496-8387-994D4E728C6E");

    // The root of the tree in ROOT (with a reference).
    virtual HRESULT GetResourceTree(IwbhwResourceTreeNode** root) = 0;
};
