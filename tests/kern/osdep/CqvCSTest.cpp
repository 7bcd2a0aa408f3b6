// The critical section: re-entry by its owner, exclusion of other threads.
#include "kern/osdep/CqvCS.h"

#include "kern/CqvFORMATETC.h"

#include <gtest/gtest.h>
#include <thread>
#include <vector>

TEST(CqvCS, OwnerMayEnterAgainAndOthersWait) {
    Bytefair::CqvCS cs;
    ASSERT_TRUE(cs.Lock(0));
    ASSERT_TRUE(cs.Lock(0));
    bool entered = false;
    std::thread other([&] {
        Bytefair::CqvSyncObject& lock = cs;
        lock.Lock(0);
        entered = true;
        lock.Unlock();
    });
    EXPECT_TRUE(cs.Unlock());
    EXPECT_FALSE(entered);
    EXPECT_TRUE(cs.Unlock());
    other.join();
    EXPECT_TRUE(entered);
}

TEST(CqvCS, CountsStayExactUnderContention) {
    Bytefair::CqvCS cs;
    long counter = 0;
    std::vector<std::thread> threads;
    for (int t = 0; t < 4; ++t) {
        threads.emplace_back([&] {
            for (int i = 0; i < 20000; ++i) {
                const std::lock_guard<Bytefair::CqvCS> hold(cs);
                ++counter;
            }
        });
    }
    for (auto& t : threads)
        t.join();
    EXPECT_EQ(counter, 80000);
}

TEST(CqvFORMATETC, StartsAsTextInGlobalMemoryAndComparesAllFields) {
    Bytefair::CqvFORMATETC a;
    EXPECT_EQ(a.Get().cfFormat, 1);
    EXPECT_EQ(a.Get().ptd, nullptr);
    EXPECT_EQ(a.Get().dwAspect, 1u);
    EXPECT_EQ(a.Get().lindex, -1);
    EXPECT_EQ(a.Get().tymed, 1u);
    Bytefair::CqvFORMATETC b;
    EXPECT_EQ(a, b);
    b.Get().lindex = 0;
    EXPECT_FALSE(a == b);
    a = b;
    EXPECT_EQ(a, b);
}
