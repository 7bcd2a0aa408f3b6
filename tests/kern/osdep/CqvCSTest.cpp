// The critical section: re-entry by its owner, exclusion of other threads.
#include "kern/osdep/CqvCS.h"

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
