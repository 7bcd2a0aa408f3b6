// Which host runtime module the bound host functions are resolved in, for the calling thread.
#pragma once

#include <cstdint>

namespace qv::host::rt {

// The thread-local index value that means "no thread-local runtime module".
inline constexpr uint32_t kNoRuntimeTlsIndex = 0xFFFFFFFFu;

// Names the host runtime module for every thread (null: none named).
void SetRuntimeModule(void* module) noexcept;
// Names a thread-local key (a pthread_key_t) whose per-thread value, when not null, is the
// runtime module of that thread; kNoRuntimeTlsIndex turns it off.
void SetRuntimeTlsIndex(uint32_t index) noexcept;

// The runtime module of the calling thread: the thread-local value, else the module named with
// SetRuntimeModule, else the main executable when it exports "gWBRTVersion" or "AZNewHandle",
// else a loaded "libwbrt.so", else a loaded "libwbffrt.so"; null when there is none.
void* CurrentRuntimeModule() noexcept;

} // namespace qv::host::rt
