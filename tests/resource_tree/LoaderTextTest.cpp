// The UTF-8 form of documents handed to Expat, and its way back.
#include "resource_tree/LoaderText.h"

#include <gtest/gtest.h>
#include <string>

namespace wbhw {
namespace {

// One code point at a time, the plain way: what the bulk conversion must agree with.
std::string ReferenceUtf8(std::u16string_view text) {
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
        } else {
            put(c);
        }
    }
    return out;
}

TEST(LoaderText, Utf8OfLongMixedTextsMatchesACharacterByCharacterEncoding) {
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
    EXPECT_EQ(ToUtf8(text), ReferenceUtf8(text));
    for (size_t cut = 16370; cut < 16400; ++cut) {
        std::u16string straddling(cut, u'x');
        straddling += u"\U0001F600\u00E9\U0001F600";
        ASSERT_EQ(ToUtf8(straddling), ReferenceUtf8(straddling)) << cut;
    }
    EXPECT_EQ(ToUtf8(u""), "");
    EXPECT_EQ(ToUtf8(std::u16string(50000, u'\u4E2D')),
              ReferenceUtf8(std::u16string(50000, u'\u4E2D')));
}

TEST(LoaderText, WellFormedTextsComeBackFromUtf8Unchanged) {
    std::u16string text = u"prefix ";
    text += std::u16string(100, u'a') + u"\u00E9\U0001F600 tail";
    EXPECT_EQ(FromUtf8Lenient(ToUtf8(text)), text);
    // Undecodable bytes become U+FFFD, and what was decoded before them stays.
    EXPECT_EQ(FromUtf8Lenient("ok\xFF"), u"ok\uFFFD");
}

} // namespace
} // namespace wbhw
