// Offered by a target's hardware object: the resources that fit an I/O interface.
#pragma once

#include "com/Bstr.h"
#include "com/IUnknown.h"

struct IwbhwTargetResources : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("F778DB5E-56CA-4A48-AB1F-FC29411FC211");

    // Names of the resources that fit IOINTERFACE under PROTOCOLFILTER (for example
    // "include_protocols=IOResource,exclude_protocols="): COUNT BSTRs in a CoTaskMemAlloc array
    // (null when there are none).
    virtual HRESULT ListResourceNames(const char16_t* ioInterface, const char16_t* protocolFilter,
                                      BSTR** names, uint32_t* count) = 0;
};
