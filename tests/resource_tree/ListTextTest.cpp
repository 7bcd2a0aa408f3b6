// List texts and resource paths: escaping, splitting, relative paths.
#include "resource_tree/ListText.h"

#include <gtest/gtest.h>

namespace wbhw {
namespace {

using Pieces = std::vector<std::u16string>;

TEST(ListText, SplitsOnlyAtUnescapedSeparatorsEscapesRoundTripAndRelativePathsClimbLittle) {
    EXPECT_EQ(SplitListText(u"", u',', true), Pieces{});
    EXPECT_EQ(SplitListText(u"a,", u',', false), (Pieces{u"a", u""}));
    // One backslash escapes the comma; two are an escaped backslash before a real separator.
    EXPECT_EQ(SplitListText(u"a\\,b,c", u',', false), (Pieces{u"a,b", u"c"}));
    EXPECT_EQ(SplitListText(u"a\\\\,b", u',', false), (Pieces{u"a\\", u"b"}));
    EXPECT_EQ(SplitListText(u" a \t,\r\n, b", u',', true), (Pieces{u"a", u"", u"b"}));
    // A backslash before anything else stays.
    EXPECT_EQ(SplitListText(u"a\\b", u',', false), Pieces{u"a\\b"});
    for (const std::u16string text : {u"plain", u"a/b", u"a\\/b", u"\\", u"//", u"x\\"}) {
        const std::u16string escaped = EscapeListText(text, u'/');
        EXPECT_EQ(SplitListText(escaped, u'/', false), Pieces{text}) << escaped.size();
        EXPECT_EQ(UnescapeListText(escaped, u'/'), text);
    }
    // Relative paths climb only what they must.
    EXPECT_EQ(RelativeResourcePath(u"/a/b", u"/a/c"), u"../c");
    EXPECT_EQ(RelativeResourcePath(u"/a/b", u"/a/b"), u"");
    EXPECT_EQ(RelativeResourcePath(u"/a/b", u"/a"), u"..");
    // The root has no names: from it a path goes straight down.
    EXPECT_EQ(RelativeResourcePath(u"/", u"/p"), u"p");
    EXPECT_EQ(RelativeResourcePath(u"/p", u"/"), u"..");
    EXPECT_EQ(RelativeResourcePath(u"/x", u"/A\\/B/c"), u"../A\\/B/c");
    // Names match without regard to case.
    EXPECT_EQ(RelativeResourcePath(u"/Top/a", u"/TOP/b"), u"../b");
}

} // namespace
} // namespace wbhw
