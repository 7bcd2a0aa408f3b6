// The exported queries on host resource trees.
#include "com/Bstr.h"
#include "exports/Export.h"
#include "exports/ResTreeFrame.h"

#include <cstdint>

// The dump of the node at PATH in the tree behind the refnum at REFNUM, written to TEXT in the
// default code page; FOUND tells whether PATH named a node. A failing dump leaves TEXT as it was;
// a null TEXT handle answers E_POINTER with nothing touched.
WBT_EXPORT int32_t TIOResTree_Dump(const WBRefNum* refnum, qv::host::HostString path,
                                   qv::host::HostString text, uint8_t* found) noexcept {
    // The text is written by resizing the caller's handle; without one there is nowhere to write,
    // and a handle made here could never reach the caller.
    if (text == nullptr)
        return E_POINTER;
    return qv::exports::WithFoundNode(refnum, path, found, [&](IwbhwResourceTreeAccess& node) {
        BSTR dumped = nullptr;
        const HRESULT hr = node.Dump(&dumped);
        const qv::com::UniqueBstr owned(dumped);
        if (FAILED(hr))
            return hr;
        qv::host::HostString out = text;
        qv::host::WriteHostString(out, qv::kern::WideToAnsi(qv::com::BstrToString(dumped)));
        return S_OK;
    });
}
