// UTF-8 <-> UTF-16 conversion with the module's own rules (three-byte maximum).
#include "kern/Utf8.h"

#include "kern/AsciiRun.h"
#include "kern/exception/Exception.h"

#include <cstdint>
#include <cstring>

namespace qv::kern {
namespace {

bool IsContinuation(unsigned char c) {
    return (c & 0xC0u) == 0x80u;
}

// Decodes one sequence at s[i]; stores the unit and answers the sequence's length.
size_t DecodeOne(std::string_view s, size_t i, char16_t& unit) {
    const auto lead = static_cast<unsigned char>(s[i]);
    if (lead < 0x80u) {
        unit = lead;
        return 1;
    }
    const size_t left = s.size() - i;
    if (lead >= 0xC2u && lead <= 0xDFu) {
        if (left < 2 || !IsContinuation(static_cast<unsigned char>(s[i + 1])))
            QV_THROW(exception::InvalidSequence());
        unit = static_cast<char16_t>(((lead & 0x1Fu) << 6) |
                                     (static_cast<unsigned char>(s[i + 1]) & 0x3Fu));
        return 2;
    }
    if (lead >= 0xE0u && lead <= 0xEFu) {
        if (left < 3)
            QV_THROW(exception::InvalidSequence());
        const auto c1 = static_cast<unsigned char>(s[i + 1]);
        const auto c2 = static_cast<unsigned char>(s[i + 2]);
        if (!IsContinuation(c1) || !IsContinuation(c2) || (lead == 0xE0u && c1 < 0xA0u))
            QV_THROW(exception::InvalidSequence());
        unit = static_cast<char16_t>(((lead & 0x0Fu) << 12) | ((c1 & 0x3Fu) << 6) | (c2 & 0x3Fu));
        return 3;
    }
    QV_THROW(exception::InvalidSequence());
}

} // namespace

std::u16string Utf8ToWide(std::string_view utf8) {
    // Count first with the same rules, so the result is allocated once.
    size_t units = 0;
    char16_t unit = 0;
    for (size_t i = 0; i < utf8.size();) {
        const size_t run = AsciiPrefixLength(utf8.substr(i));
        units += run;
        i += run;
        if (i < utf8.size()) {
            i += DecodeOne(utf8, i, unit);
            ++units;
        }
    }
    std::u16string out(units, u'\0');
    char16_t* o = out.data();
    for (size_t i = 0; i < utf8.size();) {
        const size_t run = AsciiPrefixLength(utf8.substr(i));
        for (size_t k = 0; k < run; ++k)
            o[k] = static_cast<unsigned char>(utf8[i + k]);
        o += run;
        i += run;
        if (i < utf8.size())
            i += DecodeOne(utf8, i, *o++);
    }
    return out;
}

std::string WideToUtf8(std::u16string_view wide) {
    size_t bytes = 0;
    for (const char16_t u : wide)
        bytes += u < 0x80u ? 1 : (u < 0x800u ? 2 : 3);
    std::string out(bytes, '\0');
    char* o = out.data();
    for (const char16_t u : wide) {
        if (u < 0x80u) {
            *o++ = static_cast<char>(u);
        } else if (u < 0x800u) {
            *o++ = static_cast<char>(0xC0u | (u >> 6));
            *o++ = static_cast<char>(0x80u | (u & 0x3Fu));
        } else {
            *o++ = static_cast<char>(0xE0u | (u >> 12));
            *o++ = static_cast<char>(0x80u | ((u >> 6) & 0x3Fu));
            *o++ = static_cast<char>(0x80u | (u & 0x3Fu));
        }
    }
    return out;
}

} // namespace qv::kern
