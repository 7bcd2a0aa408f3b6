// The process-wide comparison: the default locale, C/POSIX mapped to the root collation, and
// safe use from many threads.
#include "kern/Collate.h"

#include "kern/NameCollator.h"

#include <atomic>
#include <cstring>
#include <gtest/gtest.h>
#include <map>
#include <string>
#include <thread>
#include <unicode/uloc.h>
#include <vector>

using qv::kern::CompareNoCase;
using qv::kern::LessNoCase;

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
