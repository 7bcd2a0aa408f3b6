// Texts between the terminal, the host's strings and UTF-16.
#include "cli/HostText.h"

#include "kern/CodePage.h"
#include "kern/Utf8.h"
#include "runtime/Runtime.h"

#include <cstdio>
#include <cstring>
#include <set>
#include <unicode/unistr.h>
#include <unicode/utf16.h>

namespace wbhost::cli {

std::u16string FromUtf8(std::string_view text) {
    const icu::UnicodeString decoded = icu::UnicodeString::fromUTF8(
        icu::StringPiece(text.data(), static_cast<int32_t>(text.size())));
    return std::u16string(decoded.getBuffer(), static_cast<size_t>(decoded.length()));
}

std::string ToUtf8(std::u16string_view text) {
    return qv::kern::WideToStandardUtf8(text, u'\uFFFD');
}

std::string ToHostText(std::string_view utf8) {
    return qv::kern::WideToAnsi(FromUtf8(utf8));
}

std::string HostCodePage() {
    return qv::kern::ConverterName({});
}

std::vector<char32_t> CharactersTheHostCannotKeep(std::u16string_view text) {
    std::vector<char32_t> lost;
    std::set<char32_t> seen;
    const auto length = static_cast<int32_t>(text.size());
    for (int32_t at = 0; at < length;) {
        UChar32 c = 0;
        const int32_t start = at;
        U16_NEXT(text.data(), at, length, c);
        // Every code page the host uses keeps ASCII; each other character is tried once.
        if (c < 0x80 || !seen.insert(static_cast<char32_t>(c)).second)
            continue;
        const std::u16string_view one =
            text.substr(static_cast<size_t>(start), static_cast<size_t>(at - start));
        if (qv::kern::AnsiToWide(qv::kern::WideToAnsi(one)) != one)
            lost.push_back(static_cast<char32_t>(c));
    }
    return lost;
}

std::string DescribeCharacters(const std::vector<char32_t>& characters) {
    constexpr size_t kShown = 10;
    std::string text;
    for (size_t i = 0; i < characters.size() && i < kShown; ++i) {
        char code[16];
        std::snprintf(code, sizeof code, "U+%04X", static_cast<unsigned>(characters[i]));
        const bool surrogate = characters[i] >= 0xD800 && characters[i] <= 0xDFFF;
        std::u16string one;
        if (!surrogate) {
            const icu::UnicodeString c(static_cast<UChar32>(characters[i]));
            one.assign(c.getBuffer(), static_cast<size_t>(c.length()));
        }
        text += (i == 0 ? "" : ", ") + std::string(code) +
                (surrogate ? std::string(" (unpaired surrogate)") : " '" + ToUtf8(one) + "'");
    }
    if (characters.size() > kShown)
        text += " and " + std::to_string(characters.size() - kShown) + " more";
    return text;
}

void HandleDisposer::operator()(void** handle) const noexcept {
    DSDisposeHandle(handle);
}

OwnedHandle NewHostString(std::string_view bytes) {
    WBHandle handle = nullptr;
    if (NumericArrayResize(kWBTypeU8, 1, &handle, bytes.size()) != kWBNoErr || handle == nullptr)
        return nullptr;
    const auto count = static_cast<int32_t>(bytes.size());
    std::memcpy(*handle, &count, sizeof count);
    if (!bytes.empty())
        std::memcpy(static_cast<char*>(*handle) + sizeof count, bytes.data(), bytes.size());
    return OwnedHandle(handle);
}

std::string HostStringBytes(WBHandle handle) {
    if (handle == nullptr || *handle == nullptr)
        return {};
    int32_t count = 0;
    std::memcpy(&count, *handle, sizeof count);
    if (count <= 0)
        return {};
    return std::string(static_cast<const char*>(*handle) + sizeof count,
                       static_cast<size_t>(count));
}

} // namespace wbhost::cli
