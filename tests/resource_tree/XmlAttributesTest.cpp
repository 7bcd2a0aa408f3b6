// Attribute sets: sorted, first spelling wins, and strings reused from one element to the next;
// the loader's table of tag and attribute spellings.
#include "resource_tree/XmlAttributes.h"

#include "resource_tree/SpellingTable.h"

#include <gtest/gtest.h>
#include <string>
#include <vector>

namespace wbhw {
namespace {

std::vector<std::u16string> Keys(const XmlAttributes& atts) {
    std::vector<std::u16string> keys;
    for (const auto& [key, value] : atts)
        keys.push_back(key + u"=" + value);
    return keys;
}

TEST(XmlAttributes, ARefilledSetShowsOnlyTheNewAttributesErasingAndCopyingKeepTheOrder) {
    XmlAttributes atts;
    EXPECT_TRUE(atts.InsertUtf8("Zeta", "last"));
    EXPECT_TRUE(atts.InsertUtf8("alpha", "a long value that needs its own buffer"));
    EXPECT_TRUE(atts.InsertUtf8("Name", "n"));
    EXPECT_FALSE(atts.InsertUtf8("NAME", "second spelling"));
    EXPECT_EQ(Keys(atts),
              (std::vector<std::u16string>{u"alpha=a long value that needs its own buffer",
                                           u"Name=n", u"Zeta=last"}));

    // The next element has fewer attributes; none of the old ones may show through.
    atts.clear();
    EXPECT_TRUE(atts.empty());
    EXPECT_EQ(atts.Find(u"zeta"), nullptr);
    EXPECT_TRUE(atts.InsertUtf8("name", "\xC3\xA9t\xC3\xA9 \xF0\x9F\x98\x80"));
    EXPECT_EQ(atts.size(), 1u);
    EXPECT_EQ(Keys(atts), (std::vector<std::u16string>{u"name=\u00E9t\u00E9 \U0001F600"}));
    EXPECT_EQ(atts.Get(u"alpha"), u"");
    atts.clear();
    for (const char* name : {"d", "b", "c", "a"})
        atts.Insert(std::u16string(name, name + 1), u"v");
    atts.Erase(u"B");
    atts.Erase(u"missing");
    EXPECT_EQ(Keys(atts), (std::vector<std::u16string>{u"a=v", u"c=v", u"d=v"}));
    // The erased entry's place is reused by the next insertion, in sorted order.
    EXPECT_TRUE(atts.Insert(u"bb", u"w"));
    const XmlAttributes copy = atts;
    atts.clear();
    EXPECT_EQ(Keys(copy), (std::vector<std::u16string>{u"a=v", u"bb=w", u"c=v", u"d=v"}));
    EXPECT_TRUE(copy.Contains(u"BB"));
}

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
