// The C-interface reference interfaces: an application reference and the program references it
// opens. Every operation answers a status and, through ERROR, a host error code (0 = none).
#pragma once

#include "com/IUnknown.h"

#include <cstdint>

struct I_GXRef;

// The common root: only the three IUnknown slots.
struct I_WBRef : IUnknown {};

struct I_AppRef : I_WBRef {
    static constexpr IID iid = qv::com::ParseGuid("313F4892-1A07-44AB-B85D-16358AEABD92");

    // Opens a reference to the program at PATH (OPTIONS and FLAGS go to the engine), prepared
    // for running when FORRUNNING is non-zero. A null PATH, REF or ERROR gives E_INVALIDARG
    // (error 1, when ERROR is there); a failure to open gives E_UNEXPECTED with the host's error
    // and a null *REF; no memory gives E_OUTOFMEMORY with error 2.
    virtual HRESULT OpenProgramRef(const char* path, uint32_t options, uint32_t flags,
                                   int32_t forRunning, I_GXRef** ref, int32_t* error) = 0;
};

struct I_GXRef : I_WBRef {
    static constexpr IID iid = qv::com::ParseGuid("313F4892-1A07-44AB-B85D-16358AEABD93");

    // Sets terminal INDEX to VALUE converted to the terminal's numeric class; error 1 for an
    // index the program lacks or a terminal that is not numeric.
    virtual HRESULT SetControlValueByIndex(int32_t index, double value, int32_t* error) = 0;
    // Runs the prepared program (waiting for its end when WAIT is non-zero); error 1 when the
    // reference was not opened for running. The two middle arguments are reserved.
    virtual HRESULT Run(int32_t* error, int32_t reserved1, int32_t reserved2, int32_t wait) = 0;
    // The data pointer and type descriptor of terminal INDEX; error 1 for an index it lacks.
    virtual HRESULT GetControlValueByIndex(int32_t index, void** data, const uint8_t** type,
                                           int32_t* error) = 0;
};

// Opens the application reference of the running host (a process runtime, no version name).
// A null REF gives E_INVALIDARG with error 1; a host that cannot be reached gives E_UNEXPECTED
// with its error and a null *REF; no memory gives E_OUTOFMEMORY with error 2.
HRESULT OpenDefaultAppRef(I_AppRef** ref, int32_t* error);
