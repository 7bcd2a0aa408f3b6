// The length of a run of ASCII characters, found a machine word at a time: names, markup and
// most texts of the module are ASCII, and every text conversion starts by skipping such a run.
#pragma once

#include <cstdint>
#include <cstring>
#include <string_view>

namespace qv::kern {

// The number of leading bytes of TEXT below 0x80.
inline size_t AsciiPrefixLength(std::string_view text) noexcept {
    size_t i = 0;
    for (uint64_t word = 0; i + 8 <= text.size(); i += 8) {
        std::memcpy(&word, text.data() + i, 8);
        if ((word & 0x8080808080808080ull) != 0)
            break;
    }
    while (i < text.size() && static_cast<unsigned char>(text[i]) < 0x80u)
        ++i;
    return i;
}

// The number of leading UTF-16 units of TEXT below 0x80.
inline size_t AsciiPrefixLength(std::u16string_view text) noexcept {
    size_t i = 0;
    for (uint64_t word = 0; i + 4 <= text.size(); i += 4) {
        std::memcpy(&word, text.data() + i, 8);
        if ((word & 0xFF80FF80FF80FF80ull) != 0)
            break;
    }
    while (i < text.size() && text[i] < 0x80u)
        ++i;
    return i;
}

} // namespace qv::kern
