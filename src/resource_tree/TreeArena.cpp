// Blocks of one tree, carved from slabs that double in size.
#include "resource_tree/TreeArena.h"

#include <algorithm>
#include <cstdint>

namespace wbhw {
namespace {

constexpr size_t kFirstSlab = 1024;
constexpr size_t kLargestSlab = 64 * 1024;

} // namespace

void* TreeArena::Allocate(size_t size) {
    const size_t rounded = Rounded(size);
    FreeBlock*& reusable = free_[rounded / kGranule - 1];
    if (reusable != nullptr) {
        FreeBlock* const block = reusable;
        reusable = block->next;
        return block;
    }
    if (left_ < rounded)
        NewSlab(rounded);
    void* const block = next_;
    next_ += rounded;
    left_ -= rounded;
    return block;
}

void TreeArena::Release(void* block, size_t size) noexcept {
    if (closed_ || block == nullptr)
        return;
    FreeBlock*& reusable = free_[Rounded(size) / kGranule - 1];
    reusable = new (block) FreeBlock{reusable};
}

void TreeArena::Prefetch(const void* start, size_t bytes) noexcept {
    constexpr size_t kLine = 64;
    // Integer arithmetic, since the range may run past the object START points into.
    const auto first = reinterpret_cast<uintptr_t>(start);
    for (size_t offset = 0; offset < bytes; offset += kLine)
        __builtin_prefetch(reinterpret_cast<const void*>(first + offset));
}

void TreeArena::NewSlab(size_t atLeast) {
    const size_t size =
        std::max(atLeast, slabs_.empty() ? kFirstSlab : std::min(2 * slabBytes_, kLargestSlab));
    // new[] of bytes is aligned for any fundamental type, which covers the granule.
    slabs_.push_back(std::make_unique_for_overwrite<std::byte[]>(size));
    next_ = slabs_.back().get();
    left_ = size;
    slabBytes_ += size;
}

} // namespace wbhw
