// UTF-8 decoding and encoding at the boundaries of each sequence length.
#include "kern/Utf8.h"

#include "kern/exception/Exception.h"

#include <gtest/gtest.h>

using qv::kern::Utf8ToWide;
using qv::kern::WideToUtf8;
using qv::kern::exception::InvalidSequence;

TEST(Utf8, RejectsOverlongAndFourByteSequences) {
    EXPECT_THROW(Utf8ToWide("\xC0\x80"), InvalidSequence);
    EXPECT_THROW(Utf8ToWide("\xE0\x9F\xBF"), InvalidSequence);
    EXPECT_THROW(Utf8ToWide("\xF0\x9F\x98\x80"), InvalidSequence);
    EXPECT_EQ(Utf8ToWide("\xE0\xA0\x80"), std::u16string(1, u'\u0800'));
}

TEST(Utf8, SurrogatePairBecomesTwoThreeByteSequences) {
    const std::u16string pair = {char16_t(0xD83D), char16_t(0xDE00)};
    const std::string bytes = WideToUtf8(pair);
    EXPECT_EQ(bytes.size(), 6u);
    EXPECT_EQ(Utf8ToWide(bytes), pair);
}
