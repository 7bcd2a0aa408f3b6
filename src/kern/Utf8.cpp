// UTF-8 <-> UTF-16 conversion: the module's own rules (three-byte maximum) and standard UTF-8.
#include "kern/Utf8.h"

#include "kern/AsciiRun.h"
#include "kern/exception/Exception.h"

#include <algorithm>
#include <cstdint>
#include <cstring>
#include <unicode/utf8.h>

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

bool IsHighSurrogate(char32_t c) noexcept {
    return c >= 0xD800 && c < 0xDC00;
}

bool IsLowSurrogate(char32_t c) noexcept {
    return c >= 0xDC00 && c < 0xE000;
}

// Narrows the leading ASCII units of FROM into TO; answers how many. The caller hands over one
// block at a time, so the scan and the copy read the units from the cache, and the copy through
// plain pointers is one the compiler widens to many units per step.
size_t NarrowAscii(std::u16string_view from, char* to) noexcept {
    const size_t ascii = AsciiPrefixLength(from);
    const char16_t* const units = from.data();
    for (size_t i = 0; i < ascii; ++i)
        to[i] = static_cast<char>(units[i]);
    return ascii;
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

std::string WideToStandardUtf8(std::u16string_view wide, char16_t lone) {
    // Whole documents go through here before an XML reader sees them, and markup is nearly all
    // ASCII. The output is made ready one block at a time, so that its zero fill and the
    // narrowing meet the same cache lines; the room for one byte per unit is reserved at once.
    constexpr size_t kBlock = 16384;
    std::string out;
    out.reserve(wide.size());
    size_t i = 0;
    while (i < wide.size()) {
        const size_t end = i + std::min(kBlock, wide.size() - i);
        size_t used = out.size();
        out.resize(used + (end - i));
        while (i < end) {
            const size_t ascii = NarrowAscii(wide.substr(i, end - i), out.data() + used);
            used += ascii;
            i += ascii;
            if (i == end)
                break;
            char32_t code = wide[i];
            size_t units = 1;
            if (IsHighSurrogate(code) && i + 1 < wide.size() && IsLowSurrogate(wide[i + 1])) {
                code = 0x10000 + ((code - 0xD800) << 10) +
                       (static_cast<char32_t>(wide[i + 1]) - 0xDC00);
                units = 2; // a pair may end one unit past the block
            } else if (lone != 0 && (IsHighSurrogate(code) || IsLowSurrogate(code))) {
                code = lone;
            }
            i += units;
            // Room for this character's bytes and one byte for each unit left in the block.
            const size_t needed = used + 4 + (i < end ? end - i : 0);
            if (needed > out.size())
                out.resize(std::max(needed, out.size() + out.size() / 2));
            U8_APPEND_UNSAFE(out.data(), used, code);
        }
        out.resize(used);
    }
    return out;
}

bool HasLoneSurrogate(std::u16string_view wide) noexcept {
    for (size_t i = 0; i < wide.size(); ++i) {
        if (IsHighSurrogate(wide[i]) && i + 1 < wide.size() && IsLowSurrogate(wide[i + 1]))
            ++i;
        else if (IsHighSurrogate(wide[i]) || IsLowSurrogate(wide[i]))
            return true;
    }
    return false;
}

} // namespace qv::kern
