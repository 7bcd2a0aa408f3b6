// The interfaces of a Tangent I/O item that the host, the exports and other items ask for.
// Texts handed out are new BSTRs the caller frees; arrays come from CoTaskMemAlloc.
#pragma once

#include "com/Bstr.h"
#include "com/IUnknown.h"

// The resource an item stands for.
struct IwbhwResourceItemUI : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("B402108D-1434-4079-9A55-42C4F1E8564C");

    // The item's resource path in PATH (required, else E_POINTER). When the path is not empty,
    // EXISTS and RESERVED (each optional) tell whether the node exists and is reserved for the
    // item. Answers 1 for an empty path.
    virtual HRESULT GetResource(BSTR* path, int32_t* exists, int32_t* reserved) = 0;
    // The resource path alone, as GetResource.
    virtual HRESULT GetResourcePath(BSTR* path) = 0;
};

struct IwbhwResourceItemUI2 : IwbhwResourceItemUI {
    using BaseInterface = IwbhwResourceItemUI;
    static constexpr IID iid = qv::com::ParseGuid("2E8ABA7C-DA58-4D4F-85F6-8418D25E0330");

    // Binds the item to its resource again (as after a change of the tree).
    virtual HRESULT Rebind() = 0;
    // Makes PATH the item's resource and binds to it.
    virtual HRESULT SetResource(const char16_t* path) = 0;
};

// What only the module's own parts ask of an item.
struct IwbTIOItemUIPrivate : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("6AEC313F-76E0-460E-982D-68E3BEE06341");

    // Applies COUNT cluster texts (name and value of one attribute each) to the item's working
    // set, then binds again. The first text that does not parse stops the applying (the texts
    // before it stay applied); the item binds all the same, and answers the binding's failure,
    // else that text's status.
    virtual HRESULT SetAttributes(uint32_t count, const char16_t* const* texts) = 0;
    // The name the resource suggests for the item in NAME (null when empty); FROMRESOURCE
    // (optional) receives 0 when it came from the node's "NameDecoration", else 1.
    virtual HRESULT GetDecoratedName(BSTR* name, int32_t* fromResource) = 0;
    // A name for an item of this item's name scope: PROPOSED when no resource item there carries
    // it, else the one the host's unique-name program makes of it (in UNIQUE).
    virtual HRESULT GenerateUniqueName(const char16_t* proposed, BSTR* unique) = 0;
};

// The item's attributes, by path and by name.
struct IwbTIOGAttributeSet : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("E8EEB46F-0A96-47F3-9D0F-6ECD2A24CFC6");

    // The value of the attribute at PATH (a set path followed by the name); 1 when absent.
    virtual HRESULT GetAttribute(const char16_t* path, BSTR* value) = 0;
    // The names of the working set's own attributes: COUNT BSTRs in NAMES. OPTIONS is a list of
    // KEY=VALUE pairs separated by ","; "includePath=true" prefixes each name with its set's path.
    virtual HRESULT GetAttributeNames(const char16_t* options, uint32_t* count, BSTR** names) = 0;
};

// The Tangent I/O item as such.
struct IwbTIOInstanceItemUI : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("C73BB547-0476-4726-8844-F2F25B0A7D6C");

    // Marks the item as a physical one (non-zero) or not.
    virtual HRESULT SetPhysical(int32_t physical) = 0;
    // S_OK when the item is physical, S_FALSE when not.
    virtual HRESULT IsPhysical() = 0;
    // S_OK when the item is bound to its resource, S_FALSE when not.
    virtual HRESULT ResourceOK() = 0;
    // The resource status: 0 bound, 1 missing, 2 held by another item.
    virtual HRESULT GetResourceStatus(int32_t* status) = 0;
};

// Whether the item is in error, and why.
struct IwbTIOItemError : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("75419F68-BB35-46E6-A292-7258C5D6896C");

    // S_OK when the item has an error, S_FALSE when not.
    virtual HRESULT HasError() = 0;
    // The error text in TEXT (empty when there is none): the message that names the item, and
    // for a conflict the item that holds its resource too.
    virtual HRESULT GetErrorText(BSTR* text) = 0;
    // The error text in TEXT, the category's title in TITLE (both required) and the category:
    // 0 resource missing, 1 physical resource missing, 2 resource held by another item too,
    // 3 no error.
    virtual HRESULT GetErrorCategory(BSTR* text, BSTR* title, int32_t* category) = 0;
};

// The chain of project items from the item's target down to its parent.
struct IwbTIOItemScope : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("D93F7050-ADF0-41BE-91AF-1007EFBCB369");

    // The items above this one, from its target down to its parent: COUNT entries, the item
    // types in TYPES and the names in NAMES.
    virtual HRESULT GetScope(uint32_t* count, GUID** types, BSTR** names) = 0;
};
