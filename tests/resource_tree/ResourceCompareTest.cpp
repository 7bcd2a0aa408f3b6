// Comparison of resource descriptions: the directional rules, the mends for localized names and
// repeated names, the cache, and concurrent callers.
#include "resource_tree/ResourceCompare.h"

#include "TreeTestSupport.h"
#include "resource_tree/CompareCache.h"

#include <gtest/gtest.h>
#include <string>
#include <thread>
#include <vector>

namespace wbhw {
namespace {

uint32_t Compare(const std::string& a, const std::string& b) {
    return CompareResourceTexts(a, b);
}

std::string Resource(const std::string& body) {
    return "<IOResource>" + body + "</IOResource>";
}

TEST(ResourceCompare, EmptyTextsDecideWithoutLoading) {
    EXPECT_EQ(Compare("", ""), kMatch);
    EXPECT_EQ(Compare("", Resource("")), kToleratedDifference);
    EXPECT_EQ(Compare(Resource(""), ""), kNotSatisfied);
}

TEST(ResourceCompare, OfferedMayOfferMoreButNotLess) {
    const std::string base = "<Direction>Input</Direction><Group name='Pins'><Pin>1</Pin></Group>";
    EXPECT_EQ(Compare(Resource(base), Resource(base)), kMatch);
    EXPECT_EQ(Compare(Resource(base), Resource(base + "<Extra name='x'/>")), kToleratedDifference);
    EXPECT_EQ(Compare(Resource(base + "<Extra name='x'/>"), Resource(base)), kNotSatisfied);
    EXPECT_EQ(
        Compare(Resource("<Direction>Input</Direction>"), Resource("<Direction>input</Direction>")),
        kMatch);
    EXPECT_EQ(Compare(Resource("<Direction>Input</Direction>"),
                      Resource("<Direction>Output</Direction>")),
              kNotSatisfied);
    // A node where a text is required, and a text where a node is required.
    EXPECT_EQ(
        Compare(Resource("<Pins name='Pins'><Pin>1</Pin></Pins>"), Resource("<Pins>1</Pins>")),
        kNotSatisfied);
    EXPECT_EQ(
        Compare(Resource("<Pins>1</Pins>"), Resource("<Pins name='Pins'><Pin>1</Pin></Pins>")),
        kNotSatisfied);
    // "Value" is never compared.
    EXPECT_EQ(Compare(Resource("<Value>3</Value>"), Resource("<Value>4</Value>")), kMatch);
}

TEST(ResourceCompare, SupportedValuesAndMemoryLatencyAreDirectional) {
    const auto sv = [](const std::string& list) {
        return Resource("<SupportedValues>" + list + "</SupportedValues>");
    };
    EXPECT_EQ(Compare(sv("1,2"), sv("1,2,3")), kToleratedDifference);
    EXPECT_EQ(Compare(sv("1,2,3"), sv("1,2")), kNotSatisfied);
    EXPECT_EQ(Compare(sv("2,1"), sv("1,2")), kMatch);
    const auto ml = [](const std::string& n) {
        return Resource("<MemoryLatency>" + n + "</MemoryLatency>");
    };
    EXPECT_EQ(Compare(ml("5"), ml("3")), kToleratedDifference);
    EXPECT_EQ(Compare(ml("5"), ml("7")), kNotSatisfied);
    EXPECT_EQ(Compare(ml("5 cycles"), ml("5")), kMatch);
    // Other lists must be equal as texts; their pieces are then checked as well.
    EXPECT_EQ(Compare(Resource("<Modes>a,b</Modes>"), Resource("<Modes>a,b,c</Modes>")),
              kNotSatisfied);
}

TEST(ResourceCompare, LocalizedNamesAreIgnoredOnBothSides) {
    const std::string english =
        Resource("<Label localize='true'>eng=Line,deu=Leitung</Label>"
                 "<LocalizedName>Line</LocalizedName><LocalizedValues>On,Off</LocalizedValues>");
    const std::string german =
        Resource("<Label localize='true'>deu=Leitung</Label>"
                 "<LocalizedName>Leitung</LocalizedName><LocalizedValues>An,Aus</LocalizedValues>");
    EXPECT_EQ(Compare(english, english), kMatch);
    EXPECT_EQ(Compare(english, german), kMatch);
    EXPECT_EQ(Compare(german, english), kMatch);
}

TEST(ResourceCompare, RepeatedNamesInOrderedNodesPairUpInOrder) {
    const std::string twice = "<Steps name='Steps' ordered='true'>"
                              "<Step name='s'><Op>read</Op></Step>"
                              "<Step name='s'><Op>write</Op></Step></Steps>";
    EXPECT_EQ(Compare(Resource(twice), Resource(twice)), kMatch);
    const std::string once = "<Steps name='Steps' ordered='true'>"
                             "<Step name='s'><Op>read</Op></Step></Steps>";
    EXPECT_EQ(Compare(Resource(twice), Resource(once)), kNotSatisfied);
    EXPECT_EQ(Compare(Resource(once), Resource(twice)), kToleratedDifference);
    const std::string swapped = "<Steps name='Steps' ordered='true'>"
                                "<Step name='s'><Op>write</Op></Step>"
                                "<Step name='s'><Op>read</Op></Step></Steps>";
    EXPECT_EQ(Compare(Resource(twice), Resource(swapped)), kNotSatisfied);
}

TEST(ResourceCompare, BrokenDocumentsStillCompare) {
    EXPECT_EQ(Compare(Resource("<A>1</A>"), "<IOResource><A>1</A>"), kToleratedDifference);
    EXPECT_EQ(Compare("<IOResource><A>1</A>", "<IOResource><A>1</A>"), kMatch);
}

TEST(ResourceCompare, CachedAnswersAreReusedUntilPushedOutByNewerPairs) {
    // The offered text includes a file: changing the file changes a fresh comparison, but not a
    // cached answer, which shows whether the pair was computed again.
    test::ScratchDirectory dir;
    dir.Write("offer.xml", "<Part><Rate>fast</Rate></Part>");
    LoaderSettings settings = DefaultLoaderSettings();
    const LoaderSettings saved = settings;
    settings.includeDirectory = dir.path();
    SetDefaultLoaderSettings(settings);
    ClearCompareCache();

    const std::string required = Resource("<Rate>fast</Rate>");
    const std::string offered =
        "<IOResource><:Include what='children'>offer.xml</:Include></IOResource>";
    EXPECT_EQ(Compare(required, offered), kMatch);
    dir.Write("offer.xml", "<Part><Rate>slow</Rate></Part>");
    EXPECT_EQ(Compare(required, offered), kMatch) << "a repeated pair comes from the cache";

    for (int i = 0; i < 100; ++i)
        Compare(Resource("<N>" + std::to_string(i) + "</N>"), Resource("<N>0</N>"));
    EXPECT_EQ(Compare(required, offered), kNotSatisfied) << "101 newer pairs push it out";

    SetDefaultLoaderSettings(saved);
    ClearCompareCache();
}

TEST(CompareCache, KeepsTheMostRecentDistinctPairsExactly) {
    CompareCache cache(3);
    cache.Insert({u"a", u"b"}, 1);
    EXPECT_EQ(cache.Find({u"a", u"b"}), 1u);
    EXPECT_FALSE(cache.Find({u"A", u"b"}).has_value()) << "keys are exact, case and all";
    EXPECT_FALSE(cache.Find({u"b", u"a"}).has_value());
    cache.Insert({u"c", u"d"}, 2);
    cache.Insert({u"e", u"f"}, 0);
    cache.Insert({u"g", u"h"}, 2);
    EXPECT_EQ(cache.size(), 3u);
    EXPECT_FALSE(cache.Find({u"a", u"b"}).has_value());
    EXPECT_EQ(cache.Find({u"g", u"h"}), 2u);
}

TEST(ResourceCompareConcurrency, ThreadsGetTheSingleThreadedAnswers) {
    std::vector<std::pair<std::string, std::string>> pairs;
    for (int i = 0; i < 150; ++i) {
        const std::string n = std::to_string(i % 7);
        pairs.emplace_back(Resource("<SupportedValues>" + n + "</SupportedValues>"),
                           Resource("<SupportedValues>" + n + "," + std::to_string(i % 3) +
                                    "</SupportedValues><Pin>" + std::to_string(i) + "</Pin>"));
    }
    ClearCompareCache();
    std::vector<uint32_t> expected;
    for (const auto& [a, b] : pairs)
        expected.push_back(Compare(a, b));
    ClearCompareCache();

    std::vector<std::thread> threads;
    std::vector<int> wrong(4, 0);
    for (size_t t = 0; t < wrong.size(); ++t) {
        threads.emplace_back([&, t] {
            for (size_t round = 0; round < 3; ++round) {
                for (size_t i = t; i < pairs.size(); i += 2) {
                    if (Compare(pairs[i].first, pairs[i].second) != expected[i])
                        ++wrong[t];
                }
            }
        });
    }
    for (std::thread& thread : threads)
        thread.join();
    for (const int w : wrong)
        EXPECT_EQ(w, 0);
}

} // namespace
} // namespace wbhw
