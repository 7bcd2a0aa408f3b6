// The block pool behind node entries: reuse, sizes, and blocks that cross threads.
#include "resource_tree/BlockPool.h"

#include "TreeTestSupport.h"

#include <algorithm>
#include <cstdint>
#include <cstring>
#include <gtest/gtest.h>
#include <set>
#include <thread>
#include <vector>

namespace wbhw {
namespace {
using namespace test;

TEST(BlockPool, BlocksAreDistinctAlignedAndReused) {
    BlockPool& pool = BlockPool::ForSize(100);
    EXPECT_EQ(&pool, &BlockPool::ForSize(112));
    EXPECT_NE(&pool, &BlockPool::ForSize(113));
    EXPECT_EQ(pool.BlockSize(), 112u);
    // More than one slab's worth, each written over its whole size.
    std::vector<void*> blocks;
    for (int i = 0; i < 2000; ++i) {
        void* block = pool.Allocate();
        EXPECT_EQ(reinterpret_cast<uintptr_t>(block) % 16, 0u);
        std::memset(block, i & 0xFF, pool.BlockSize());
        blocks.push_back(block);
    }
    EXPECT_EQ(std::set<void*>(blocks.begin(), blocks.end()).size(), blocks.size());
    for (int i = 0; i < 2000; ++i)
        EXPECT_EQ(static_cast<unsigned char*>(blocks[i])[pool.BlockSize() - 1], i & 0xFF);
    for (void* block : blocks)
        pool.Release(block);
    pool.Release(nullptr);
    // What was freed is handed out again before anything new.
    const std::set<void*> freed(blocks.begin(), blocks.end());
    for (int i = 0; i < 2000; ++i)
        EXPECT_EQ(freed.count(pool.Allocate()), 1u);
}

TEST(BlockPool, BlocksFreedOnAnotherThreadComeBackToTheThreadsThatAllocate) {
    BlockPool& pool = BlockPool::ForSize(48);
    // More blocks than a thread keeps, so that the freeing thread hands them on before it ends.
    std::vector<void*> blocks(70000);
    for (void*& block : blocks)
        block = pool.Allocate();
    std::thread([&] {
        for (void* block : blocks)
            pool.Release(block);
    }).join();
    // This thread first uses up what is left of its last slab (fewer than a slab's blocks),
    // then gets the other thread's blocks instead of new slabs.
    const std::set<void*> freed(blocks.begin(), blocks.end());
    size_t reused = 0;
    for (size_t i = 0; i < blocks.size() + 64 * 1024 / 48; ++i)
        reused += freed.count(pool.Allocate());
    EXPECT_EQ(reused, blocks.size());
}

// Holds a tree that a thread frees at its very end, after the pool's caches of that thread.
struct LateTree {
    std::unique_ptr<ResTreeNode> root;
};
thread_local LateTree lateTree;

TEST(BlockPool, TreesMayBeBuiltAndFreedOnAnyThread) {
    const std::u16string doc =
        u"<Target><Connector name='c'><IOResource name='a'><V>1</V></IOResource>"
        u"<IOResource name='b'><V>2</V></IOResource></Connector><Extra>x</Extra></Target>";
    std::unique_ptr<ResTreeNode> built;
    std::thread([&] { built = Load(doc); }).join();
    ASSERT_NE(built, nullptr);
    EXPECT_EQ(Names(*built), (std::vector<std::u16string>{u"c", u"Extra"}));
    // Built here, freed by a thread whose own caches are already gone when it frees.
    std::thread([&] {
        // Touched before the pool's caches, so that it is destroyed after them.
        LateTree& late = lateTree;
        late.root = Load(doc);
        late.root->SetText(u"More", u"y");
    }).join();
    built.reset();
    auto again = Load(doc);
    EXPECT_EQ(TextOf(*ChildOf(*ChildOf(*again, u"c"), u"b"), u"V"), u"2");
}

} // namespace
} // namespace wbhw
