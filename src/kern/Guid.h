// The 16-byte GUID in the Windows layout, with equality and the registry's order.
#pragma once

#include <cstdint>

namespace qv::kern {

// A GUID: Data1..Data3 as numbers, Data4 as eight bytes, exactly as Windows lays it out.
struct Guid {
    uint32_t Data1;
    uint16_t Data2;
    uint16_t Data3;
    uint8_t Data4[8];
};
static_assert(sizeof(Guid) == 16, "Guid must keep the 16-byte Windows layout");

// True when all sixteen bytes are equal.
constexpr bool operator==(const Guid& a, const Guid& b) noexcept {
    if (a.Data1 != b.Data1 || a.Data2 != b.Data2 || a.Data3 != b.Data3)
        return false;
    for (int i = 0; i < 8; ++i) {
        if (a.Data4[i] != b.Data4[i])
            return false;
    }
    return true;
}
constexpr bool operator!=(const Guid& a, const Guid& b) noexcept {
    return !(a == b);
}

// Orders by Data1, then Data2, then Data3, then the eight bytes of Data4 in turn.
constexpr bool operator<(const Guid& a, const Guid& b) noexcept {
    if (a.Data1 != b.Data1)
        return a.Data1 < b.Data1;
    if (a.Data2 != b.Data2)
        return a.Data2 < b.Data2;
    if (a.Data3 != b.Data3)
        return a.Data3 < b.Data3;
    for (int i = 0; i < 8; ++i) {
        if (a.Data4[i] != b.Data4[i])
            return a.Data4[i] < b.Data4[i];
    }
    return false;
}

// A new random GUID (version 4, RFC 4122 variant) from the system's random source; raises
// InitializationFailure when the source fails.
Guid MakeGUID();

} // namespace qv::kern
