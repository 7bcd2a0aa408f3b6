// The host's counted text handle: a signed 32-bit byte count, then that many bytes (the system's
// multibyte code page, no terminator). Callers convert to and from wide text themselves.
#pragma once

#include "host/binding/runtime_api.h"

#include <string>
#include <string_view>

namespace qv::host {

// A handle to a host string block (pointer to the host's pointer to the block).
using HostString = WBHandle;

// The bytes of `text`; empty for a null handle or a count of 0 or below.
std::string ReadHostString(HostString text);

// Sizes `text` for `bytes` (NumericArrayResize, bytes, one dimension; a null handle is allocated)
// and stores the count and the bytes. A host error raises WBErrorException; texts longer than a
// 32-bit count can hold raise WBErrorException(2) (out of memory).
void WriteHostString(HostString& text, std::string_view bytes);

} // namespace qv::host
