// Cut, copy and paste of project items: the host asks whether an item may be cut and announces
// the operation before it runs it.
#pragma once

#include "com/IUnknown.h"

struct IwbProjectCutCopyPaste3 : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("B15C2E7D-4A93-4E6F-8D20-3F7A9C1B5E66");

    // S_OK when the item may be cut, S_FALSE when it may not.
    virtual HRESULT QueryCanCut() = 0;
    // OPERATION (1 cut, 2 copy, 3 paste) is about to run on the item; KEEPSOURCE non-zero when
    // the host keeps the source item.
    virtual HRESULT PrepareCutCopyPaste(uint32_t operation, int32_t keepSource) = 0;
};
