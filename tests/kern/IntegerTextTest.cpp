// Integer text: bases, signs, the strict flag and 32-bit overflow.
#include "kern/IntegerText.h"

#include "kern/exception/Exception.h"

#include <gtest/gtest.h>

using qv::kern::IntegerToString;
using qv::kern::StringToInteger;
using qv::kern::exception::UnableToConvert;

TEST(IntegerText, WritesUpperCaseDigitsInAnyBaseAndReadsThemBackStrictlyOrNotButNeverOverflowing) {
    EXPECT_EQ(IntegerToString(255, 16), u"FF");
    EXPECT_EQ(IntegerToString(0, 10), u"0");
    EXPECT_EQ(IntegerToString(0xFFFFFFFFu, 2), std::u16string(32, u'1'));
    EXPECT_EQ(IntegerToString(35, 36), u"Z");
    EXPECT_EQ(IntegerToString(4294967295u, 10), u"4294967295");
    EXPECT_THROW(IntegerToString(1, 0), UnableToConvert);
    EXPECT_THROW(IntegerToString(1, 1), UnableToConvert);
    EXPECT_THROW(IntegerToString(1, 37), UnableToConvert);
    for (const uint32_t base : {2u, 8u, 10u, 16u, 36u}) {
        for (const uint32_t value : {0u, 1u, 35u, 36u, 65535u, 0x7FFFFFFFu, 0xFFFFFFFFu}) {
            EXPECT_EQ(StringToInteger(IntegerToString(value, base), base, nullptr, true), value);
        }
    }
    // Reading skips space, notes the sign, is strict about trailing text on request and never
    // overflows.
    bool minus = true;
    EXPECT_THROW(StringToInteger(u"12x", 10, &minus, true), UnableToConvert);
    EXPECT_EQ(StringToInteger(u"12x", 10, &minus, false), 12u);
    EXPECT_FALSE(minus);
    EXPECT_THROW(StringToInteger(u"", 10, nullptr, true), UnableToConvert);
    EXPECT_EQ(StringToInteger(u"", 10, nullptr, false), 0u);
    EXPECT_THROW(StringToInteger(u" -", 10, nullptr, true), UnableToConvert);
    // A NUL inside the given length ends the number early.
    EXPECT_THROW(StringToInteger(std::u16string_view(u"7\0", 2), 10, nullptr, true),
                 UnableToConvert);
    EXPECT_EQ(StringToInteger(u" \t-42", 10, &minus, true), 42u);
    EXPECT_TRUE(minus);
    EXPECT_EQ(StringToInteger(u"+7", 10, &minus, true), 7u);
    EXPECT_FALSE(minus);
    EXPECT_EQ(StringToInteger(u"ff", 16, nullptr, true), 255u);
    EXPECT_EQ(StringToInteger(u"19", 8, nullptr, false), 1u);
    // Letters of other scripts are not digits.
    EXPECT_EQ(StringToInteger(u"1\uFF12", 10, nullptr, false), 1u);
    EXPECT_EQ(StringToInteger(u"1\u0131", 36, nullptr, false), 1u);
    // Overflow raises even when not strict.
    EXPECT_EQ(StringToInteger(u"4294967295", 10, nullptr, true), 0xFFFFFFFFu);
    EXPECT_THROW(StringToInteger(u"4294967296", 10, nullptr, false), UnableToConvert);
    EXPECT_THROW(StringToInteger(u"100000000", 16, nullptr, false), UnableToConvert);
    EXPECT_THROW(StringToInteger(u"99999999999", 10, nullptr, false), UnableToConvert);
    EXPECT_THROW(StringToInteger(u"1", 37, nullptr, false), UnableToConvert);
}
