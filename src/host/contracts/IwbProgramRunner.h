// The host program runner: opens host programs (".gx" files) and makes host references.
#pragma once

#include "com/IUnknown.h"

struct IwbProgram;
struct IwbProjectItem;

// Obtained per use and released after it. Objects handed out carry a reference.
struct IwbProgramRunner : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("6D596886-022C-4D3A-A995-F9C7E9D8468D");

    // A host reference for OBJECT that programs can take as an input; release it with
    // ReleaseHostReference.
    virtual HRESULT MakeHostReference(IUnknown* object, uint64_t* reference) = 0;
    // The project item whose identifier is ID; 1 and null when there is none.
    virtual HRESULT FindProjectItem(const GUID& id, IwbProjectItem** item) = 0;
    // Opens the program file at PATH; a failure when it cannot be read as a program.
    virtual HRESULT OpenProgram(const char16_t* path, IwbProgram** program) = 0;
    // Releases a reference made by MakeHostReference; 1 when it is unknown.
    virtual HRESULT ReleaseHostReference(uint64_t reference) = 0;
    // Loads the icon file NAME; ICON receives a host icon handle (0 when it has none).
    virtual HRESULT LoadIcon(const char16_t* name, uint64_t* icon) = 0;
};
