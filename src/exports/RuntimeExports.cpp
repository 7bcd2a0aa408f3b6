// The exports through which a host names its runtime module for the binding.
#include "exports/Export.h"
#include "host/binding/RuntimeSelection.h"

#include <cstdint>

// Called after the runtime selection changes. Hosts may interpose on these names; here they do
// nothing, and both names share one body.
WBT_EXPORT void SetWBRTModuleHook(void) {}
WBT_EXPORT void SetWBRTTLSIndexHook(void) __attribute__((alias("SetWBRTModuleHook")));

// Names the host runtime module used by every thread (null: none).
WBT_EXPORT void SetWBRTModule(void* module) {
    qv::host::rt::SetRuntimeModule(module);
    SetWBRTModuleHook();
}

// Names the thread-local key (a pthread_key_t) whose per-thread value, when not null, is the
// calling thread's runtime module; 0xFFFFFFFF means none.
WBT_EXPORT void SetWBRTTLSIndex(uint32_t index) {
    qv::host::rt::SetRuntimeTlsIndex(index);
    SetWBRTModuleHook();
}
