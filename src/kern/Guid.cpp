// New GUIDs from the kernel's random source.
#include "kern/Guid.h"

#include "kern/exception/Exception.h"

#include <cerrno>
#include <sys/random.h>

namespace qv::kern {

Guid MakeGUID() {
    uint8_t bytes[16];
    size_t filled = 0;
    while (filled < sizeof bytes) {
        const ssize_t got = getrandom(bytes + filled, sizeof bytes - filled, 0);
        if (got < 0 && errno == EINTR)
            continue;
        if (got <= 0)
            QV_THROW(exception::InitializationFailure());
        filled += static_cast<size_t>(got);
    }
    Guid guid{};
    guid.Data1 = (uint32_t{bytes[0]} << 24) | (uint32_t{bytes[1]} << 16) |
                 (uint32_t{bytes[2]} << 8) | bytes[3];
    guid.Data2 = static_cast<uint16_t>((bytes[4] << 8) | bytes[5]);
    // Version 4 (random) in the top nibble of Data3, variant 10xx in the first byte of Data4.
    guid.Data3 = static_cast<uint16_t>(((bytes[6] & 0x0F) << 8) | bytes[7] | 0x4000);
    for (size_t k = 0; k < 8; ++k)
        guid.Data4[k] = bytes[8 + k];
    guid.Data4[0] = static_cast<uint8_t>((guid.Data4[0] & 0x3F) | 0x80);
    return guid;
}

} // namespace qv::kern
