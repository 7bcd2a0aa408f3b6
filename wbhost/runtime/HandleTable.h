// The host's relocatable memory blocks. A handle points at the block's master pointer, which is
// the only thing that changes when the data moves.
#pragma once

#include "host/binding/runtime_api.h"

#include <cstddef>
#include <memory>
#include <mutex>
#include <unordered_map>

namespace wbhost::runtime {

class HandleTable {
public:
    // Blocks larger than this are refused as out of memory, like any allocation that fails.
    static constexpr size_t kMaxBlockSize = 0x7FFFFFFF;

    // The table of this process.
    static HandleTable& Instance();

    // A new block of `size` bytes, zero-filled when `clear` is set, else filled with a marker
    // byte (so callers that assume zeros are caught). Null when it cannot be allocated.
    WBHandle Allocate(size_t size, bool clear);
    // Resizes a live block. Whenever the size changes the data moves to a new place; the first
    // min(old, new) bytes are kept and added bytes are zero (`clear`) or the marker byte.
    // kWBArgErr for an unknown handle, kWBMemFullErr when the new block cannot be allocated.
    WBErr Resize(WBHandle handle, size_t size, bool clear);
    // Releases a live block; kWBArgErr for a null or unknown handle.
    WBErr Dispose(WBHandle handle);
    // The size of a live block, 0 for a null or unknown handle.
    size_t SizeOf(WBHandle handle) const;
    // Whether `handle` is a live block of this table.
    bool IsLive(WBHandle handle) const;
    // Whether the SIZE bytes at ADDRESS lie inside the data of one live block.
    bool Contains(const void* address, size_t size) const;
    // The number of live blocks (to find blocks that were never released).
    size_t LiveCount() const;

private:
    struct Block {
        void* data = nullptr; // the master pointer: a handle is its address
        std::unique_ptr<std::byte[]> storage;
        size_t size = 0;
    };

    mutable std::mutex lock_;
    std::unordered_map<WBHandle, std::unique_ptr<Block>> blocks_;
};

} // namespace wbhost::runtime
