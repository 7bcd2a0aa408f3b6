// The exception tree: texts and codes that callers compare against, the raise site surviving
// the copy made by throw, and the overflow check for buffer sizes.
#include "kern/exception/Exception.h"

#include "kern/SafeMath.h"
#include "kern/StringBase.h"

#include <cstring>
#include <gtest/gtest.h>

namespace ex = qv::kern::exception;

namespace {

template <class E> void ExpectTextAndCode(const char* text, uint32_t code) {
    const E e;
    const ex::Exception& base = e;
    EXPECT_STREQ(base.what(), text);
    EXPECT_EQ(base.GetErrorCode(), code) << text;
}

} // namespace

TEST(Exception, EachClassHasItsTextAndCodeThrowKeepsTheSiteAndRangeChecksRaise) {
    ExpectTextAndCode<ex::Exception>("unspecified exception", 0xFFFFFFFFu);
    ExpectTextAndCode<ex::OutOfRange>("Out of range", 0x8ABC7007u);
    ExpectTextAndCode<ex::InvalidArgument>("Invalid argument(s)", 0x8ABC700Fu);
    ExpectTextAndCode<ex::InitializationFailure>("Initialization failed", 0x8ABC7010u);
    ExpectTextAndCode<ex::BufferOverflow>("Buffer overflowed", 0x8ABC7017u);
    ExpectTextAndCode<ex::InvalidLocale>("Invalid locale", 0x8ABC7024u);
    ExpectTextAndCode<ex::InvalidSequence>("Invalid UTF8 encoding sequence", 0x8ABC7030u);
    ExpectTextAndCode<ex::BadGuidString>("Badly formatted Guid string.", 0x8ABC7032u);
    ExpectTextAndCode<ex::UnableToConvert>("Unable to convert.", 0x8ABC7034u);
    ExpectTextAndCode<ex::NotImplemented>("Not implemented", 0x80004001u);
    const uint32_t line = __LINE__ + 2;
    try {
        QV_THROW(ex::OutOfRange2("String offset out of range"));
    } catch (const ex::OutOfRange& e) {
        EXPECT_STREQ(e.what(), "Out of range: String offset out of range");
        EXPECT_EQ(e.GetErrorCode(), 0x8ABC7007u);
        EXPECT_EQ(e.line(), line);
        ASSERT_NE(e.file(), nullptr);
        EXPECT_NE(std::strstr(e.file(), "ExceptionTest.cpp"), nullptr);
        // A copy (as a rethrow or a stored exception makes) keeps all of it.
        const ex::OutOfRange2 copy = dynamic_cast<const ex::OutOfRange2&>(e);
        EXPECT_EQ(copy.line(), line);
        EXPECT_STREQ(copy.what(), e.what());
    }
    EXPECT_EQ(ex::Exception().file(), nullptr);
    EXPECT_EQ(ex::Exception().line(), 0u);
    // Substrings beyond the end and products above 32 bits raise.
    const qv::kern::WString s(u"abc");
    EXPECT_EQ(s.substr(3), u"");
    EXPECT_EQ(s.substr(1, 99), u"bc");
    EXPECT_THROW(s.substr(4), ex::OutOfRange2);
    EXPECT_EQ(qv::kern::SafeMultiply(0x10000u, 0xFFFFu), 0xFFFF0000u);
    EXPECT_EQ(qv::kern::SafeMultiply(0xFFFFFFFFu, 1u), 0xFFFFFFFFu);
    EXPECT_EQ(qv::kern::SafeMultiply(0u, 0xFFFFFFFFu), 0u);
    EXPECT_THROW(qv::kern::SafeMultiply(0x10000u, 0x10000u), ex::OutOfRange);
    EXPECT_THROW(qv::kern::SafeMultiply(0x80000000u, 2u), ex::OutOfRange);
}
