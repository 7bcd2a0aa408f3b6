// Float-to-terminal conversion without undefined behaviour: conversions that C++ leaves
// undefined (NaN, out of range) are given the processor's "integer indefinite" answer.
#include "host/refs/TerminalValue.h"

#include <cmath>
#include <cstring>
#include <limits>

namespace qv::host::refs {

NumericClass NumericClassOfTypeCode(uint8_t typeCode) {
    switch (typeCode) {
    case 1:
        return NumericClass::kI8;
    case 5:
        return NumericClass::kU8;
    case 2:
        return NumericClass::kI16;
    case 6:
        return NumericClass::kU16;
    case 3:
        return NumericClass::kI32;
    case 7:
        return NumericClass::kU32;
    case 4:
        return NumericClass::kI64;
    case 8:
        return NumericClass::kU64;
    case 11:
        return NumericClass::kComplex;
    case 10:
        return NumericClass::kF64;
    case 9:
        return NumericClass::kF32;
    case 12:
        return NumericClass::kOther11;
    case 13:
        return NumericClass::kOther12;
    case 14:
        return NumericClass::kOther13;
    case 33:
        return NumericClass::kBoolean;
    default:
        return NumericClass::kNone;
    }
}

namespace {

// Truncation towards zero into Int; NaN and values outside Int give its minimum.
template <class Int> Int Truncate(double value) {
    constexpr double kLimit = -static_cast<double>(std::numeric_limits<Int>::min()); // 2^(n-1)
    const double t = std::trunc(value);
    if (std::isnan(t) || t >= kLimit || t < -kLimit) {
        return std::numeric_limits<Int>::min();
    }
    return static_cast<Int>(t);
}

template <class T> void Put(void* data, T value) {
    std::memcpy(data, &value, sizeof value);
}

uint64_t TruncateUnsigned64(double value) {
    constexpr double kTop = 9223372036854775808.0; // 2^63
    if (value >= kTop) {
        return static_cast<uint64_t>(Truncate<int64_t>(value - kTop)) | (uint64_t{1} << 63);
    }
    return static_cast<uint64_t>(Truncate<int64_t>(value));
}

} // namespace

bool StoreTerminalValue(NumericClass cls, double value, void* data) {
    if (!data) {
        return false;
    }
    switch (cls) {
    case NumericClass::kI8:
    case NumericClass::kU8:
        Put(data, static_cast<uint8_t>(Truncate<int32_t>(value)));
        return true;
    case NumericClass::kI16:
    case NumericClass::kU16:
        Put(data, static_cast<uint16_t>(Truncate<int32_t>(value)));
        return true;
    case NumericClass::kI32:
        Put(data, Truncate<int32_t>(value));
        return true;
    case NumericClass::kU32:
        Put(data, static_cast<uint32_t>(Truncate<int64_t>(value)));
        return true;
    case NumericClass::kI64:
        Put(data, Truncate<int64_t>(value));
        return true;
    case NumericClass::kU64:
        Put(data, TruncateUnsigned64(value));
        return true;
    case NumericClass::kF64:
        Put(data, value);
        return true;
    case NumericClass::kF32:
        Put(data, static_cast<float>(value));
        return true;
    case NumericClass::kBoolean:
        Put(data, static_cast<uint8_t>(value == 0.0 ? 0 : 1));
        return true;
    default:
        return false;
    }
}

} // namespace qv::host::refs
