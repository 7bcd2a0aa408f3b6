// GUIDs as the COM layer uses them: interface and class identifiers, equality and map order.
#pragma once

#include "kern/Guid.h"

#include <cstdint>
#include <string_view>

using GUID = qv::kern::Guid;
using IID = GUID;
using CLSID = GUID;

static_assert(sizeof(GUID) == 16, "GUID crosses interfaces as 16 bytes");
static_assert(alignof(GUID) == 4, "GUID is aligned as its 32-bit first field");

// Field-wise equality of two GUIDs.
constexpr bool IsEqualGUID(const GUID& a, const GUID& b) {
    if (a.Data1 != b.Data1 || a.Data2 != b.Data2 || a.Data3 != b.Data3) {
        return false;
    }
    for (int i = 0; i < 8; ++i) {
        if (a.Data4[i] != b.Data4[i]) {
            return false;
        }
    }
    return true;
}

namespace qv::com {

// Parses "XXXXXXXX-XXXX-XXXX-XXXX-XXXXXXXXXXXX" (with or without braces) at compile time, so
// identifiers are written in their familiar text form instead of transcribed into fields.
// A malformed text does not compile.
consteval GUID ParseGuid(std::string_view text) {
    if (text.size() == 38 && text.front() == '{' && text.back() == '}') {
        text = text.substr(1, 36);
    }
    if (text.size() != 36 || text[8] != '-' || text[13] != '-' || text[18] != '-' ||
        text[23] != '-') {
        throw "malformed GUID text";
    }
    auto hex = [&](size_t pos, size_t digits) {
        uint32_t value = 0;
        for (size_t i = pos; i < pos + digits; ++i) {
            const char c = text[i];
            uint32_t d = 0;
            if (c >= '0' && c <= '9') {
                d = static_cast<uint32_t>(c - '0');
            } else if (c >= 'A' && c <= 'F') {
                d = static_cast<uint32_t>(c - 'A' + 10);
            } else if (c >= 'a' && c <= 'f') {
                d = static_cast<uint32_t>(c - 'a' + 10);
            } else {
                throw "malformed GUID text";
            }
            value = value * 16 + d;
        }
        return value;
    };
    GUID g{};
    g.Data1 = hex(0, 8);
    g.Data2 = static_cast<uint16_t>(hex(9, 4));
    g.Data3 = static_cast<uint16_t>(hex(14, 4));
    g.Data4[0] = static_cast<uint8_t>(hex(19, 2));
    g.Data4[1] = static_cast<uint8_t>(hex(21, 2));
    for (size_t i = 0; i < 6; ++i) {
        g.Data4[2 + i] = static_cast<uint8_t>(hex(24 + 2 * i, 2));
    }
    return g;
}

// Orders GUIDs by their first 32-bit field, then the two 16-bit fields, then the eight bytes:
// the order in which registries keyed by GUID are walked.
struct GuidLess {
    constexpr bool operator()(const GUID& a, const GUID& b) const {
        if (a.Data1 != b.Data1) {
            return a.Data1 < b.Data1;
        }
        if (a.Data2 != b.Data2) {
            return a.Data2 < b.Data2;
        }
        if (a.Data3 != b.Data3) {
            return a.Data3 < b.Data3;
        }
        for (int i = 0; i < 8; ++i) {
            if (a.Data4[i] != b.Data4[i]) {
                return a.Data4[i] < b.Data4[i];
            }
        }
        return false;
    }
};

} // namespace qv::com

// The all-zero GUID: "no type", "no category".
inline constexpr GUID GUID_NULL{};
