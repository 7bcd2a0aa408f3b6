// Implemented by a project provider: the host attaches it to its project and detaches it.
#pragma once

#include "com/IUnknown.h"

struct IwbProjectProvider : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("D95B2FDD-6054-4090-A719-3FE8C2EB0500");

    // Attaches to the host's PROJECT object (a reference is kept until Detach).
    virtual HRESULT Attach(IUnknown* project) = 0;
    // Attaches to a project that was reloaded; same as Attach.
    virtual HRESULT AttachReloaded(IUnknown* project) = 0;
    // The project finished opening.
    virtual HRESULT ProjectReady() = 0;
    // Releases the project object.
    virtual HRESULT Detach() = 0;
    // The project is about to be saved.
    virtual HRESULT ProjectSaving() = 0;
    // The project was saved.
    virtual HRESULT ProjectSaved() = 0;
};
