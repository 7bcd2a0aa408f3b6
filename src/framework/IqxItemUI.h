// The main interface of an item object in the project tree, and its context-menu entry record.
#pragma once

#include "com/Bstr.h"
#include "com/IUnknown.h"

#include <cstddef>

// One context-menu entry. Arrays of entries are handed out with CoTaskMemAlloc; the receiver
// frees each text with SysFreeString and then the array.
struct QxMenuEntry {
    BSTR text;
    uint32_t flags;
    uint32_t kind;
    uint32_t group;
    uint32_t position;
    GUID command;
};
static_assert(sizeof(QxMenuEntry) == 40 && offsetof(QxMenuEntry, command) == 24,
              "menu entry layout");

struct IqxItemUI : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("3B7F708F-9D04-40E3-81A1-608C91786527");

    // The framework's initialisation, once after creation.
    virtual HRESULT Initialize() = 0;
    // The icon file name as a new BSTR (empty when the item has none).
    virtual HRESULT GetIconName(BSTR* name) = 0;
    // The item's option word (bits the framework interprets).
    virtual HRESULT GetOptionWord(uint32_t* options) = 0;
    // The item's context-menu entries: COUNT records (ENTRIES null when none).
    virtual HRESULT GetContextMenu(uint32_t* count, QxMenuEntry** entries) = 0;
    // Runs COMMAND; S_FALSE for a command the item does not know.
    virtual HRESULT ExecuteCommand(const GUID& command) = 0;
    // S_OK when the item's configuration is valid, S_FALSE when not.
    virtual HRESULT IsValid() = 0;
    // The item is being removed from the project.
    virtual HRESULT Remove() = 0;
    // Help for the item: file PATH, TOPIC and (optional) LOCALIZEDCONTEXT, each a new BSTR.
    virtual HRESULT GetHelp(BSTR* path, BSTR* topic, BSTR* localizedContext) = 0;
    // The help of the item's type when the item names none: FILE, TOPIC (new BSTRs) and the
    // KIND of help the host shows; S_FALSE with null texts when the type has none.
    virtual HRESULT GetDefaultHelp(BSTR* file, BSTR* topic, uint32_t* kind) = 0;
};
