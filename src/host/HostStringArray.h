// The host's counted array of host strings: a signed 32-bit element count, 4 bytes of padding,
// then one 64-bit string handle per element (element i at byte offset 8 + 8 * i).
#pragma once

#include "host/HostString.h"

#include <cstdint>
#include <string>
#include <vector>

namespace qv::host {

// A handle to a host string array block.
using HostStringArray = WBHandle;

// The element count; 0 for a null handle or a negative stored count.
int32_t HostStringArrayCount(HostStringArray array);

// The handle of element `index` (may be null). Raises "Array index out of bounds." unless
// 0 <= index < count.
HostString HostStringArrayElement(HostStringArray array, int32_t index);

// The bytes of element `index` (empty for a null element); bounds as HostStringArrayElement.
std::string ReadHostStringArrayElement(HostStringArray array, int32_t index);

// Writes `bytes` into element `index`, allocating its string when the element is null; bounds as
// HostStringArrayElement.
void WriteHostStringArrayElement(HostStringArray array, int32_t index, std::string_view bytes);

// Every element's bytes, in order; empty for a null handle.
std::vector<std::string> ReadHostStringArray(HostStringArray array);

// Resizes `array` to `newSize` elements: raises "Invalid new_size for array." below 0; nothing
// changes when the count already is `newSize`; shrinking releases the dropped elements' strings;
// growing gives every new element an empty string; a null handle is allocated. Host errors raise
// WBErrorException (2 when a new array cannot be allocated).
void ResizeHostStringArray(HostStringArray& array, int32_t newSize);

// Resizes `array` to the number of `texts` and writes each of them into its element.
void WriteHostStringArray(HostStringArray& array, const std::vector<std::string>& texts);

} // namespace qv::host
