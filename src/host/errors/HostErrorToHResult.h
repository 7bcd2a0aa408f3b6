// The status that an exported function returns for a caught host error.
#pragma once

#include <cstdint>

namespace qv::host::errors {

// 0 -> 0, 1 -> E_INVALIDARG, 2 -> E_OUTOFMEMORY, 7 -> STG_E_FILENOTFOUND, 53 -> E_NOTIMPL,
// any other -> E_FAIL.
int32_t HostErrorToHResult(int32_t hostError) noexcept;

} // namespace qv::host::errors
