// Texts between the terminal, the host's strings and UTF-16.
#include "cli/HostText.h"

#include "kern/Utf8.h"
#include "runtime/Runtime.h"

#include <cstring>
#include <unicode/unistr.h>

namespace wbhost::cli {

std::u16string FromUtf8(std::string_view text) {
    const icu::UnicodeString decoded = icu::UnicodeString::fromUTF8(
        icu::StringPiece(text.data(), static_cast<int32_t>(text.size())));
    return std::u16string(decoded.getBuffer(), static_cast<size_t>(decoded.length()));
}

std::string ToUtf8(std::u16string_view text) {
    return qv::kern::WideToStandardUtf8(text, u'\uFFFD');
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
