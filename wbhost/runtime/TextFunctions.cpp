// The text functions of the host runtime: host strings out of C text, error texts, the language.
#include "runtime/ErrorTexts.h"
#include "runtime/HandleTable.h"
#include "runtime/Runtime.h"

#include <cstdlib>
#include <cstring>
#include <string_view>

const char gWBRTVersion[] = "26.0";

namespace {

// A new host string (32-bit count, then the bytes) holding `text`; null when out of memory.
WBHandle NewHostString(std::string_view text) {
    WBHandle handle = wbhost::runtime::HandleTable::Instance().Allocate(4 + text.size(), false);
    if (handle != nullptr) {
        const auto count = static_cast<int32_t>(text.size());
        std::memcpy(*handle, &count, sizeof count);
        std::memcpy(static_cast<char*>(*handle) + 4, text.data(), text.size());
    }
    return handle;
}

} // namespace

int32_t LToCStrN(const void* text, char* buffer, int32_t size) {
    if (buffer == nullptr || size <= 0) {
        return 0;
    }
    int32_t count = 0;
    if (text != nullptr) {
        std::memcpy(&count, text, sizeof count);
    }
    const int32_t copied = count <= 0 ? 0 : (count < size ? count : size - 1);
    if (copied > 0) {
        std::memcpy(buffer, static_cast<const char*>(text) + 4, static_cast<size_t>(copied));
    }
    buffer[copied] = '\0';
    return copied;
}

int32_t GGetOneErrorCode(WBErr code, WBHandle* text) {
    const char* const known = wbhost::runtime::ErrorText(code);
    if (known == nullptr || text == nullptr) {
        return 0;
    }
    *text = NewHostString(known);
    return *text != nullptr ? 1 : 0;
}

WBErr GetLangStr(int32_t selector, WBHandle* text) {
    if (selector != kWBLangStrUiLanguage || text == nullptr) {
        return kWBArgErr;
    }
    const char* language = std::getenv("WBHOST_LANGUAGE");
    if (language == nullptr || *language == '\0') {
        language = "eng";
    }
    *text = NewHostString(language);
    return *text != nullptr ? kWBNoErr : kWBMemFullErr;
}
