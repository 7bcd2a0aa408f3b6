// Memory for arrays handed across interfaces: the receiver frees it with CoTaskMemFree.
#pragma once

#include <cstddef>

// Allocates SIZE bytes (a zero size still gives a freeable block); null when out of memory.
void* CoTaskMemAlloc(size_t size);
// Releases a block from CoTaskMemAlloc; null is ignored.
void CoTaskMemFree(void* block);
