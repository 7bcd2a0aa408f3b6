// The exported queries on host resource trees.
#include "com/Bstr.h"
#include "com/BstrArray.h"
#include "exports/Export.h"
#include "exports/ResTreeFrame.h"
#include "host/HostStringArray.h"
#include "host/contracts/IwbhwResourceReservation.h"

#include <cstdint>
#include <string>
#include <vector>

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

// Whether the node at PATH is reserved, asked for PROTOCOL (any protocol when empty); FLAG goes to
// the service inverted. *RESERVED and *FOUND are cleared first; a null RESERVED answers E_POINTER
// with nothing touched.
WBT_EXPORT int32_t TIOResTree_IsReserved(const WBRefNum* refnum, qv::host::HostString path,
                                         qv::host::HostString protocol, uint8_t flag,
                                         uint32_t* reserved, uint8_t* found) noexcept {
    if (reserved == nullptr || found == nullptr)
        return E_POINTER;
    *reserved = 0;
    return qv::exports::WithFoundNode(refnum, path, found, [&](IwbhwResourceTreeAccess& node) {
        const auto reservation = qv::com::QueryAs<IwbhwResourceReservation>(&node);
        if (!reservation)
            return E_NOINTERFACE;
        const std::u16string asked = qv::kern::AnsiToWide(qv::host::ReadHostString(protocol));
        return reservation->IsReserved(asked.empty() ? nullptr : asked.c_str(), flag == 0 ? 1 : 0,
                                       reserved);
    });
}

// The protocols the node at PATH supports, in the service's order, written to the host string
// array *PROTOCOLS (allocated when the handle is null). A null PROTOCOLS answers E_POINTER with
// nothing touched.
WBT_EXPORT int32_t TIOResTree_GetSupportedProtocols(const WBRefNum* refnum,
                                                    qv::host::HostString path,
                                                    qv::host::HostStringArray* protocols,
                                                    uint8_t* found) noexcept {
    if (protocols == nullptr)
        return E_POINTER;
    return qv::exports::WithFoundNode(refnum, path, found, [&](IwbhwResourceTreeAccess& node) {
        qv::com::BstrArray list;
        const HRESULT hr = node.GetSupportedProtocols(list.PutCount(), list.PutTexts());
        if (FAILED(hr))
            return hr;
        std::vector<std::string> texts;
        for (const std::u16string& text : list.Texts())
            texts.push_back(qv::kern::WideToAnsi(text));
        qv::host::WriteHostStringArray(*protocols, texts);
        return S_OK;
    });
}
