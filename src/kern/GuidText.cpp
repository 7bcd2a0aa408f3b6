// GUID text form: braces, five hyphen-separated groups of 8, 4, 4, 4 and 12 hex digits.
#include "kern/GuidText.h"

#include "kern/exception/Exception.h"

namespace qv::kern {
namespace {

constexpr size_t kTextLength = 38;
constexpr char kHex[] = "0123456789ABCDEF";

// Positions of the hyphens in the text form.
constexpr bool IsHyphenPosition(size_t i) {
    return i == 9 || i == 14 || i == 19 || i == 24;
}

template <class CharT> uint32_t HexValue(CharT c) {
    if (c >= CharT('0') && c <= CharT('9'))
        return static_cast<uint32_t>(c - CharT('0'));
    if (c >= CharT('A') && c <= CharT('F'))
        return static_cast<uint32_t>(c - CharT('A')) + 10;
    if (c >= CharT('a') && c <= CharT('f'))
        return static_cast<uint32_t>(c - CharT('a')) + 10;
    QV_THROW(exception::BadGuidString());
}

// Reads the 32 hex digits in order, skipping the separators, after checking the whole shape.
template <class CharT> Guid Parse(std::basic_string_view<CharT> text) {
    if (text.size() != kTextLength || text.front() != CharT('{') || text.back() != CharT('}'))
        QV_THROW(exception::BadGuidString());
    uint8_t bytes[16] = {};
    size_t nibble = 0;
    for (size_t i = 1; i + 1 < kTextLength; ++i) {
        if (IsHyphenPosition(i)) {
            if (text[i] != CharT('-'))
                QV_THROW(exception::BadGuidString());
            continue;
        }
        bytes[nibble / 2] = static_cast<uint8_t>((bytes[nibble / 2] << 4) | HexValue(text[i]));
        ++nibble;
    }
    Guid guid{};
    guid.Data1 = (uint32_t{bytes[0]} << 24) | (uint32_t{bytes[1]} << 16) |
                 (uint32_t{bytes[2]} << 8) | bytes[3];
    guid.Data2 = static_cast<uint16_t>((bytes[4] << 8) | bytes[5]);
    guid.Data3 = static_cast<uint16_t>((bytes[6] << 8) | bytes[7]);
    for (size_t k = 0; k < 8; ++k)
        guid.Data4[k] = bytes[8 + k];
    return guid;
}

template <class CharT> std::basic_string<CharT> Format(const Guid& guid) {
    const uint8_t bytes[16] = {static_cast<uint8_t>(guid.Data1 >> 24),
                               static_cast<uint8_t>(guid.Data1 >> 16),
                               static_cast<uint8_t>(guid.Data1 >> 8),
                               static_cast<uint8_t>(guid.Data1),
                               static_cast<uint8_t>(guid.Data2 >> 8),
                               static_cast<uint8_t>(guid.Data2),
                               static_cast<uint8_t>(guid.Data3 >> 8),
                               static_cast<uint8_t>(guid.Data3),
                               guid.Data4[0],
                               guid.Data4[1],
                               guid.Data4[2],
                               guid.Data4[3],
                               guid.Data4[4],
                               guid.Data4[5],
                               guid.Data4[6],
                               guid.Data4[7]};
    std::basic_string<CharT> out;
    out.reserve(kTextLength);
    out.push_back(CharT('{'));
    for (size_t k = 0; k < 16; ++k) {
        if (k == 4 || k == 6 || k == 8 || k == 10)
            out.push_back(CharT('-'));
        out.push_back(CharT(kHex[bytes[k] >> 4]));
        out.push_back(CharT(kHex[bytes[k] & 0x0F]));
    }
    out.push_back(CharT('}'));
    return out;
}

} // namespace

std::u16string GuidToString(const Guid& guid) {
    return Format<char16_t>(guid);
}
std::string GuidToNarrowString(const Guid& guid) {
    return Format<char>(guid);
}
Guid StringToGuid(std::u16string_view text) {
    return Parse(text);
}
Guid StringToGuid(std::string_view text) {
    return Parse(text);
}

} // namespace qv::kern
