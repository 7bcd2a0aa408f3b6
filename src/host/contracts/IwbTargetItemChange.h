// Offered by a target's object: told when one of its I/O items changed.
#pragma once

#include "com/IUnknown.h"

struct IwbTargetItemChange : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("8561E63D-CADA-41E9-9156-B13A9AF7C03B");

    // ITEM (an I/O item object) changed its attributes or was removed.
    virtual HRESULT ItemChanged(IUnknown* item) = 0;
    // Suspends (SUSPEND non-zero) or resumes change handling; PREVIOUS (optional) receives the
    // setting before the call, for RestoreChangeHandling.
    virtual HRESULT SuspendChangeHandling(int32_t suspend, int32_t* previous) = 0;
    // Puts back a setting that SuspendChangeHandling answered.
    virtual HRESULT RestoreChangeHandling(int32_t previous) = 0;
};
