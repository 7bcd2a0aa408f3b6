// BSTR allocation on the C heap: [uint32 byte length][characters][zero].
#include "com/Bstr.h"

#include <cstdlib>
#include <cstring>
#include <limits>

namespace {

constexpr size_t kPrefix = sizeof(uint32_t);
static_assert(sizeof(char16_t) == 2, "BSTR characters are UTF-16 code units");

uint32_t* PrefixOf(BSTR text) {
    return reinterpret_cast<uint32_t*>(reinterpret_cast<unsigned char*>(text) - kPrefix);
}

} // namespace

BSTR SysAllocStringLen(const char16_t* text, uint32_t length) {
    // The byte length must fit the 32-bit prefix.
    constexpr uint32_t kMaxLength = (std::numeric_limits<uint32_t>::max() - 8) / 2;
    if (length > kMaxLength) {
        return nullptr;
    }
    const size_t bytes = static_cast<size_t>(length) * sizeof(char16_t);
    auto* block = static_cast<unsigned char*>(std::malloc(kPrefix + bytes + sizeof(char16_t)));
    if (!block) {
        return nullptr;
    }
    const uint32_t byteLength = static_cast<uint32_t>(bytes);
    std::memcpy(block, &byteLength, kPrefix);
    auto* chars = reinterpret_cast<char16_t*>(block + kPrefix);
    if (text) {
        std::memcpy(chars, text, bytes);
    } else {
        std::memset(chars, 0, bytes);
    }
    chars[length] = u'\0';
    return chars;
}

BSTR SysAllocString(const char16_t* text) {
    if (!text) {
        return nullptr;
    }
    return SysAllocStringLen(text, static_cast<uint32_t>(std::char_traits<char16_t>::length(text)));
}

void SysFreeString(BSTR text) {
    if (text) {
        std::free(PrefixOf(text));
    }
}

uint32_t SysStringByteLen(BSTR text) {
    if (!text) {
        return 0;
    }
    uint32_t bytes = 0;
    std::memcpy(&bytes, PrefixOf(text), kPrefix);
    return bytes;
}

uint32_t SysStringLen(BSTR text) {
    return SysStringByteLen(text) / sizeof(char16_t);
}

namespace qv::com {

BSTR AllocBstr(std::u16string_view text) {
    if (text.size() > std::numeric_limits<uint32_t>::max()) {
        return nullptr;
    }
    return SysAllocStringLen(text.data(), static_cast<uint32_t>(text.size()));
}

std::u16string BstrToString(BSTR text) {
    return text ? std::u16string(text, SysStringLen(text)) : std::u16string();
}

} // namespace qv::com
