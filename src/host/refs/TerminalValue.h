// Numeric classes of program terminals and the conversion of a 64-bit float into a terminal.
#pragma once

#include <cstdint>

namespace qv::host::refs {

// The numeric class of a terminal, from the type code (second byte of its type descriptor).
enum class NumericClass : int32_t {
    kI8 = 0,
    kU8 = 1,
    kI16 = 2,
    kU16 = 3,
    kI32 = 4,
    kU32 = 5,
    kI64 = 6,
    kU64 = 7,
    kComplex = 8, // not settable
    kF64 = 9,
    kF32 = 10,
    kOther11 = 11, // 11 to 13: not settable
    kOther12 = 12,
    kOther13 = 13,
    kBoolean = 14,
    kNone = 15, // any other type: not settable
};

// The class of TYPECODE; kNone for codes that are not numeric.
NumericClass NumericClassOfTypeCode(uint8_t typeCode);

// Stores VALUE into DATA as CLASS stores it: integers truncate towards zero and keep the low
// bytes (unsigned 64-bit values at or above 2^63 keep their top bit), floats take the nearest
// value of their width, a Boolean is 1 unless VALUE is exactly zero (so NaN is 1, -0.0 is 0).
// A NaN or a value beyond 64 bits stores the low bytes of the most negative integer, the
// answer the processor's own conversion gives. False, DATA untouched, for a class that is not
// settable or a null DATA.
bool StoreTerminalValue(NumericClass cls, double value, void* data);

} // namespace qv::host::refs
