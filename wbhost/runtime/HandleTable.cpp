// Host memory blocks. Every handle the host hands out is recorded, so a bad handle from a module
// gets a host error code instead of corrupting memory.
#include "runtime/HandleTable.h"

#include <algorithm>
#include <cstdint>
#include <cstring>
#include <new>

namespace wbhost::runtime {

namespace {

constexpr std::byte kMarker{0xA5};

std::unique_ptr<std::byte[]> NewStorage(size_t size) {
    if (size > HandleTable::kMaxBlockSize) {
        return nullptr;
    }
    try {
        // At least one byte, so every live block has a distinct, non-null data pointer.
        return std::make_unique_for_overwrite<std::byte[]>(std::max<size_t>(size, 1));
    } catch (const std::bad_alloc&) {
        return nullptr;
    }
}

void Fill(std::byte* from, size_t count, bool clear) {
    std::fill_n(from, count, clear ? std::byte{0} : kMarker);
}

} // namespace

HandleTable& HandleTable::Instance() {
    static HandleTable table;
    return table;
}

WBHandle HandleTable::Allocate(size_t size, bool clear) {
    auto block = std::make_unique<Block>();
    block->storage = NewStorage(size);
    if (!block->storage) {
        return nullptr;
    }
    Fill(block->storage.get(), size, clear);
    block->size = size;
    block->data = block->storage.get();
    WBHandle handle = &block->data;
    const std::lock_guard guard(lock_);
    blocks_.emplace(handle, std::move(block));
    return handle;
}

WBErr HandleTable::Resize(WBHandle handle, size_t size, bool clear) {
    const std::lock_guard guard(lock_);
    const auto it = blocks_.find(handle);
    if (it == blocks_.end()) {
        return kWBArgErr;
    }
    Block& block = *it->second;
    if (size == block.size) {
        return kWBNoErr;
    }
    auto storage = NewStorage(size);
    if (!storage) {
        return kWBMemFullErr;
    }
    const size_t kept = std::min(size, block.size);
    std::memcpy(storage.get(), block.storage.get(), kept);
    Fill(storage.get() + kept, size - kept, clear);
    block.storage = std::move(storage);
    block.size = size;
    block.data = block.storage.get();
    return kWBNoErr;
}

WBErr HandleTable::Dispose(WBHandle handle) {
    std::unique_ptr<Block> released;
    const std::lock_guard guard(lock_);
    const auto it = blocks_.find(handle);
    if (it == blocks_.end()) {
        return kWBArgErr;
    }
    released = std::move(it->second);
    blocks_.erase(it);
    return kWBNoErr;
}

size_t HandleTable::SizeOf(WBHandle handle) const {
    const std::lock_guard guard(lock_);
    const auto it = blocks_.find(handle);
    return it == blocks_.end() ? 0 : it->second->size;
}

bool HandleTable::IsLive(WBHandle handle) const {
    const std::lock_guard guard(lock_);
    return blocks_.count(handle) != 0;
}

bool HandleTable::Contains(const void* address, size_t size) const {
    const auto start = reinterpret_cast<uintptr_t>(address);
    const std::lock_guard guard(lock_);
    for (const auto& [handle, block] : blocks_) {
        const auto data = reinterpret_cast<uintptr_t>(block->data);
        if (start >= data && block->size >= size && start - data <= block->size - size) {
            return true;
        }
    }
    return false;
}

size_t HandleTable::LiveCount() const {
    const std::lock_guard guard(lock_);
    return blocks_.size();
}

} // namespace wbhost::runtime
