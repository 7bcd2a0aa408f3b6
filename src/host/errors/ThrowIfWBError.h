// The check after every host runtime call that answers a host error code, and the checks of
// host arrays.
#pragma once

#include <cstdint>

namespace qv::host::errors {

// Throws WBErrorException(err) when `err` is not 0; does nothing for 0.
void ThrowIfWBError(int32_t err);

// Throws WBErrorException("Array index out of bounds.") unless 0 <= index < count.
void CheckArrayIndex(int64_t index, int64_t count);

// Throws WBErrorException("Invalid new_size for array.") when `newSize` is below 0.
void CheckNewArraySize(int64_t newSize);

// Throws WBErrorException(2) (out of memory) when a new host handle is null.
void ThrowIfNoHandle(const void* handle);

} // namespace qv::host::errors
