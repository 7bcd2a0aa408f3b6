// The text helpers and the exports of plain C values, called through the loaded module with host
// strings that the embedded host's runtime allocates, as a host program hands them over.
#include "cli/HostText.h"
#include "cli/HostedModule.h"
#include "runtime/Runtime.h"

#include <cstdint>
#include <cstdlib>
#include <gtest/gtest.h>
#include <string>

namespace {

using wbhost::cli::HostStringBytes;
using wbhost::cli::NewHostString;
using MbsToWcs = int32_t(WBHandle, WBHandle);
using WcsWcs = int32_t(WBHandle, WBHandle);
using McbOffsets = void(WBHandle, int32_t*, int32_t*);
using IsInvalidChar = uint8_t(WBHandle, const char*);

// Runs each test with a chosen default code page, and the module loaded.
class TextExports : public ::testing::Test {
protected:
    void TearDown() override { unsetenv("WBTANGIO_CODEPAGE"); }
    static void UseCodePage(const char* name) { setenv("WBTANGIO_CODEPAGE", name, 1); }

    wbhost::cli::HostedModule module{WBT_MODULE_PATH};
    MbsToWcs* mbstowcs = module.Find<MbsToWcs>("TIO_mbstowcs");
    MbsToWcs* wcstombs = module.Find<MbsToWcs>("TIO_wcstombs");
    WcsWcs* wcswcs = module.Find<WcsWcs>("TIO_wcswcs");
    McbOffsets* mbcOffsets = module.Find<McbOffsets>("TIO_mbcOffsets");
    IsInvalidChar* isInvalid = module.Find<IsInvalidChar>("TIOCommon_IsInvalidChar");

    void SetUp() override {
        ASSERT_TRUE(module.Loaded()) << module.Error();
        ASSERT_TRUE(mbstowcs && wcstombs && wcswcs && mbcOffsets && isInvalid);
    }
    int32_t Find(std::string_view haystack, std::string_view needle) {
        const auto h = NewHostString(haystack), n = NewHostString(needle);
        return wcswcs(h.get(), n.get());
    }
    std::pair<int32_t, int32_t> Offsets(std::string_view text) {
        const auto t = NewHostString(text);
        int32_t first = 7, last = 7;
        mbcOffsets(t.get(), &first, &last);
        return {first, last};
    }
};

TEST_F(TextExports, ConvertBothWaysUpToTheFirstNulAndFailuresAreHostErrors) {
    const auto in =
        NewHostString(std::string_view("A\x80\0tail", 7)); // "A", euro sign in windows-1252, NUL
    const auto out = NewHostString("stale");
    ASSERT_EQ(mbstowcs(in.get(), out.get()), 0);
    EXPECT_EQ(HostStringBytes(out.get()), std::string("A\0\xAC\x20", 4));

    const auto wide =
        NewHostString(std::string_view("A\0\xAC\x20\0\0B\0\x01", 9)); // odd last byte ignored
    ASSERT_EQ(wcstombs(wide.get(), out.get()), 0);
    EXPECT_EQ(HostStringBytes(out.get()), "A\x80");

    const auto empty = NewHostString("");
    ASSERT_EQ(mbstowcs(empty.get(), out.get()), 0);
    EXPECT_EQ(HostStringBytes(out.get()), "");

    UseCodePage("cp932");
    const auto kanji = NewHostString("\x93\xFA"); // one double-byte character
    ASSERT_EQ(mbstowcs(kanji.get(), out.get()), 0);
    EXPECT_EQ(HostStringBytes(out.get()), "\xE5\x65");
    const auto abc = NewHostString("abc");
    // A handle the host does not know cannot be resized: its error code, output untouched.
    int32_t block[2] = {3, 0};
    void* master = block;
    EXPECT_EQ(mbstowcs(abc.get(), &master), kWBArgErr);
    EXPECT_EQ(block[0], 3);
    EXPECT_EQ(wcstombs(abc.get(), nullptr), kWBArgErr);
    // A code page that cannot be opened is a failure, never an escaping exception.
    UseCodePage("no-such-code-page");
    const auto fresh = NewHostString("");
    EXPECT_NE(mbstowcs(abc.get(), fresh.get()), 0);
    EXPECT_EQ(Find("abc", "b"), -1);
}

TEST_F(TextExports, SearchAnswersByteOffsetsOfMatchesMultibyteRunsAndInvalidCharacters) {
    EXPECT_EQ(Offsets("plain"), std::make_pair(-1, -1));
    EXPECT_EQ(Offsets(""), std::make_pair(-1, -1));
    EXPECT_EQ(Offsets("a\x80"), std::make_pair(-1, -1)); // windows-1252 is single-byte
    EXPECT_EQ(Find("abc", "x"), -1);
    EXPECT_EQ(Find("abc", "ab"), 0);
    EXPECT_EQ(Find("abc", ""), 0);
    EXPECT_EQ(Find("aBc", "b"), -1); // case counts
    // In windows-1252 the euro sign is one byte although its code is above U+00FF.
    EXPECT_EQ(Find("ab\x80x", "x"), 3);
    UseCodePage("cp932");
    EXPECT_EQ(Find("ab\x93\xFAx", "x"), 4); // two ASCII, one kanji
    EXPECT_EQ(Find("\xB1x", "x"), 1);       // half-width katakana: one byte
    EXPECT_EQ(Find("\x81\x98x", "x"), 2);   // section sign: below U+0100 but two bytes
    EXPECT_EQ(Find("\x93\xFA\x96\x7B", "\x96\x7B"), 2);
    EXPECT_EQ(Find("\x93\xFA", "\xFA"), -1); // never a match inside a character
    // The first run of multibyte characters.
    EXPECT_EQ(Offsets("ab\x93\xFA\x96\x7B"
                      "c"),
              std::make_pair(2, 5));
    EXPECT_EQ(Offsets("\x93\xFA"
                      "a\x96\x7B"),
              std::make_pair(0, 1)); // only the first run
    EXPECT_EQ(Offsets("a\xB1\x93\xFA"), std::make_pair(2, 3));
    // Invalid characters, in the default code page.
    unsetenv("WBTANGIO_CODEPAGE");
    const char* const names = "\\'\"<>|";
    auto check = [&](std::string_view text, const char* set) {
        const auto t = NewHostString(text);
        return isInvalid(t.get(), set);
    };
    EXPECT_EQ(check("a\tb", ""), 1);
    EXPECT_EQ(check("plain name", ""), 0);
    EXPECT_EQ(check("plain name", nullptr), 0);
    EXPECT_EQ(check("", names), 0);
    EXPECT_EQ(check("a|b", names), 1);
    EXPECT_EQ(check("a/b", names), 0);
    // A forbidden character outside ASCII is found too.
    EXPECT_EQ(check("caf\xE9", "\xE9"), 1);
    EXPECT_EQ(check("cafe", "\xE9"), 0);
}

// The exports of plain C values.
TEST_F(TextExports, InfoAnswersFiveCompareTheThreeCodesTakingNullAsEmptyInTheDefaultCodePage) {
    auto* getInfo = module.Find<int32_t()>("GetInfo");
    auto* compare = module.Find<uint32_t(const char*, const char*)>("TIO_CompareTwoResourceTrees");
    ASSERT_TRUE(getInfo && compare);
    EXPECT_EQ(getInfo(), 5);
    EXPECT_EQ(getInfo(), 5);

    const std::string required = "<IOResource><Direction>Input</Direction></IOResource>";
    const std::string offered =
        "<IOResource><Direction>INPUT</Direction><Pull>up</Pull></IOResource>";
    EXPECT_EQ(compare(nullptr, nullptr), 0u);
    EXPECT_EQ(compare(nullptr, offered.c_str()), 2u);
    EXPECT_EQ(compare(required.c_str(), ""), 1u);
    EXPECT_EQ(compare(required.c_str(), required.c_str()), 0u);
    EXPECT_EQ(compare(required.c_str(), offered.c_str()), 2u);
    EXPECT_EQ(compare(offered.c_str(), required.c_str()), 1u);

    // "\xE9" is e-acute in the default single-byte code page; as UTF-8 bytes it would be invalid.
    const std::string lower = "<IOResource><Name>caf\xE9</Name></IOResource>";
    const std::string upper = "<IOResource><Name>CAF\xC9</Name></IOResource>";
    EXPECT_EQ(compare(lower.c_str(), upper.c_str()), 0u);
}

} // namespace
