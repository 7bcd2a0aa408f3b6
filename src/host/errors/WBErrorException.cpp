// Host error texts come from the host runtime, which owns them; we only borrow them for the
// message and hand the host string back.
#include "host/errors/WBErrorException.h"

#include "host/binding/HostFunctions.h"

#include <cstdio>
#include <cstring>

namespace qv::host::errors {

namespace {

constexpr const char kUnknownErrorText[] = "Unknown error code or error text unavailable.";

std::string Prefix(int32_t code) {
    char prefix[64];
    std::snprintf(prefix, sizeof prefix, "Error Code: %d (%08x): ", code,
                  static_cast<uint32_t>(code));
    return prefix;
}

// The bytes of a host string handle (32-bit count, then the bytes); empty for a negative count.
std::string HostText(WBHandle text) {
    int32_t count = 0;
    std::memcpy(&count, *text, sizeof count);
    if (count <= 0) {
        return {};
    }
    return std::string(static_cast<const char*>(*text) + 4, static_cast<size_t>(count));
}

std::string HostErrorText(int32_t code) {
    WBHandle text = nullptr;
    const bool known = host::rt::GGetOneErrorCode(code, &text) != 0;
    std::string result = kUnknownErrorText;
    if (known && text != nullptr && *text != nullptr) {
        result = HostText(text);
    }
    if (text != nullptr) {
        host::rt::DSDisposeHandle(text);
    }
    return result;
}

} // namespace

WBErrorException::WBErrorException(int32_t code)
    : message_(Prefix(code) + HostErrorText(code)), code_(code) {}

WBErrorException::WBErrorException(const char* text)
    : message_(Prefix(1) + (text != nullptr ? text : "")), code_(1) {}

} // namespace qv::host::errors
