// Statuses as the host writes them in messages.
#pragma once

#include <cstdint>
#include <cstdio>
#include <string>

namespace wbhost {

// STATUS as "0x" and eight upper-case hex digits, e.g. "0x80004005".
inline std::string HexStatus(int32_t status) {
    char text[16];
    std::snprintf(text, sizeof text, "0x%08X", static_cast<uint32_t>(status));
    return text;
}

} // namespace wbhost
