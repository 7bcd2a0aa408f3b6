// An opened host program: inputs are set and outputs read by terminal index around Run.
#pragma once

#include "com/Bstr.h"
#include "com/IUnknown.h"

// An index the program does not have, or of the wrong type, gives E_INVALIDARG. Texts handed
// out are new BSTRs; lists are CoTaskMemAlloc arrays of BSTRs.
struct IwbProgram : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("B8822E4A-257C-4B51-9D91-12C42C8517BC");

    // The 32-bit output INDEX (a Boolean is non-zero for true).
    virtual HRESULT GetOutputInt32(uint32_t index, int32_t* value) = 0;
    // The 32-bit status output INDEX.
    virtual HRESULT GetOutputStatus(uint32_t index, int32_t* status) = 0;
    // The string output INDEX.
    virtual HRESULT GetOutputString(uint32_t index, BSTR* value) = 0;
    // The list output INDEX: COUNT texts (ARRAY null when there are none).
    virtual HRESULT GetOutputStringList(uint32_t index, BSTR** array, uint32_t* count) = 0;
    // Sets input INDEX to a reference-sized value (a host reference).
    virtual HRESULT SetInputReference(uint32_t index, uint64_t value) = 0;
    // Sets input INDEX to a 32-bit value.
    virtual HRESULT SetInputInt32(uint32_t index, int32_t value) = 0;
    // Sets the string input INDEX (null is an empty text).
    virtual HRESULT SetInputString(uint32_t index, const char16_t* value) = 0;
    // Sets the string-array input INDEX to COUNT texts.
    virtual HRESULT SetInputStringArray(uint32_t index, const char16_t* const* array,
                                        uint32_t count) = 0;
    // Runs the program to its end.
    virtual HRESULT Run() = 0;
};
