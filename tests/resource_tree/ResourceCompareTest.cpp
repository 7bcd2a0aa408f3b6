// Comparison of resource descriptions as texts: empty and broken texts, the mends for empty lists
// and localized names, hostile sizes, the explanation, the cache, and concurrent callers. The
// directional rules on every kind of entry are checked against generated trees in
// CompareWalkDifferentialTest.
#include "resource_tree/ResourceCompare.h"

#include "TreeTestSupport.h"
#include "resource_tree/CompareCache.h"

#include <algorithm>
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

TEST(ResourceCompare, EmptyTextsBrokenDocumentsEmptyListsAndLocalizedEntriesAreMended) {
    EXPECT_EQ(Compare("", ""), kMatch);
    EXPECT_EQ(Compare("", Resource("")), kToleratedDifference);
    EXPECT_EQ(Compare(Resource(""), ""), kNotSatisfied);
    EXPECT_EQ(Compare(Resource("<A>1</A>"), "<IOResource><A>1</A>"), kToleratedDifference);
    EXPECT_EQ(Compare("<IOResource><A>1</A>", "<IOResource><A>1</A>"), kMatch);
    // An empty list asks for nothing.
    const auto sv = [](const std::string& list) {
        return Resource("<SupportedValues>" + list + "</SupportedValues>");
    };
    EXPECT_EQ(Compare(sv(""), sv("1,2")), kToleratedDifference);
    EXPECT_EQ(Compare(sv(""), sv("")), kMatch);
    EXPECT_EQ(Compare(sv("1,2"), sv("")), kNotSatisfied);
    EXPECT_EQ(Compare(sv(","), sv("")), kNotSatisfied) << "two empty pieces are still asked for";
    // Localized entries take no part in ordered pairing.
    const auto steps = [](const std::string& body) {
        return Resource("<Steps name='Steps' ordered='true'>" + body + "</Steps>");
    };
    const std::string localized = "<Description localize='true'>eng=Read</Description>";
    const std::string plain = "<Description>read</Description>";
    const std::string both = steps(localized + plain);
    EXPECT_EQ(Compare(both, both), kMatch) << "identical descriptions always compare 0";
    EXPECT_EQ(Compare(both, steps(plain)), kMatch) << "a missing translation changes nothing";
    EXPECT_EQ(Compare(steps(plain), both), kMatch);
    EXPECT_EQ(Compare(both, steps(localized + "<Description>write</Description>")), kNotSatisfied);
}

TEST(ResourceCompare, LongListsAndLongRepeatsCompareInPlainTime) {
    // Hostile sizes for a walk that searches every required piece in the whole offered list, or
    // scans for the k-th entry of a name from the start; either made these take minutes.
    std::string required;
    std::string offered;
    for (int i = 0; i < 40000; ++i) {
        if (i != 0) {
            required += ',';
            offered += ',';
        }
        required += std::to_string(i);
        offered += std::to_string(39999 - i);
    }
    const auto sv = [](const std::string& list) {
        return Resource("<SupportedValues>" + list + "</SupportedValues>");
    };
    EXPECT_EQ(Compare(sv(required), sv(offered)), kMatch);
    EXPECT_EQ(Compare(sv(required + ",x"), sv(offered)), kNotSatisfied);
    std::string repeats;
    for (int i = 0; i < 20000; ++i)
        repeats += "<Pin>" + std::to_string(i % 2) + "</Pin>";
    const std::string ordered = "<Pins name='P' ordered='true'>" + repeats + "</Pins>";
    const std::string shifted = "<Pins name='P' ordered='true'><Other/>" + repeats + "</Pins>";
    EXPECT_EQ(Compare(Resource(ordered), Resource(shifted)), kToleratedDifference);
    const std::string swapped =
        "<Pins name='P' ordered='true'><Other/><Pin>1</Pin>" + repeats.substr(12) + "</Pins>";
    EXPECT_EQ(Compare(Resource(ordered), Resource(swapped)), kNotSatisfied);
}

TEST(ResourceCompare, TheExplanationComesFromTheWalkThatAnswers) {
    const std::string required = Resource("<Direction>Input</Direction>"
                                          "<Group name='G'><Rate>fast</Rate>"
                                          "<SupportedValues>1,2</SupportedValues></Group>");
    CompareExplanation why;
    EXPECT_EQ(CompareResourceTexts(required, required, &why), kMatch);
    EXPECT_EQ(why.result, kMatch);
    EXPECT_TRUE(why.findings.empty());

    const std::string slower = Resource("<Direction>Input</Direction>"
                                        "<Group name='G'><Rate>slow</Rate>"
                                        "<SupportedValues>1,2</SupportedValues></Group>");
    EXPECT_EQ(CompareResourceTexts(required, slower, &why), kNotSatisfied);
    ASSERT_NE(why.Shortfall(), nullptr);
    EXPECT_EQ(why.Shortfall()->reason, CompareReason::TextDiffers);
    EXPECT_EQ(why.Shortfall()->path, u"/G/Rate");
    EXPECT_EQ(why.Shortfall()->required, u"fast");
    EXPECT_EQ(why.Shortfall()->offered, u"slow");

    const std::string richer = Resource("<Direction>Input</Direction><Extra>1</Extra>"
                                        "<Group name='G'><Rate>fast</Rate>"
                                        "<SupportedValues>1,2,3</SupportedValues></Group>");
    EXPECT_EQ(CompareResourceTexts(required, richer, &why), kToleratedDifference);
    ASSERT_EQ(why.findings.size(), 2u);
    EXPECT_EQ(why.findings[0].reason, CompareReason::OfferedExtra);
    EXPECT_EQ(why.findings[0].path, u"/Extra");
    EXPECT_EQ(why.findings[1].reason, CompareReason::ListLengthDiffers);
    EXPECT_EQ(why.findings[1].offered, u"1,2,3");

    EXPECT_EQ(CompareResourceTexts(richer, required, &why), kNotSatisfied);
    ASSERT_NE(why.Shortfall(), nullptr);
    EXPECT_EQ(why.Shortfall()->reason, CompareReason::Missing);
    EXPECT_EQ(why.Shortfall()->path, u"/Extra");

    const std::string fewer = Resource("<Direction>Input</Direction>"
                                       "<Group name='G'><Rate>fast</Rate>"
                                       "<SupportedValues>2</SupportedValues></Group>");
    EXPECT_EQ(CompareResourceTexts(required, fewer, &why), kNotSatisfied);
    ASSERT_NE(why.Shortfall(), nullptr);
    EXPECT_EQ(why.Shortfall()->reason, CompareReason::ValueMissing);
    EXPECT_EQ(why.Shortfall()->piece, u"1");
    EXPECT_EQ(CompareResourceTexts("", required, &why), kToleratedDifference);
    ASSERT_EQ(why.findings.size(), 1u);
    EXPECT_EQ(why.findings[0].reason, CompareReason::RequiredEmpty);
}

TEST(ResourceCompare, CachedAnswersAreReusedUntilPushedOutByNewerPairs) {
    // The offered text includes a file: changing the file changes a fresh comparison, but not a
    // cached answer, which shows whether the pair was computed again.
    test::ScratchDirectory dir;
    dir.Write("offer.xml", "<Part><Rate>fast</Rate></Part>");
    LoaderSettings settings = DefaultLoaderSettings();
    const LoaderSettings saved = settings;
    settings.includeDirectory = dir.Path();
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

TEST(CompareCache, KeepsTheMostRecentDistinctPairsWithinCountAndBytes) {
    using Probe = CompareCache::Probe;
    const auto insert = [](CompareCache& cache, std::string_view a, std::string_view b,
                           uint32_t result) {
        cache.Insert(CompareCache::Key(Probe(a, b)), result);
    };
    CompareCache cache(3, 100);
    insert(cache, "a", "b", 1);
    EXPECT_EQ(cache.Find(Probe("a", "b")), 1u);
    EXPECT_FALSE(cache.Find(Probe("A", "b")).has_value()) << "keys are exact, case and all";
    EXPECT_FALSE(cache.Find(Probe("b", "a")).has_value());
    insert(cache, "c", "d", 2);
    insert(cache, "e", "f", 0);
    insert(cache, "a", "b", 2); // computed again: kept once, as the newest
    insert(cache, "g", "h", 2);
    EXPECT_EQ(cache.size(), 3u);
    EXPECT_FALSE(cache.Find(Probe("c", "d")).has_value());
    EXPECT_EQ(cache.Find(Probe("a", "b")), 2u);

    // The byte budget: the oldest pairs go first, and a pair larger than the budget is not kept.
    const std::string forty(40, 'x');
    insert(cache, forty, "1", 0);
    insert(cache, forty, "2", 0);
    EXPECT_EQ(cache.size(), 3u);
    insert(cache, std::string(30, 'z'), "3", 0);
    EXPECT_EQ(cache.size(), 2u) << "82 + 31 bytes exceed the budget";
    EXPECT_EQ(cache.bytes(), 72u);
    EXPECT_FALSE(cache.Find(Probe(forty, "1")).has_value());
    EXPECT_TRUE(cache.Find(Probe(forty, "2")).has_value());
    insert(cache, std::string(61, 'y'), forty, 1);
    EXPECT_FALSE(cache.Find(Probe(std::string(61, 'y'), forty)).has_value());
    EXPECT_EQ(cache.size(), 2u);
}

TEST(ResourceCompare, TheCacheKeepsLargePairsWithinItsByteBudget) {
    // 100 distinct pairs of 1 MB texts would keep 100 MB; the oldest go first.
    ClearCompareCache();
    const std::string filler(1000000, 'c');
    for (int i = 0; i < 100; ++i) {
        const std::string n = "<N>" + std::to_string(i) + "</N>";
        EXPECT_EQ(Compare(Resource("<!--" + filler + "-->" + n), Resource(n)), kMatch);
    }
    EXPECT_LE(CompareCacheBytes(), kCompareCacheBytes);
    EXPECT_GE(CompareCacheBytes(), kCompareCacheBytes - 1000100);
    ClearCompareCache();
    EXPECT_EQ(CompareCacheBytes(), 0u);
}

// A description of N resources, each with a few entries that SEED varies.
std::string LargeResource(int n, int seed) {
    std::string body;
    for (int r = 0; r < n; ++r) {
        body += "<IOResource name='R" + std::to_string(r) + "'><Line>" + std::to_string(r) +
                "</Line><SupportedValues>1," + std::to_string(2 + (r + seed) % 3) +
                "</SupportedValues><MemoryLatency>" + std::to_string(3 + (r * seed) % 2) +
                "</MemoryLatency><Steps name='S' ordered='true'><Op>read</Op><Op>write</Op>"
                "</Steps></IOResource>";
    }
    return "<Target>" + body + "</Target>";
}

TEST(ResourceCompareConcurrency, ThreadsGetTheSingleThreadedAnswers) {
    // Small pairs that threads often share, and large ones whose loads overlap in time; the
    // lock is held only for the cache, so loads and walks of different pairs run side by side.
    std::vector<std::pair<std::string, std::string>> pairs;
    for (int i = 0; i < 120; ++i) {
        const std::string n = std::to_string(i % 7);
        pairs.emplace_back(Resource("<SupportedValues>" + n + "</SupportedValues>"),
                           Resource("<SupportedValues>" + n + "," + std::to_string(i % 3) +
                                    "</SupportedValues><Pin>" + std::to_string(i) + "</Pin>"));
    }
    for (int i = 0; i < 12; ++i)
        pairs.emplace_back(LargeResource(300, i % 4), LargeResource(300, i % 5));
    ClearCompareCache();
    std::vector<uint32_t> expected;
    for (const auto& [a, b] : pairs)
        expected.push_back(Compare(a, b));
    for (const uint32_t answer : {kMatch, kNotSatisfied, kToleratedDifference})
        EXPECT_NE(std::count(expected.begin(), expected.end(), answer), 0);
    ClearCompareCache();

    constexpr size_t kThreads = 6;
    std::vector<std::thread> threads;
    std::vector<int> wrong(kThreads, 0);
    for (size_t t = 0; t < kThreads; ++t) {
        threads.emplace_back([&, t] {
            for (size_t round = 0; round < 2; ++round) {
                // Threads t and t + 3 take the same pairs, in opposite orders.
                for (size_t k = 0; k < pairs.size(); ++k) {
                    const size_t i = t < 3 ? k : pairs.size() - 1 - k;
                    if (i % 3 != t % 3)
                        continue;
                    if (Compare(pairs[i].first, pairs[i].second) != expected[i])
                        ++wrong[t];
                    if (i % 10 == 0)
                        ClearCompareCache();
                }
            }
        });
    }
    for (std::thread& thread : threads)
        thread.join();
    for (const int w : wrong)
        EXPECT_EQ(w, 0);
    EXPECT_LE(CompareCacheBytes(), kCompareCacheBytes);
}

} // namespace
} // namespace wbhw
