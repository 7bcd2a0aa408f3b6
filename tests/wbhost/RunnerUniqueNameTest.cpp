// Unique names as the unique-name program makes them.
#include "runner/UniqueName.h"

#include <gtest/gtest.h>

namespace {

using wbhost::runner::UniqueName;
using Names = std::vector<std::u16string>;

TEST(RunnerUniqueName, AFreeNameIsKeptElseTheSmallestFreeNumberFollowsTheStem) {
    EXPECT_EQ(UniqueName(u"Line", {u"Line1", u"Lines"}), u"Line");
    EXPECT_EQ(UniqueName(u"Line", {u"LINE", u"line1", u"Line2", u"Line4"}), u"Line3");
    // Trailing digits are the old number, not part of the stem; a gap below is filled.
    EXPECT_EQ(UniqueName(u"DIO7", {u"DIO7", u"DIO2"}), u"DIO1");
    EXPECT_EQ(UniqueName(u"12", {u"12", u"121"}), u"122");
    EXPECT_EQ(UniqueName(u"", {u"1"}), u"2");
    Names taken{u"A"};
    for (int i = 1; i <= 200; ++i) {
        const std::string number = std::to_string(i);
        taken.push_back(u"A" + std::u16string(number.begin(), number.end()));
    }
    EXPECT_EQ(UniqueName(u"A", taken), u"A201");
}

} // namespace
