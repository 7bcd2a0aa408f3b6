// Task memory is the C heap on this platform.
#include "com/TaskMem.h"

#include <cstdlib>

void* CoTaskMemAlloc(size_t size) {
    // malloc(0) may answer null, which callers would take for an allocation failure.
    return std::malloc(size == 0 ? 1 : size);
}

void CoTaskMemFree(void* block) {
    std::free(block);
}
