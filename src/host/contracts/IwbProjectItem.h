// The host's project item: the project-side object behind each item, its target and folders.
#pragma once

#include "com/Bstr.h"
#include "com/IUnknown.h"

struct IwbProjectItemSelector;
struct IwbProjectItemUIMap;
struct IwbProjectPropertyBag;
struct QxItemInfoRecord;

namespace wbproj {
// Item type of project folders.
inline constexpr GUID kFolderType = qv::com::ParseGuid("D60740D6-F254-4BBC-5675-8858F35B820E");
// Bit of the flag word that shows the item in the project tree (clear = hidden).
inline constexpr uint32_t kShownFlag = 0x10;
// Refresh codes: after a rename or a resource move, and after a status change.
inline constexpr uint32_t kUpdateRenamed = 512;
inline constexpr uint32_t kUpdateStatus = 516;
} // namespace wbproj

// Texts handed out are new BSTRs; items and objects handed out carry a reference. Null
// out-parameters give E_POINTER. Every call arrives on the host's user-interface thread.
struct IwbProjectItem : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("068CEEA0-D809-11D2-954B-006097B77FC1");

    // The item's name.
    virtual HRESULT GetName(BSTR* name) = 0;
    // Renames the item (no uniqueness check: the plug-in enforces its own rules).
    virtual HRESULT SetName(const char16_t* name) = 0;
    // The item's type.
    virtual HRESULT GetTypeGuid(GUID* type) = 0;
    // The parent item; 1 and null for the project root.
    virtual HRESULT GetParent(IwbProjectItem** parent) = 0;
    // The child called NAME (compared without regard to case); 1 and null when absent.
    virtual HRESULT FindChild(const char16_t* name, IwbProjectItem** child) = 0;
    // Creates a child of TYPE called NAME (the provider of TYPE creates its object); CHILD
    // (optional) receives it.
    virtual HRESULT CreateChild(const GUID& type, const char16_t* name, IwbProjectItem** child) = 0;
    // The item's object (the item-UI object its provider created); 1 and null when none.
    virtual HRESULT GetObject(IUnknown** object) = 0;
    // The item's saved properties.
    virtual HRESULT GetPropertyBag(IwbProjectPropertyBag** bag) = 0;
    // Refreshes the item in the project tree with UPDATECODE (wbproj::kUpdate...).
    virtual HRESULT Refresh(uint32_t updateCode) = 0;
    // Selects the item in the project tree.
    virtual HRESULT Select() = 0;
    // Brings the item into view (SHOW 1) in the project tree.
    virtual HRESULT Show(int32_t show) = 0;
    // The item's flag word.
    virtual HRESULT GetFlags(uint32_t* flags) = 0;
    // Replaces the item's flag word (callers change only wbproj::kShownFlag).
    virtual HRESULT SetFlags(uint32_t flags) = 0;
    // Walks the items below this one and calls SELECTOR for each; stops at the first it
    // selects: S_OK with that item in SELECTED (optional), S_FALSE when it selects none, a
    // failure of the selector ends the walk with it. Items whose object offers
    // IwbProjectItemScope are visited but not descended into.
    virtual HRESULT EnumerateItems(IwbProjectItemSelector* selector, IwbProjectItem** selected) = 0;
    // Fills RECORD (whose size field the caller set) with the item's information record.
    virtual HRESULT GetInfoRecord(QxItemInfoRecord* record) = 0;
    // The host object that maps information records to item-UI objects.
    virtual HRESULT GetItemUIMap(IwbProjectItemUIMap** map) = 0;
};
