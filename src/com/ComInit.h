// Per-thread COM initialisation. Nothing needs starting on this platform; the count is kept so
// that balanced and unbalanced use behave as callers expect.
#pragma once

#include "com/HResult.h"

#include <cstdint>

// Counts one initialisation on the calling thread: S_OK for the first, S_FALSE for the next
// ones. The argument is reserved and ignored.
HRESULT CoInitialize(void* reserved);
// Undoes one initialisation of the calling thread; an unbalanced call does nothing.
void CoUninitialize();

namespace qv::com {
// Number of initialisations of the calling thread not yet undone.
uint32_t CoInitializeCount();
} // namespace qv::com
