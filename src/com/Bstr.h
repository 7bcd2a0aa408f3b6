// Length-prefixed UTF-16 texts handed across interfaces (BSTR), and their allocation functions.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>

// A BSTR points at the first character; the 32-bit byte length sits just before it and a
// terminating zero just after the last character. Null is a valid, empty BSTR.
using BSTR = char16_t*;

// Allocates a copy of the zero-terminated TEXT; null TEXT or no memory gives null.
BSTR SysAllocString(const char16_t* text);
// Allocates LENGTH characters copied from TEXT, or zero-filled when TEXT is null; null when
// the memory cannot be had or the length cannot be represented.
BSTR SysAllocStringLen(const char16_t* text, uint32_t length);
// Releases a BSTR; null is ignored.
void SysFreeString(BSTR text);
// Number of characters of TEXT; 0 for null.
uint32_t SysStringLen(BSTR text);
// Number of bytes of TEXT without the terminator; 0 for null.
uint32_t SysStringByteLen(BSTR text);

namespace qv::com {

struct BstrDeleter {
    void operator()(char16_t* text) const { SysFreeString(text); }
};
// A BSTR owned by one holder.
using UniqueBstr = std::unique_ptr<char16_t, BstrDeleter>;

// Allocates a BSTR holding TEXT; null when there is no memory.
BSTR AllocBstr(std::u16string_view text);
// The characters of TEXT (all SysStringLen of them, embedded zeros included); empty for null.
std::u16string BstrToString(BSTR text);

} // namespace qv::com
