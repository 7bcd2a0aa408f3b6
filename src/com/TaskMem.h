// Memory for arrays handed across interfaces: the receiver frees it with CoTaskMemFree.
#pragma once

#include "com/HResult.h"

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <limits>
#include <type_traits>
#include <vector>

// Allocates SIZE bytes (a zero size still gives a freeable block); null when out of memory.
void* CoTaskMemAlloc(size_t size);
// Releases a block from CoTaskMemAlloc; null is ignored.
void CoTaskMemFree(void* block);

namespace qv::com {

// Copies ITEMS into a new CoTaskMemAlloc array for an out-parameter pair: *out is null when
// ITEMS is empty. E_POINTER for null outputs, E_OUTOFMEMORY when the block cannot be had.
template <class T> HRESULT CopyToTaskMem(const std::vector<T>& items, T** out, uint32_t* count) {
    static_assert(std::is_trivially_copyable_v<T>, "only plain records cross interfaces");
    if (!out || !count) {
        return E_POINTER;
    }
    *out = nullptr;
    *count = 0;
    if (items.empty()) {
        return S_OK;
    }
    if (items.size() > std::numeric_limits<uint32_t>::max() / sizeof(T)) {
        return E_OUTOFMEMORY;
    }
    auto* block = static_cast<T*>(CoTaskMemAlloc(items.size() * sizeof(T)));
    if (!block) {
        return E_OUTOFMEMORY;
    }
    std::memcpy(static_cast<void*>(block), items.data(), items.size() * sizeof(T));
    *out = block;
    *count = static_cast<uint32_t>(items.size());
    return S_OK;
}

} // namespace qv::com
