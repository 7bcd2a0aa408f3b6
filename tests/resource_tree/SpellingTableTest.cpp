// The loader's table of tag and attribute spellings.
#include "resource_tree/SpellingTable.h"

#include <gtest/gtest.h>
#include <string>

namespace wbhw {
namespace {

TEST(SpellingTable, KeepsEverySpellingApartThroughGrowth) {
    SpellingTable<int> table;
    EXPECT_EQ(table.Find(u"absent"), nullptr);
    // Spellings of one length that agree at both ends differ only in the middle, where the hash
    // does not look: they must still be told apart by their whole text.
    std::u16string spellings[600];
    for (int i = 0; i < 600; ++i) {
        spellings[i] = u"Tag" + std::u16string(1, static_cast<char16_t>(u'A' + i % 26)) +
                       std::u16string(1, static_cast<char16_t>(u'a' + i / 26)) + u"Path";
        EXPECT_EQ(table.Add(spellings[i], i), i);
    }
    for (int i = 0; i < 600; ++i) {
        const int* found = table.Find(spellings[i]);
        ASSERT_NE(found, nullptr) << i;
        EXPECT_EQ(*found, i);
    }
    // Spellings are exact: case and length count.
    EXPECT_EQ(table.Find(u"tagAaPath"), nullptr);
    EXPECT_EQ(table.Find(u"TagAaPat"), nullptr);
    EXPECT_EQ(table.Find(u""), nullptr);
    table.Add(u"", 7);
    EXPECT_EQ(*table.Find(u""), 7);
}

} // namespace
} // namespace wbhw
