// Cut, copy and paste of project items: the host announces the operation before it runs it.
#pragma once

#include "com/IUnknown.h"

struct IwbProjectCutCopyPaste3 : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("B15C2E7D-4A93-4E6F-8D20-3F7A9C1B5E66");

    // OPERATION (1 cut, 2 copy, 3 paste) is about to run on the item; KEEPSOURCE non-zero when
    // the host keeps the source item.
    virtual HRESULT PrepareCutCopyPaste(uint32_t operation, int32_t keepSource) = 0;
};
