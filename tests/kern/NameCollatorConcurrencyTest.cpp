// Threads that meet in the name collator: fresh threads opening their collators at the same
// moment (the process locale is read by whichever comes first), and threads sharing one
// collator, on both the table path and the ICU path. Every answer must be the one a single thread
// gets; ThreadSanitizer watches the rest.
#include "kern/Collate.h"
#include "kern/NameCollator.h"

#include <atomic>
#include <gtest/gtest.h>
#include <latch>
#include <string>
#include <thread>
#include <vector>

using qv::kern::CompareNoCase;
using qv::kern::NameCollator;

namespace {

constexpr int kThreads = 8;

// ASCII names (the table path) and names only ICU orders, mixed.
const std::vector<std::u16string>& Names() {
    static const std::vector<std::u16string> names = {u"dio0",
                                                      u"DIO1",
                                                      u"Dio10",
                                                      u"d\u00EFo2",
                                                      u"ai_0",
                                                      u"AI-0",
                                                      u"ao0",
                                                      u"Mod1/AI0",
                                                      u"mod1/ai0 ",
                                                      u"\u0130x",
                                                      u"\u00C5ngstr\u00F6m",
                                                      u"",
                                                      u"a\u0301",
                                                      u"\u00E1",
                                                      u"Connector0/DIO1",
                                                      u"connector0/dio10"};
    return names;
}

template <class Compare> std::vector<int> AllAnswers(Compare compare) {
    std::vector<int> answers;
    for (const auto& a : Names())
        for (const auto& b : Names())
            answers.push_back(compare(a, b));
    return answers;
}

// COMPARE over every pair of names, ROUNDS times on each of kThreads threads released together:
// how many answers differed from EXPECTED.
template <class Compare>
int MismatchesOnThreads(const std::vector<int>& expected, Compare compare, int rounds) {
    std::latch start(kThreads);
    std::atomic<int> mismatches{0};
    std::vector<std::thread> threads;
    for (int t = 0; t < kThreads; ++t) {
        threads.emplace_back([&] {
            start.arrive_and_wait();
            for (int round = 0; round < rounds; ++round) {
                const std::vector<int> answers = AllAnswers(compare);
                for (size_t k = 0; k < answers.size(); ++k)
                    mismatches += answers[k] != expected[k];
            }
        });
    }
    for (std::thread& thread : threads)
        thread.join();
    return mismatches.load();
}

TEST(NameCollatorConcurrency, FreshThreadsOpenTheirCollatorsTogetherAndAgree) {
    const std::vector<int> expected = AllAnswers(CompareNoCase);
    // Each round of threads is new, so every thread opens its own collator at the same moment.
    for (int round = 0; round < 4; ++round)
        EXPECT_EQ(MismatchesOnThreads(expected, CompareNoCase, 1), 0) << "round " << round;
}

TEST(NameCollatorConcurrency, ThreadsSharingOneCollatorGetOneThreadsAnswers) {
    for (const char* locale : {"", "tr", "da"}) {
        const NameCollator shared(locale);
        ASSERT_TRUE(shared.IsOpen()) << locale;
        const auto fast = [&shared](std::u16string_view a, std::u16string_view b) {
            return shared.Compare(a, b);
        };
        const auto icu = [&shared](std::u16string_view a, std::u16string_view b) {
            return shared.CompareWithCollator(a, b);
        };
        EXPECT_EQ(MismatchesOnThreads(AllAnswers(fast), fast, 20), 0) << locale;
        EXPECT_EQ(MismatchesOnThreads(AllAnswers(icu), icu, 20), 0) << locale;
    }
}

} // namespace
