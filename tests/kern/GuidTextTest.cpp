// GUID text form and new GUIDs.
#include "kern/GuidText.h"

#include "kern/exception/Exception.h"

#include <cstring>
#include <gtest/gtest.h>
#include <set>

using qv::kern::Guid;
using qv::kern::GuidToString;
using qv::kern::StringToGuid;
using qv::kern::exception::BadGuidString;

TEST(GuidText, ParsesOnlyTheBracedFormWritesUpperCaseOrdersByFieldsAndMakesVersionFour) {
    const Guid g = StringToGuid(u"{a117026a-ad51-4c63-8341-085c842e9d22}");
    EXPECT_EQ(g.Data1, 0xA117026Au);
    EXPECT_EQ(g.Data2, 0xAD51u);
    EXPECT_EQ(g.Data3, 0x4C63u);
    const uint8_t data4[8] = {0x83, 0x41, 0x08, 0x5C, 0x84, 0x2E, 0x9D, 0x22};
    EXPECT_EQ(std::memcmp(g.Data4, data4, 8), 0);
    EXPECT_EQ(GuidToString(g), u"{A117026A-AD51-4C63-8341-085C842E9D22}");
    EXPECT_EQ(qv::kern::GuidToNarrowString(g), "{A117026A-AD51-4C63-8341-085C842E9D22}");
    EXPECT_EQ(StringToGuid(std::string_view("{A117026A-AD51-4C63-8341-085C842E9D22}")), g);
    const char16_t* bad[] = {
        u"a117026a-ad51-4c63-8341-085c842e9d22",    // no braces
        u"{a117026a-ad51-4c63-8341-085c842e9d2}",   // short
        u"{a117026a-ad51-4c63-8341-085c842e9d222}", // long
        u"(a117026a-ad51-4c63-8341-085c842e9d22)",  // wrong brackets
        u"{a117026a-ad51-4c63-8341+085c842e9d22}",  // hyphen missing
        u"{a117026a-ad51-4c63-83410085c842e9d22-}", // hyphen moved
        u"{g117026a-ad51-4c63-8341-085c842e9d22}",  // not hex
        u"{ 117026a-ad51-4c63-8341-085c842e9d22}",  // space where a digit belongs
        u"{+117026a-ad51-4c63-8341-085c842e9d22}",  // sign where a digit belongs
        u"{a117026a-ad51-4c63-8341-085c842e9d2\uFF12}", u""};
    for (const char16_t* text : bad)
        EXPECT_THROW(StringToGuid(std::u16string_view(text)), BadGuidString);
    // GUIDs order by fields, then bytes; new ones are random, version four.
    const Guid a = StringToGuid(u"{00000001-FFFF-FFFF-FFFF-FFFFFFFFFFFF}");
    const Guid b = StringToGuid(u"{00000002-0000-0000-0000-000000000000}");
    const Guid c = StringToGuid(u"{00000002-0000-0000-0000-000000000001}");
    EXPECT_TRUE(a < b);
    EXPECT_TRUE(b < c);
    EXPECT_FALSE(c < b);
    EXPECT_FALSE(b < b);
    EXPECT_NE(a, b);
    std::set<Guid> seen;
    for (int i = 0; i < 1000; ++i) {
        const Guid g = qv::kern::MakeGUID();
        EXPECT_EQ(g.Data3 >> 12, 4);
        EXPECT_EQ(g.Data4[0] & 0xC0, 0x80);
        EXPECT_EQ(StringToGuid(GuidToString(g)), g);
        seen.insert(g);
    }
    EXPECT_EQ(seen.size(), 1000u);
}
