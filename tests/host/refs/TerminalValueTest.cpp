// Storing 64-bit floats into program terminals of every numeric class.
#include "host/refs/TerminalValue.h"

#include <cmath>
#include <cstring>
#include <gtest/gtest.h>
#include <limits>

namespace {

using qv::host::refs::NumericClass;
using qv::host::refs::NumericClassOfTypeCode;
using qv::host::refs::StoreTerminalValue;

template <class T> T Stored(NumericClass cls, double value) {
    unsigned char data[8];
    std::memset(data, 0xAB, sizeof data);
    EXPECT_TRUE(StoreTerminalValue(cls, value, data));
    T result;
    std::memcpy(&result, data, sizeof result);
    return result;
}

TEST(TerminalValue, EachNumericClassStoresItsOwnWayAndOthersLeaveTheDataAlone) {
    EXPECT_EQ(Stored<uint8_t>(NumericClassOfTypeCode(5), 300.0), 44);
    EXPECT_EQ(Stored<int8_t>(NumericClass::kI8, -2.9), -2);
    EXPECT_EQ(Stored<uint16_t>(NumericClass::kU16, -1.0), 0xFFFF);
    EXPECT_EQ(Stored<int32_t>(NumericClass::kI32, 2147483647.9), 2147483647);
    EXPECT_EQ(Stored<uint32_t>(NumericClass::kU32, 4294967295.0), 0xFFFFFFFFu);
    EXPECT_EQ(Stored<int64_t>(NumericClass::kI64, -9007199254740993.0), -9007199254740992);
    // Unsigned 64-bit values from 2^63 up keep their top bit.
    EXPECT_EQ(Stored<uint64_t>(NumericClass::kU64, 9223372036854775808.0 + 4096.0),
              (uint64_t{1} << 63) + 4096);
    EXPECT_EQ(Stored<uint64_t>(NumericClass::kU64, 12.5), 12u);
    // Values without an integer give the indefinite integer, not garbage.
    const double nan = std::numeric_limits<double>::quiet_NaN();
    EXPECT_EQ(Stored<int32_t>(NumericClass::kI32, nan), std::numeric_limits<int32_t>::min());
    EXPECT_EQ(Stored<int32_t>(NumericClass::kI32, 3e9), std::numeric_limits<int32_t>::min());
    EXPECT_EQ(Stored<int64_t>(NumericClass::kI64, -1e300), std::numeric_limits<int64_t>::min());
    EXPECT_EQ(Stored<uint8_t>(NumericClass::kU8, HUGE_VAL), 0);
    // Booleans are one unless zero; floats take the nearest value of their width.
    const NumericClass boolean = NumericClassOfTypeCode(33);
    EXPECT_EQ(Stored<uint8_t>(boolean, -0.0), 0);
    EXPECT_EQ(Stored<uint8_t>(boolean, 0.0), 0);
    EXPECT_EQ(Stored<uint8_t>(boolean, std::numeric_limits<double>::quiet_NaN()), 1);
    EXPECT_EQ(Stored<uint8_t>(boolean, 1e-300), 1);
    EXPECT_EQ(Stored<double>(NumericClassOfTypeCode(10), 0.1), 0.1);
    EXPECT_EQ(Stored<float>(NumericClassOfTypeCode(9), 0.1), 0.1f);
    EXPECT_TRUE(std::isinf(Stored<float>(NumericClass::kF32, 1e300)));
    for (uint8_t code : {0, 11, 12, 13, 14, 15, 32, 34, 255}) {
        uint64_t data = 0x1122334455667788u;
        EXPECT_FALSE(StoreTerminalValue(NumericClassOfTypeCode(code), 1.0, &data)) << int(code);
        EXPECT_EQ(data, 0x1122334455667788u);
    }
}

} // namespace
