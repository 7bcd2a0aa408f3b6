// The exported text helpers: host strings in the system's multibyte code page converted to and
// from UTF-16, searched, measured and checked for forbidden characters.
#include "exports/Export.h"
#include "host/HostString.h"
#include "host/errors/WBErrorException.h"
#include "kern/CodePage.h"

#include <cstdint>
#include <memory>
#include <new>
#include <string>
#include <string_view>
#include <unicode/ucnv.h>
#include <vector>

namespace {

using qv::host::HostString;

// Runs BODY and turns whatever it throws into a host error code: nothing may reach the host.
template <class Body> int32_t AnswerHostError(Body&& body) noexcept {
    try {
        return body();
    } catch (const qv::host::errors::WBErrorException& e) {
        return e.code();
    } catch (const std::bad_alloc&) {
        return kWBMemFullErr;
    } catch (...) {
        return kWBGenericErr;
    }
}

// TEXT cut at its first NUL, as a zero-terminated C text would end there.
template <class Text> Text UpToFirstNul(Text text) {
    const size_t nul = text.find(typename Text::value_type{});
    if (nul != Text::npos)
        text.resize(nul);
    return text;
}

struct ConverterCloser {
    void operator()(UConverter* c) const noexcept { ucnv_close(c); }
};

// Multibyte text decoded to UTF-16 with, for every UTF-16 unit, the byte offset at which its
// character starts in the multibyte text.
struct DecodedText {
    std::u16string text;
    std::vector<int32_t> offsets;
    int32_t byteCount = 0;

    // The byte offset of unit I; the byte count for the end of the text.
    int32_t OffsetOf(size_t i) const { return i < offsets.size() ? offsets[i] : byteCount; }
};

// Decodes BYTES in the default code page exactly as the code-page conversion does, keeping each
// unit's byte offset: offsets are measured, never guessed from the character's code, since
// characters of one code page differ in width (single-byte "\u20AC" in windows-1252, single-byte
// half-width katakana and double-byte "\u00A7" in cp932).
DecodedText DecodeWithOffsets(std::string_view bytes) {
    DecodedText decoded;
    decoded.byteCount = static_cast<int32_t>(bytes.size());
    if (bytes.empty())
        return decoded;
    UErrorCode status = U_ZERO_ERROR;
    const std::unique_ptr<UConverter, ConverterCloser> converter(
        ucnv_open(qv::kern::ConverterName({}).c_str(), &status));
    if (U_FAILURE(status))
        QV_THROW(qv::kern::exception::UnableToConvert());
    // At most two units per byte in any code page.
    decoded.text.resize(bytes.size() * 2);
    decoded.offsets.resize(bytes.size() * 2);
    char16_t* target = decoded.text.data();
    const char* source = bytes.data();
    ucnv_toUnicode(converter.get(), &target, target + decoded.text.size(), &source,
                   source + bytes.size(), decoded.offsets.data(), true, &status);
    if (U_FAILURE(status))
        QV_THROW(qv::kern::exception::UnableToConvert());
    const auto units = static_cast<size_t>(target - decoded.text.data());
    decoded.text.resize(units);
    decoded.offsets.resize(units);
    // A unit without an offset of its own belongs to the character before it.
    for (size_t i = 0; i < units; ++i) {
        if (decoded.offsets[i] < 0)
            decoded.offsets[i] = i > 0 ? decoded.offsets[i - 1] : 0;
    }
    return decoded;
}

// The index of the unit after the character that starts at unit I (a surrogate pair is one
// character: both its units carry the same offset).
size_t NextCharacter(const DecodedText& decoded, size_t i) {
    size_t next = i + 1;
    while (next < decoded.text.size() && decoded.offsets[next] == decoded.offsets[i])
        ++next;
    return next;
}

// True when the character that starts at unit I takes more than one byte.
bool IsMultibyte(const DecodedText& decoded, size_t i) {
    return decoded.OffsetOf(NextCharacter(decoded, i)) - decoded.offsets[i] > 1;
}

} // namespace

// Converts INPUT (multibyte) to UTF-16 bytes in OUTPUT, up to the first NUL. Answers 0 or a host
// error code (1 for a null OUTPUT handle, which could not be handed back if allocated here).
WBT_EXPORT int32_t TIO_mbstowcs(HostString input, HostString output) noexcept {
    return AnswerHostError([&] {
        if (output == nullptr)
            return static_cast<int32_t>(kWBArgErr);
        const std::u16string wide =
            UpToFirstNul(qv::kern::AnsiToWide(qv::host::ReadHostString(input)));
        std::string bytes;
        bytes.reserve(wide.size() * 2);
        for (const char16_t unit : wide) {
            bytes += static_cast<char>(unit & 0xFF);
            bytes += static_cast<char>(unit >> 8);
        }
        qv::host::WriteHostString(output, bytes);
        return static_cast<int32_t>(kWBNoErr);
    });
}

// Converts INPUT (UTF-16 code units, little-endian, count in bytes) to multibyte text in OUTPUT,
// up to the first NUL. A trailing odd byte is ignored. Answers 0 or a host error code.
WBT_EXPORT int32_t TIO_wcstombs(HostString input, HostString output) noexcept {
    return AnswerHostError([&] {
        if (output == nullptr)
            return static_cast<int32_t>(kWBArgErr);
        const std::string bytes = qv::host::ReadHostString(input);
        std::u16string wide(bytes.size() / 2, u'\0');
        for (size_t i = 0; i < wide.size(); ++i) {
            wide[i] = static_cast<char16_t>(static_cast<unsigned char>(bytes[2 * i]) |
                                            static_cast<unsigned char>(bytes[2 * i + 1]) << 8);
        }
        qv::host::WriteHostString(output, qv::kern::WideToAnsi(UpToFirstNul(wide)));
        return static_cast<int32_t>(kWBNoErr);
    });
}

// The byte offset in HAYSTACK of the first occurrence of NEEDLE (both multibyte, each read up to
// its first NUL; an empty needle is found at 0), or -1 when it does not occur.
WBT_EXPORT int32_t TIO_wcswcs(HostString haystack, HostString needle) noexcept {
    try {
        DecodedText text = DecodeWithOffsets(qv::host::ReadHostString(haystack));
        text.text = UpToFirstNul(std::move(text.text));
        const std::u16string wanted =
            UpToFirstNul(qv::kern::AnsiToWide(qv::host::ReadHostString(needle)));
        const size_t at = text.text.find(wanted);
        return at == std::u16string::npos ? -1 : text.OffsetOf(at);
    } catch (...) {
        return -1;
    }
}

// FIRST and LAST receive the byte offsets of the first and last byte of the first run of
// multibyte characters in TEXT, or -1 and -1 when it has none. Null outputs are skipped.
WBT_EXPORT void TIO_mbcOffsets(HostString text, int32_t* first, int32_t* last) noexcept {
    int32_t runFirst = -1;
    int32_t runLast = -1;
    try {
        const DecodedText decoded = DecodeWithOffsets(qv::host::ReadHostString(text));
        size_t i = 0;
        while (i < decoded.text.size() && !IsMultibyte(decoded, i))
            i = NextCharacter(decoded, i);
        if (i < decoded.text.size()) {
            runFirst = decoded.offsets[i];
            while (i < decoded.text.size() && IsMultibyte(decoded, i))
                i = NextCharacter(decoded, i);
            runLast = decoded.OffsetOf(i) - 1;
        }
    } catch (...) {
        runFirst = runLast = -1;
    }
    if (first != nullptr)
        *first = runFirst;
    if (last != nullptr)
        *last = runLast;
}

// 1 when TEXT (multibyte) holds a control character or one of the characters of INVALID (a
// zero-terminated multibyte text; null or empty forbids only controls), else 0.
WBT_EXPORT uint8_t TIOCommon_IsInvalidChar(HostString text, const char* invalid) noexcept {
    try {
        const std::u16string wide = qv::kern::AnsiToWide(qv::host::ReadHostString(text));
        // The forbidden set is decoded like the text, so that a forbidden character outside
        // ASCII is found too.
        const std::u16string forbidden =
            invalid != nullptr ? qv::kern::AnsiToWide(invalid) : std::u16string();
        for (const char16_t unit : wide) {
            if (unit < 32 || forbidden.find(unit) != std::u16string::npos)
                return 1;
        }
        return 0;
    } catch (...) {
        // A text that cannot be read cannot be shown to be clean.
        return 1;
    }
}
