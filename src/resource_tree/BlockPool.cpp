// Fixed-size blocks for the entries of resource-tree nodes.
#include "resource_tree/BlockPool.h"

#include <array>
#include <mutex>
#include <new>
#include <vector>

namespace wbhw {
namespace {

constexpr size_t kClasses = BlockPool::kMaxBlock / BlockPool::kGranule;
constexpr size_t kSlabBytes = 64 * 1024;
// A thread keeps at most this many free blocks of a size; then all of them go to the depot, where
// other threads find them (a tree freed on another thread than the one that built it).
constexpr size_t kMaxCached = 65536;

struct FreeBlock {
    FreeBlock* next;
};

// A list of free blocks. Blocks move between lists whole, in constant time: walking a list of
// blocks freed long ago would meet a cache miss at every step.
struct BlockList {
    FreeBlock* head = nullptr;
    FreeBlock* tail = nullptr; // valid while head is not null
    size_t count = 0;

    void Push(void* block) noexcept {
        auto* freed = ::new (block) FreeBlock{head};
        if (head == nullptr)
            tail = freed;
        head = freed;
        ++count;
    }
    // The first block; the list must not be empty.
    void* Pop() noexcept {
        FreeBlock* block = head;
        head = block->next;
        --count;
        // Blocks freed by a tree's teardown come back in the order of its nodes, not of their
        // addresses, so reading the next link would miss the cache on nearly every allocation of
        // the next load. Fetching it now lets the element's parsing hide the wait.
        if (head != nullptr)
            __builtin_prefetch(head, 1);
        return block;
    }
    // Moves every block of FROM to the front of this list.
    void TakeAll(BlockList& from) noexcept {
        if (from.head == nullptr)
            return;
        from.tail->next = head;
        if (head == nullptr)
            tail = from.tail;
        head = from.head;
        count += from.count;
        from = BlockList{};
    }
};

// Puts the blocks of a new slab of SIZE-byte blocks on LIST and the slab in SLABS; the caller
// holds the depot's lock.
void CarveSlab(std::vector<void*>& slabs, size_t size, BlockList& list) {
    slabs.reserve(slabs.size() + 1);
    auto* slab = static_cast<char*>(::operator new(kSlabBytes));
    slabs.push_back(slab);
    // Pushed from the end, so that the blocks a load takes one after another lie in order.
    for (size_t i = kSlabBytes / size; i > 0; --i)
        list.Push(slab + (i - 1) * size);
}

} // namespace

struct BlockPool::Depot {
    std::mutex lock;
    BlockList free;
    std::vector<void*> slabs; // kept for the life of the process
};

// This thread's caches, one per block size. At thread exit they go back to the depots; blocks
// freed or made later on the same thread (by other thread-local objects) use the depot directly.
struct ThreadBlockCaches {
    std::array<BlockList, kClasses> caches{};
    ~ThreadBlockCaches();
};

namespace {

thread_local ThreadBlockCaches threadCaches;
thread_local bool threadCachesGone = false;

} // namespace

BlockPool::BlockPool(size_t size, size_t index) : size_(size), index_(index), depot_(new Depot) {}

BlockPool& BlockPool::ForSize(size_t size) {
    // Never destroyed: trees may still be freed while static objects are destroyed.
    static const std::array<BlockPool*, kClasses>* const pools = [] {
        auto* made = new std::array<BlockPool*, kClasses>{};
        for (size_t i = 0; i < kClasses; ++i)
            (*made)[i] = new BlockPool((i + 1) * kGranule, i);
        return made;
    }();
    return *(*pools)[(size + kGranule - 1) / kGranule - 1];
}

void* BlockPool::Allocate() {
    if (threadCachesGone) {
        const std::lock_guard<std::mutex> hold(depot_->lock);
        if (depot_->free.head == nullptr)
            CarveSlab(depot_->slabs, size_, depot_->free);
        return depot_->free.Pop();
    }
    BlockList& cache = threadCaches.caches[index_];
    if (cache.head == nullptr)
        Refill();
    return cache.Pop();
}

void BlockPool::Release(void* block) noexcept {
    if (block == nullptr)
        return;
    if (threadCachesGone) {
        const std::lock_guard<std::mutex> hold(depot_->lock);
        depot_->free.Push(block);
        return;
    }
    BlockList& cache = threadCaches.caches[index_];
    cache.Push(block);
    if (cache.count > kMaxCached)
        Spill();
}

void BlockPool::Refill() {
    BlockList& cache = threadCaches.caches[index_];
    const std::lock_guard<std::mutex> hold(depot_->lock);
    if (depot_->free.head != nullptr)
        cache.TakeAll(depot_->free);
    else
        CarveSlab(depot_->slabs, size_, cache);
}

void BlockPool::Spill() noexcept {
    BlockList& cache = threadCaches.caches[index_];
    const std::lock_guard<std::mutex> hold(depot_->lock);
    depot_->free.TakeAll(cache);
}

size_t BlockPool::BytesInUse() noexcept {
    size_t bytes = 0;
    for (size_t i = 0; i < kClasses; ++i) {
        BlockPool& pool = ForSize((i + 1) * kGranule);
        const std::lock_guard<std::mutex> hold(pool.depot_->lock);
        size_t free = pool.depot_->free.count;
        if (!threadCachesGone)
            free += threadCaches.caches[i].count;
        const size_t made = pool.depot_->slabs.size() * (kSlabBytes / pool.size_);
        bytes += (made - free) * pool.size_;
    }
    return bytes;
}

ThreadBlockCaches::~ThreadBlockCaches() {
    for (size_t i = 0; i < kClasses; ++i) {
        if (caches[i].head != nullptr)
            BlockPool::ForSize((i + 1) * BlockPool::kGranule).Spill();
    }
    threadCachesGone = true;
}

} // namespace wbhw
