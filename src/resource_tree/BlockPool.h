// Fixed-size blocks for the entries of resource-tree nodes, and the allocator that hands them out.
#pragma once

#include <cstddef>
#include <memory>

// Under the address sanitizer every entry keeps its own heap block, so that a use after removal
// is still caught.
#if defined(__SANITIZE_ADDRESS__)
#define WBT_BLOCK_POOL_BYPASS 1
#elif defined(__has_feature)
#if __has_feature(address_sanitizer)
#define WBT_BLOCK_POOL_BYPASS 1
#endif
#endif
#ifndef WBT_BLOCK_POOL_BYPASS
#define WBT_BLOCK_POOL_BYPASS 0
#endif

namespace wbhw {

// Blocks of one size, carved from 64 KB slabs. A load makes an entry for nearly every element,
// and a tree of a large document frees them all at once; from the general heap those blocks are
// scattered, and the allocator merges every one of them again at the next large request, inside
// the next load. Here a block is a pointer pop, blocks made together lie together, and freed ones
// wait for reuse. Each thread keeps a cache of free blocks and trades whole lists with a shared
// depot under a lock; a block may be freed on any thread. Slabs are kept for the life of the
// process: a pool holds as many blocks as were ever in use at once.
class BlockPool {
public:
    static constexpr size_t kGranule = 16;
    static constexpr size_t kMaxBlock = 256;

    // The pool for blocks of SIZE bytes (1 to kMaxBlock); pools live for the whole process.
    static BlockPool& ForSize(size_t size);

    // A block of the pool's size, aligned to 16 bytes; throws std::bad_alloc when out of memory.
    void* Allocate();
    // Gives BLOCK (from Allocate of this pool) back; null is ignored.
    void Release(void* block) noexcept;
    // The size of this pool's blocks.
    size_t BlockSize() const noexcept { return size_; }
    // Bytes of blocks of every pool handed out and not given back; blocks that other threads
    // keep cached count as handed out. For measurements.
    static size_t BytesInUse() noexcept;

    BlockPool(const BlockPool&) = delete;
    BlockPool& operator=(const BlockPool&) = delete;

private:
    struct Depot;
    BlockPool(size_t size, size_t index);
    // Fills this thread's empty cache with the depot's blocks, or a new slab when it has none.
    void Refill();
    // Hands every block of this thread's cache to the depot.
    void Spill() noexcept;

    size_t size_;
    size_t index_;
    Depot* depot_;
    friend struct ThreadBlockCaches;
};

// A standard allocator over BlockPool for containers of single elements (node-based containers
// allocate one node at a time); other requests go to the general heap. All instances are equal.
template <class T> class PoolAllocator {
public:
    using value_type = T;

    PoolAllocator() noexcept = default;
    template <class U> PoolAllocator(const PoolAllocator<U>&) noexcept {}

    T* allocate(size_t n) {
        if (Pooled(n))
            return static_cast<T*>(BlockPool::ForSize(sizeof(T)).Allocate());
        return std::allocator<T>().allocate(n);
    }
    void deallocate(T* p, size_t n) noexcept {
        if (Pooled(n))
            BlockPool::ForSize(sizeof(T)).Release(p);
        else
            std::allocator<T>().deallocate(p, n);
    }
    template <class U> bool operator==(const PoolAllocator<U>&) const noexcept { return true; }

private:
    static constexpr bool Pooled(size_t n) noexcept {
        return !WBT_BLOCK_POOL_BYPASS && n == 1 && sizeof(T) <= BlockPool::kMaxBlock &&
               alignof(T) <= BlockPool::kGranule;
    }
};

} // namespace wbhw
