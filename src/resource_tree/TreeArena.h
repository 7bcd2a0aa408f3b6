// The memory of one resource tree's entries, and the allocator that hands it out.
#pragma once

#include <array>
#include <cstddef>
#include <memory>
#include <vector>

// Under the address sanitizer every entry keeps its own heap block, so that a use after removal
// is still caught.
#if defined(__SANITIZE_ADDRESS__)
#define WBT_TREE_ARENA_BYPASS 1
#elif defined(__has_feature)
#if __has_feature(address_sanitizer)
#define WBT_TREE_ARENA_BYPASS 1
#endif
#endif
#ifndef WBT_TREE_ARENA_BYPASS
#define WBT_TREE_ARENA_BYPASS 0
#endif

namespace wbhw {

// A load makes an entry for nearly every element; a comparison then walks both trees and frees
// them. Taken from the general heap or from a pool shared by every tree, the entries of one tree
// lay wherever the last teardown had left free blocks, and every step of a walk or a teardown
// waited for memory. Here a tree's entries and child nodes come from slabs of its own, one after
// another in the order the load makes them (slabs double from 1 KB to 64 KB, so a small tree stays
// small), and go back all at once with the tree. An entry removed earlier leaves its block for the
// next entry of that size, so a tree edited for a long time holds no more blocks than it ever had
// entries at once. Under the address sanitizer every block is a heap block of its own, so a use
// after removal is caught. One thread uses a tree, and so its arena, at a time.
class TreeArena {
public:
    static constexpr size_t kGranule = 16;
    static constexpr size_t kMaxBlock = 256;

    TreeArena() = default;
    TreeArena(const TreeArena&) = delete;
    TreeArena& operator=(const TreeArena&) = delete;

    // A block of SIZE bytes (1 to kMaxBlock), aligned to kGranule; throws std::bad_alloc.
    void* Allocate(size_t size);
    // Gives back BLOCK of SIZE bytes (from Allocate); once Close was called, does nothing.
    void Release(void* block, size_t size) noexcept;
    // The tree is being torn down: its blocks all go with the arena, none is kept for reuse.
    void Close() noexcept { closed_ = true; }
    // Asks the processor for BYTES of memory from START on, which a reader is about to need;
    // touches nothing, so any address will do.
    static void Prefetch(const void* start, size_t bytes) noexcept;
    // Bytes of the slabs. For measurements.
    size_t SlabBytes() const noexcept { return slabBytes_; }

private:
    struct FreeBlock {
        FreeBlock* next;
    };
    static size_t Rounded(size_t size) noexcept { return (size + kGranule - 1) & ~(kGranule - 1); }
    void NewSlab(size_t atLeast);

    std::vector<std::unique_ptr<std::byte[]>> slabs_;
    std::byte* next_ = nullptr;
    size_t left_ = 0;
    size_t slabBytes_ = 0;
    std::array<FreeBlock*, kMaxBlock / kGranule> free_{};
    bool closed_ = false;
};

// A standard allocator over a TreeArena for node-based containers (one element at a time);
// other requests go to the general heap. Allocators of the same arena are equal.
template <class T> class ArenaAllocator {
public:
    using value_type = T;

    explicit ArenaAllocator(TreeArena* arena) noexcept : arena_(arena) {}
    template <class U>
    ArenaAllocator(const ArenaAllocator<U>& other) noexcept : arena_(other.arena()) {}

    T* allocate(size_t n) {
        if (Pooled(n))
            return static_cast<T*>(arena_->Allocate(sizeof(T)));
        return std::allocator<T>().allocate(n);
    }
    void deallocate(T* p, size_t n) noexcept {
        if (Pooled(n))
            arena_->Release(p, sizeof(T));
        else
            std::allocator<T>().deallocate(p, n);
    }
    TreeArena* arena() const noexcept { return arena_; }
    template <class U> bool operator==(const ArenaAllocator<U>& other) const noexcept {
        return arena_ == other.arena();
    }

private:
    static constexpr bool Pooled(size_t n) noexcept {
        return !WBT_TREE_ARENA_BYPASS && n == 1 && sizeof(T) <= TreeArena::kMaxBlock &&
               alignof(T) <= TreeArena::kGranule;
    }
    TreeArena* arena_;
};

} // namespace wbhw
