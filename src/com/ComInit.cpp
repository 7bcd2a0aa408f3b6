// Per-thread initialisation counts.
#include "com/ComInit.h"

namespace {
thread_local uint32_t initCount = 0;
}

HRESULT CoInitialize(void*) {
    return initCount++ == 0 ? S_OK : S_FALSE;
}

void CoUninitialize() {
    // A count below zero would make the next CoInitialize look like a repeat.
    if (initCount > 0) {
        --initCount;
    }
}

namespace qv::com {
uint32_t CoInitializeCount() {
    return initCount;
}
} // namespace qv::com
