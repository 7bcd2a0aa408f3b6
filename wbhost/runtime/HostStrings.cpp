// Host strings of the runtime's functions.
#include "runtime/HostStrings.h"

#include "runtime/HandleTable.h"

#include <cstring>

namespace wbhost::runtime {

WBErr StoreHostString(WBHandle* out, std::string_view text) {
    if (out == nullptr) {
        return kWBArgErr;
    }
    if (text.size() > HandleTable::kMaxBlockSize - 4) {
        return kWBMemFullErr;
    }
    HandleTable& table = HandleTable::Instance();
    const size_t size = 4 + text.size();
    if (*out == nullptr) {
        *out = table.Allocate(size, false);
        if (*out == nullptr) {
            return kWBMemFullErr;
        }
    } else if (!table.IsLive(*out)) {
        return kWBArgErr;
    } else if (const WBErr err = table.Resize(*out, size, false); err != kWBNoErr) {
        return err;
    }
    const auto count = static_cast<int32_t>(text.size());
    std::memcpy(**out, &count, sizeof count);
    if (!text.empty()) {
        std::memcpy(static_cast<char*>(**out) + 4, text.data(), text.size());
    }
    return kWBNoErr;
}

std::optional<std::string> ReadHostString(WBHandle handle) {
    const size_t size = HandleTable::Instance().SizeOf(handle);
    if (size < 4) {
        return std::nullopt;
    }
    int32_t count = 0;
    std::memcpy(&count, *handle, sizeof count);
    if (count <= 0) {
        return std::string();
    }
    if (static_cast<size_t>(count) > size - 4) {
        return std::nullopt;
    }
    return std::string(static_cast<const char*>(*handle) + 4, static_cast<size_t>(count));
}

} // namespace wbhost::runtime
