// Typed properties of a project item, saved and loaded with the project by the host.
#pragma once

#include "com/Bstr.h"
#include "com/IUnknown.h"

// A read answers 1 (and leaves a null or zero value) when the property is absent. Every write
// takes a flag word that the host interprets. Values written read back unchanged, also after
// the project is saved and reopened.
struct IwbProjectPropertyBag : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("EA7892D9-8569-4FE6-9879-F1D65F136ED8");

    // String property NAME as a new BSTR.
    virtual HRESULT GetString(const char16_t* name, BSTR* value) = 0;
    // Sets string property NAME (null VALUE stores an empty text).
    virtual HRESULT SetString(const char16_t* name, const char16_t* value, uint32_t flags) = 0;
    // Signed integer property NAME.
    virtual HRESULT GetInt(const char16_t* name, int32_t* value) = 0;
    // Sets signed integer property NAME.
    virtual HRESULT SetInt(const char16_t* name, int32_t value, uint32_t flags) = 0;
    // Boolean property NAME (0 or 1).
    virtual HRESULT GetBool(const char16_t* name, int32_t* value) = 0;
    // Sets Boolean property NAME (any non-zero VALUE is true).
    virtual HRESULT SetBool(const char16_t* name, int32_t value, uint32_t flags) = 0;
};
