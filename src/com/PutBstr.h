// Handing a text out through a BSTR out-parameter.
#pragma once

#include "com/Bstr.h"
#include "com/HResult.h"

namespace qv::com {

// Hands TEXT out as a new BSTR in *OUT: S_OK, or E_OUTOFMEMORY with *OUT null.
inline HRESULT PutBstr(std::u16string_view text, BSTR* out) {
    *out = AllocBstr(text);
    return *out != nullptr ? S_OK : E_OUTOFMEMORY;
}

} // namespace qv::com
