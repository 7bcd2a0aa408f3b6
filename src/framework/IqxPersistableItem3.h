// The framework's own persistence of an item object, beside the host's property bag. Items that
// keep everything in their property bag answer "nothing to do".
#pragma once

#include "com/IUnknown.h"

struct IqxPersistableItem3 : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("0F4A6B2C-9E81-4D35-B7C2-5A1D3E6F7B84");

    // S_OK when the object has unsaved state of its own, S_FALSE when not.
    virtual HRESULT IsDirty() = 0;
    // Writes the object's own state into STREAM.
    virtual HRESULT SaveState(IUnknown* stream) = 0;
    // S_OK when the object wants its own state reloaded, S_FALSE when not.
    virtual HRESULT WantsState() = 0;
    // Reads the object's own state back from STREAM.
    virtual HRESULT LoadState(IUnknown* stream) = 0;
};
