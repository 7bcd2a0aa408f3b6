// UTF-8 decoding and encoding: the module's own rule at the boundaries of each sequence length,
// standard UTF-8 against a plain encoder.
#include "kern/Utf8.h"

#include "kern/exception/Exception.h"

#include <gtest/gtest.h>

using qv::kern::HasLoneSurrogate;
using qv::kern::Utf8ToWide;
using qv::kern::WideToStandardUtf8;
using qv::kern::WideToUtf8;
using qv::kern::exception::InvalidSequence;

TEST(Utf8, RejectsOverlongAndFourByteSequencesAndWritesPairsAsTwoThreeByteOnes) {
    EXPECT_THROW(Utf8ToWide("\xC0\x80"), InvalidSequence);
    EXPECT_THROW(Utf8ToWide("\xE0\x9F\xBF"), InvalidSequence);
    EXPECT_THROW(Utf8ToWide("\xF0\x9F\x98\x80"), InvalidSequence);
    EXPECT_EQ(Utf8ToWide("\xE0\xA0\x80"), std::u16string(1, u'\u0800'));
    const std::u16string pair = {char16_t(0xD83D), char16_t(0xDE00)};
    const std::string bytes = WideToUtf8(pair);
    EXPECT_EQ(bytes.size(), 6u);
    EXPECT_EQ(Utf8ToWide(bytes), pair);
}

namespace {

// One code point at a time, the plain way: what the block-wise encoder must agree with. LONE, when
// not 0, stands for each surrogate outside a pair.
std::string ReferenceUtf8(std::u16string_view text, char16_t lone = 0) {
    std::string out;
    auto put = [&out](char32_t c) {
        if (c < 0x80) {
            out += static_cast<char>(c);
        } else if (c < 0x800) {
            out += static_cast<char>(0xC0 | (c >> 6));
            out += static_cast<char>(0x80 | (c & 0x3F));
        } else if (c < 0x10000) {
            out += static_cast<char>(0xE0 | (c >> 12));
            out += static_cast<char>(0x80 | ((c >> 6) & 0x3F));
            out += static_cast<char>(0x80 | (c & 0x3F));
        } else {
            out += static_cast<char>(0xF0 | (c >> 18));
            out += static_cast<char>(0x80 | ((c >> 12) & 0x3F));
            out += static_cast<char>(0x80 | ((c >> 6) & 0x3F));
            out += static_cast<char>(0x80 | (c & 0x3F));
        }
    };
    for (size_t i = 0; i < text.size(); ++i) {
        const char32_t c = text[i];
        if (c >= 0xD800 && c < 0xDC00 && i + 1 < text.size() && text[i + 1] >= 0xDC00 &&
            text[i + 1] < 0xE000) {
            put(0x10000 + ((c - 0xD800) << 10) + (text[i + 1] - 0xDC00u));
            ++i;
        } else if (lone != 0 && c >= 0xD800 && c < 0xE000) {
            put(lone);
        } else {
            put(c);
        }
    }
    return out;
}

} // namespace

TEST(Utf8, StandardFormOfLongMixedTextsMatchesACharacterByCharacterEncoding) {
    // Long ASCII runs, runs that triple in size, pairs at every offset around the conversion's
    // block boundaries (a few thousand units apart), and lone surrogates of both kinds.
    std::u16string text;
    for (int i = 0; i < 40000; ++i) {
        switch (i % 7) {
        case 0:
            text += u"<Name>ascii text</Name>";
            break;
        case 1:
            text += std::u16string(i % 13, u'\u20AC'); // three bytes each
            break;
        case 2:
            text += u"\U0001F600"; // a pair
            break;
        case 3:
            text += u'\xD800'; // a lone high surrogate
            break;
        case 4:
            text += u"\u00E9\xDC00"; // a lone low surrogate
            break;
        default:
            text += static_cast<char16_t>(u'a' + i % 26);
        }
    }
    EXPECT_EQ(WideToStandardUtf8(text), ReferenceUtf8(text));
    EXPECT_EQ(WideToStandardUtf8(text, u'?'), ReferenceUtf8(text, u'?'));
    EXPECT_TRUE(HasLoneSurrogate(text));
    for (size_t cut = 16370; cut < 16400; ++cut) {
        std::u16string straddling(cut, u'x');
        straddling += u"\U0001F600\u00E9\U0001F600";
        ASSERT_EQ(WideToStandardUtf8(straddling), ReferenceUtf8(straddling)) << cut;
        ASSERT_FALSE(HasLoneSurrogate(straddling)) << cut;
    }
    EXPECT_EQ(WideToStandardUtf8(u""), "");
    EXPECT_EQ(WideToStandardUtf8(std::u16string(50000, u'\u4E2D')),
              ReferenceUtf8(std::u16string(50000, u'\u4E2D')));
    EXPECT_TRUE(HasLoneSurrogate(u"\U0001F600\xDE00"));
    EXPECT_TRUE(HasLoneSurrogate(u"a\xD83D"));
}
