// Turns fuzzer bytes into the wide text that the readers take.
#pragma once

#include <cstdint>
#include <string>
#include <unicode/ustring.h>

namespace fuzz {

// The bytes read as UTF-8, bad sequences replaced by U+FFFD (the readers see UTF-16 only).
inline std::u16string WideFromBytes(const uint8_t* data, size_t size) {
    std::u16string wide(size, u'\0');
    int32_t written = 0;
    UErrorCode status = U_ZERO_ERROR;
    u_strFromUTF8WithSub(wide.data(), static_cast<int32_t>(wide.size()), &written,
                         reinterpret_cast<const char*>(data), static_cast<int32_t>(size), 0xFFFD,
                         nullptr, &status);
    wide.resize(U_SUCCESS(status) ? static_cast<size_t>(written) : 0);
    return wide;
}

} // namespace fuzz
