// Code pages: the default and the named ones, unknown names, and characters a page lacks.
#include "kern/CodePage.h"

#include "kern/exception/Exception.h"

#include <cstdlib>
#include <gtest/gtest.h>

using qv::kern::AnsiToWide;
using qv::kern::WideToAnsi;
using qv::kern::exception::InvalidLocale;

namespace {

// Sets WBTANGIO_CODEPAGE for one test and restores the environment after it.
class ScopedCodePage {
public:
    explicit ScopedCodePage(const char* name) { setenv("WBTANGIO_CODEPAGE", name, 1); }
    ~ScopedCodePage() { unsetenv("WBTANGIO_CODEPAGE"); }
};

} // namespace

TEST(CodePage, DefaultIsWindows1252UnlessTheEnvironmentChoosesAndKeepsEveryByte) {
    unsetenv("WBTANGIO_CODEPAGE");
    EXPECT_EQ(AnsiToWide("\x80 caf\xE9"), u"\u20AC caf\u00E9");
    EXPECT_EQ(WideToAnsi(u"\u20AC caf\u00E9"), "\x80 caf\xE9");
    // Every byte comes back unchanged, the five that Windows maps to C1 controls included.
    std::string all;
    for (int b = 1; b < 256; ++b)
        all.push_back(static_cast<char>(b));
    EXPECT_EQ(WideToAnsi(AnsiToWide(all)), all);
    EXPECT_EQ(AnsiToWide(""), u"");
    EXPECT_EQ(WideToAnsi(u""), "");
    {
        const ScopedCodePage page("cp932");
        EXPECT_EQ(AnsiToWide("\x93\xFA"), u"\u65E5");
        EXPECT_EQ(WideToAnsi(u"\u65E5"), "\x93\xFA");
    }
    {
        const ScopedCodePage page("no-such-converter");
        EXPECT_THROW(AnsiToWide("x"), InvalidLocale);
    }
    EXPECT_EQ(AnsiToWide("\xE9"), u"\u00E9");
}

TEST(CodePage, NamedPagesUnknownNamesLongTextsAndCharactersThePageLacks) {
    EXPECT_EQ(AnsiToWide("\x93\xFA\x96\x7B", "cp932"), u"\u65E5\u672C");
    EXPECT_EQ(WideToAnsi(u"A\u65E5\u672C", "cp932"), "A\x93\xFA\x96\x7B");
    EXPECT_EQ(WideToAnsi(u"caf\u00E9", "US-ASCII"), "caf?");
    EXPECT_EQ(AnsiToWide("ok", "US-ASCII"), u"ok");
    EXPECT_THROW(AnsiToWide("x", "utf-8"), InvalidLocale);
    EXPECT_THROW(WideToAnsi(u"x", "windows-1252"), InvalidLocale);
    // The name is checked even when there is nothing to convert.
    EXPECT_THROW(AnsiToWide("", "latin1"), InvalidLocale);
    // Whole descriptions are decoded a block at a time; double-byte characters and a trailing
    // bad byte must come out the same across the blocks' edges.
    std::string bytes = "A";
    std::u16string wide = u"A";
    for (int i = 0; i < 20000; ++i) {
        bytes += "\x93\xFA";
        wide += u"\u65E5";
    }
    EXPECT_EQ(AnsiToWide(bytes, "cp932"), wide);
    EXPECT_EQ(AnsiToWide(std::string(40000, 'x') + "\x93", "cp932").size(), 40001u);
    // Characters the page lacks become question marks.
    unsetenv("WBTANGIO_CODEPAGE");
    EXPECT_EQ(WideToAnsi(u"a\u65E5b"), "a?b");
    // An unpaired surrogate is not a character of any page.
    EXPECT_EQ(WideToAnsi(std::u16string(u"a") + char16_t(0xD800) + u"b"), "a?b");
    // Invisible format characters too: a name must not lose them without a trace.
    EXPECT_EQ(WideToAnsi(u"a\u200Bb\u202C", "US-ASCII"), "a?b?");
    EXPECT_EQ(WideToAnsi(u"a\u200Bb", "cp932"), "a?b");
}
