// Host strings. The block may move whenever the host resizes it, so the data pointer is read
// again after every host call and never kept.
#include "host/HostString.h"

#include "host/binding/HostFunctions.h"
#include "host/errors/ThrowIfWBError.h"

#include <cstdint>
#include <cstring>
#include <limits>

namespace qv::host {

namespace {

constexpr int32_t kOutOfMemory = 2;

} // namespace

std::string ReadHostString(HostString text) {
    if (text == nullptr || *text == nullptr) {
        return {};
    }
    int32_t count = 0;
    std::memcpy(&count, *text, sizeof count);
    if (count <= 0) {
        return {};
    }
    return std::string(static_cast<const char*>(*text) + sizeof count, static_cast<size_t>(count));
}

void WriteHostString(HostString& text, std::string_view bytes) {
    if (bytes.size() > static_cast<size_t>(std::numeric_limits<int32_t>::max())) {
        errors::ThrowIfWBError(kOutOfMemory);
    }
    errors::ThrowIfWBError(rt::NumericArrayResize(kWBTypeU8, 1, &text, bytes.size()));
    const auto count = static_cast<int32_t>(bytes.size());
    std::memcpy(*text, &count, sizeof count);
    if (!bytes.empty()) {
        std::memcpy(static_cast<char*>(*text) + sizeof count, bytes.data(), bytes.size());
    }
}

} // namespace qv::host
