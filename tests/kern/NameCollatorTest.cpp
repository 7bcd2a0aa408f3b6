// The ASCII rank table must answer exactly as ICU does, in locales with and without tailorings
// that break its conditions, checked over many generated names; and the process-wide comparison:
// the default locale, C/POSIX mapped to the root collation, safe use from many threads.
#include "kern/NameCollator.h"

#include "kern/Collate.h"

#include <atomic>
#include <cstring>
#include <gtest/gtest.h>
#include <map>
#include <random>
#include <string>
#include <thread>
#include <unicode/uloc.h>
#include <vector>

using qv::kern::CompareNoCase;
using qv::kern::LessNoCase;
using qv::kern::NameCollator;

namespace {

// Letters, digits and punctuation of ASCII, plus a few that only ICU may order: controls (which
// ICU ignores), accented letters, a combining mark, and letters that form contractions in some
// tailorings.
const std::u16string kPool =
    u" !\"#$%&'()*+,-./0123456789:;<=>?@ABCDEFGHIJKLMNOPQRSTUVWXYZ"
    u"[\\]^_`abcdefghijklmnopqrstuvwxyz{|}~\t\x01\x7F"
    u"\u00E9\u00C5\u00E5\u0131\u0130\u0301\u0307\u030A\u00B7\u0327chCHlLaAiI";

class NameGenerator {
public:
    explicit NameGenerator(bool asciiOnly) : limit_(asciiOnly ? 95 : kPool.size()) {}

    std::u16string Name() {
        std::u16string s(Pick(9), u'\0');
        for (char16_t& c : s)
            c = kPool[Pick(limit_)];
        return s;
    }
    // The same name with the case of some ASCII letters flipped.
    std::u16string FlipCase(std::u16string s) {
        for (char16_t& c : s) {
            if (((c | 0x20) >= u'a' && (c | 0x20) <= u'z') && Pick(2) == 0)
                c ^= 0x20;
        }
        return s;
    }
    size_t Pick(size_t n) { return std::uniform_int_distribution<size_t>(0, n - 1)(random_); }

private:
    size_t limit_;
    std::mt19937 random_{20260612};
};

// Compares both paths, and the order keys, over pairs built to hit equal, case-only, prefix and
// random differences.
void ExpectSameAsIcu(const char* locale, bool asciiOnly) {
    const NameCollator collator(locale);
    ASSERT_TRUE(collator.IsOpen()) << locale;
    NameGenerator gen(asciiOnly);
    for (int i = 0; i < 20000; ++i) {
        const std::u16string a = gen.Name();
        const std::u16string pairs[] = {gen.FlipCase(a), gen.Name(), a + gen.Name(),
                                        gen.FlipCase(a) + gen.Name(), a.substr(0, gen.Pick(9))};
        for (const std::u16string& b : pairs) {
            ASSERT_EQ(collator.Compare(a, b), collator.CompareWithCollator(a, b))
                << "locale '" << locale << "' name " << i;
            ASSERT_EQ(collator.Compare(b, a), collator.CompareWithCollator(b, a))
                << "locale '" << locale << "' name " << i;
            // Sets compare by order keys first; the names come in only where the keys cannot tell.
            ASSERT_EQ(collator.CompareKeyed(a, collator.OrderKey(a), b, collator.OrderKey(b)),
                      collator.CompareWithCollator(a, b))
                << "locale '" << locale << "' name " << i;
        }
        // Names that agree (case aside) beyond what a key holds: the keys tie and the names decide.
        const std::u16string x = a + a + gen.Name();
        const std::u16string y = gen.FlipCase(a + a) + gen.Name();
        ASSERT_EQ(collator.CompareKeyed(x, collator.OrderKey(x), y, collator.OrderKey(y)),
                  collator.CompareWithCollator(x, y))
            << "locale '" << locale << "' name " << i;
    }
}

} // namespace

TEST(NameCollator, RootAndPlainLocalesTakeTheFastPathWhichAgreesWithIcuOnAnyNames) {
    for (const char* locale : {"", "en_US", "de", "fr"}) {
        const NameCollator collator(locale);
        EXPECT_TRUE(collator.HasAsciiFastPath()) << locale;
        EXPECT_EQ(collator.Compare(u"DIO0", u"dio0"), 0) << locale;
        EXPECT_EQ(collator.Compare(u"Mod1/AI0", u"mod1/ai1"), -1) << locale;
    }
    for (const char* locale : {"", "en_US", "tr", "cs", "da", "ja", "en@colNumeric=yes",
                               "en@colAlternate=shifted", "en@colCaseLevel=yes"})
        ExpectSameAsIcu(locale, true);
    for (const char* locale : {"", "tr", "cs", "da", "en@colAlternate=shifted"})
        ExpectSameAsIcu(locale, false);
}

TEST(NameCollator, OrdersAsTheCollatorDoesTailoredLettersKeepTheirMeaningIdenticalTextsAreEqual) {
    const NameCollator root("");
    // Punctuation sorts before digits and digits before letters in the collation, unlike in
    // ASCII where "_" (0x5F) lies between upper and lower case letters.
    EXPECT_EQ(root.Compare(u"a_b", u"a1b"), -1);
    EXPECT_EQ(root.Compare(u"a1b", u"aab"), -1);
    EXPECT_EQ(root.Compare(u"AB", u"ab_"), -1);
    // Controls are ignored by the collation, so they must not decide anything.
    EXPECT_EQ(root.Compare(u"a\x01"
                           u"b",
                           u"AB"),
              0);
    // Texts with embedded NUL keep their full length.
    EXPECT_EQ(root.Compare(std::u16string_view(u"ab\0c", 4), u"abd"), -1);
    // In Turkish dotless and dotted i are different letters, so I and i differ.
    EXPECT_NE(NameCollator("tr").Compare(u"DIO", u"dio"), 0);
    // ...and I followed by a combining dot is the capital of i, decided only with the dot.
    EXPECT_EQ(NameCollator("tr").Compare(u"DI\u0307O", u"dio"), 0);
    // In Czech "ch" sorts after "h".
    EXPECT_EQ(NameCollator("cs").Compare(u"chata", u"hrad"), 1);
    EXPECT_EQ(NameCollator("").Compare(u"chata", u"hrad"), -1);
    // Identical texts are equal whatever they hold.
    // The rank walk meets identical texts first; those it cannot rank must still come out equal
    // (a text compared with its own copy is how most lookups end).
    for (const char* locale : {"", "tr", "cs", "en@colAlternate=shifted"}) {
        const NameCollator collator(locale);
        for (const std::u16string text :
             {u"", u"DIO0", u"a_b", u"\u00E9t\u00E9", u"ch\u0307", u"x\x01y", u"\U0001F600"}) {
            const std::u16string copy = text;
            EXPECT_EQ(collator.Compare(text, copy), 0) << locale;
        }
    }
}

// Run by ctest a second time with LANG=C.UTF-8, where ICU's default is en_US_POSIX.
TEST(CollateDefaultLocale, CAndPosixIgnoreCaseLikeRoot) {
    if (std::strncmp(uloc_getDefault(), "en_US_POSIX", 11) != 0)
        GTEST_SKIP() << "default locale is " << uloc_getDefault();
    // en_US_POSIX itself tells these apart; the comparison must not.
    EXPECT_NE(qv::kern::NameCollator("en_US_POSIX").CompareWithCollator(u"DIO0", u"dio0"), 0);
    EXPECT_EQ(CompareNoCase(u"DIO0", u"dio0"), 0);
    EXPECT_EQ(CompareNoCase(u"Connector0/DIO1", u"connector0/dio1"), 0);
    EXPECT_EQ(CompareNoCase(u"\u00C9t\u00E9", u"\u00E9T\u00C9"), 0);
    EXPECT_EQ(CompareNoCase(u"e", u"\u00E9"), -1);
}

TEST(Collate, NamesKeyAMapIgnoringCase) {
    std::map<std::u16string, int, LessNoCase> names;
    names[u"Mod1/AI0"] = 1;
    names[u"MOD1/ai0"] = 2;
    names[u"Mod1/AI10"] = 3;
    EXPECT_EQ(names.size(), 2u);
    EXPECT_EQ(names.find(u"mod1/Ai0")->second, 2);
    EXPECT_EQ(CompareNoCase({}, u""), 0);
    EXPECT_EQ(CompareNoCase({}, u"a"), -1);
    EXPECT_EQ(qv::kern::NameCollator("en@colNumeric=yes").Compare({}, u"\u00E9"), -1);
}

TEST(Collate, ThreadsAgreeWithEachOther) {
    const std::vector<std::u16string> names = {u"dio0", u"DIO1", u"Dio10", u"d\u00EFo2",
                                               u"ai_0", u"AI-0", u"ao0",   u"\u00C5ngstr\u00F6m"};
    std::vector<int> expected;
    for (const auto& a : names)
        for (const auto& b : names)
            expected.push_back(CompareNoCase(a, b));
    std::atomic<int> mismatches{0};
    std::vector<std::thread> threads;
    for (int t = 0; t < 8; ++t) {
        threads.emplace_back([&] {
            for (int round = 0; round < 200; ++round) {
                size_t k = 0;
                for (const auto& a : names)
                    for (const auto& b : names)
                        mismatches += CompareNoCase(a, b) != expected[k++];
            }
        });
    }
    for (auto& t : threads)
        t.join();
    EXPECT_EQ(mismatches.load(), 0);
}
