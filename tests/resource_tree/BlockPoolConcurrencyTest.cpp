// Entry blocks that cross threads: blocks taken on one thread and given back on another while
// both keep taking more, and whole trees built on one thread and freed on another while threads
// come and go. A block never belongs to two holders at once; ThreadSanitizer watches the
// hand-over between the threads' caches and the shared depot.
#include "TreeTestSupport.h"
#include "resource_tree/BlockPool.h"
#include "resource_tree/ResTreeWriter.h"

#include <atomic>
#include <condition_variable>
#include <cstdint>
#include <cstring>
#include <deque>
#include <gtest/gtest.h>
#include <memory>
#include <mutex>
#include <thread>
#include <vector>

namespace wbhw {
namespace {
using namespace test;

// A queue that hands things from the threads that make them to the threads that free them.
template <class T> class HandOver {
public:
    void Put(T item) {
        {
            const std::lock_guard<std::mutex> hold(lock_);
            items_.push_back(std::move(item));
        }
        ready_.notify_one();
    }
    // The next item, or nothing once every producer is done and the queue is empty.
    bool Take(T& item) {
        std::unique_lock<std::mutex> hold(lock_);
        ready_.wait(hold, [this] { return !items_.empty() || producers_ == 0; });
        if (items_.empty())
            return false;
        item = std::move(items_.front());
        items_.pop_front();
        return true;
    }
    void AddProducer() {
        const std::lock_guard<std::mutex> hold(lock_);
        ++producers_;
    }
    void ProducerDone() {
        {
            const std::lock_guard<std::mutex> hold(lock_);
            --producers_;
        }
        ready_.notify_all();
    }

private:
    std::mutex lock_;
    std::condition_variable ready_;
    std::deque<T> items_;
    int producers_ = 0;
};

// Fills BLOCK with its holder's mark; Intact tells whether it still holds only that mark.
void Mark(BlockPool& pool, void* block, uint8_t mark) {
    std::memset(block, mark, pool.BlockSize());
}
bool Intact(BlockPool& pool, const void* block, uint8_t mark) {
    const auto* bytes = static_cast<const uint8_t*>(block);
    for (size_t i = 0; i < pool.BlockSize(); ++i) {
        if (bytes[i] != mark)
            return false;
    }
    return true;
}

TEST(BlockPoolConcurrency, BlocksGivenBackOnOtherThreadsNeverReachTwoHolders) {
    constexpr int kPairs = 4;
    constexpr int kBlocksEach = 20000;
    BlockPool& pool = BlockPool::ForSize(64);
    HandOver<std::pair<void*, uint8_t>> handOver;
    std::atomic<int> damaged{0};
    std::vector<std::thread> threads;
    for (int t = 0; t < kPairs; ++t) {
        handOver.AddProducer();
        // Takes blocks, marks them as its own and hands them on.
        threads.emplace_back([&, t] {
            const auto mark = static_cast<uint8_t>(1 + t);
            for (int i = 0; i < kBlocksEach; ++i) {
                void* block = pool.Allocate();
                Mark(pool, block, mark);
                handOver.Put({block, mark});
            }
            handOver.ProducerDone();
        });
        // Frees what others took, and meanwhile takes and frees blocks of its own.
        threads.emplace_back([&, t] {
            const auto mine = static_cast<uint8_t>(0x80 + t);
            std::pair<void*, uint8_t> item;
            while (handOver.Take(item)) {
                damaged += !Intact(pool, item.first, item.second);
                pool.Release(item.first);
                void* own = pool.Allocate();
                Mark(pool, own, mine);
                damaged += !Intact(pool, own, mine);
                pool.Release(own);
            }
        });
    }
    for (std::thread& thread : threads)
        thread.join();
    EXPECT_EQ(damaged.load(), 0);
}

TEST(BlockPoolConcurrency, TreesBuiltOnOneThreadAreFreedOnAnother) {
    const std::u16string doc =
        u"<Target><Connector names='C[i=0..3]'><IOResource names='L[j=0..15]'><V>#{j}</V>"
        u"</IOResource></Connector><Extra>x</Extra></Target>";
    const std::unique_ptr<ResTreeNode> model = Load(doc);
    constexpr int kBuilders = 3;
    constexpr int kTreesEach = 12;
    HandOver<std::unique_ptr<ResTreeNode>> handOver;
    std::atomic<int> wrong{0};
    std::vector<std::thread> threads;
    for (int t = 0; t < kBuilders; ++t) {
        handOver.AddProducer();
        threads.emplace_back([&] {
            for (int i = 0; i < kTreesEach; ++i)
                handOver.Put(Load(doc));
            handOver.ProducerDone();
        });
    }
    // Each freeing thread checks a tree, frees it and ends; new ones take over, so blocks are
    // also given back by threads whose caches are already gone.
    for (int t = 0; t < kBuilders; ++t) {
        threads.emplace_back([&] {
            std::unique_ptr<ResTreeNode> tree;
            while (handOver.Take(tree)) {
                std::thread([&] {
                    wrong += !EqualResTrees(*model, *tree, nullptr);
                    tree.reset();
                }).join();
            }
        });
    }
    for (std::thread& thread : threads)
        thread.join();
    EXPECT_EQ(wrong.load(), 0);
}

} // namespace
} // namespace wbhw
