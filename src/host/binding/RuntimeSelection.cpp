// The runtime module of the calling thread, found afresh on each call: hosts may switch modules
// (or threads may carry their own) at any time, so nothing here is cached.
#include "host/binding/RuntimeSelection.h"

#include "kern/osdep/DynamicModule.h"

#include <atomic>
#include <pthread.h>

namespace qv::host::rt {

namespace {

std::atomic<void*> runtimeModule{nullptr};
std::atomic<uint32_t> runtimeTlsIndex{kNoRuntimeTlsIndex};

// The executable is never unloaded and its own exports never change, so this is decided once.
void* MainModuleIfRuntime() noexcept {
    static void* const runtime = [] {
        void* const main = kern::osdep::MainModule();
        const bool exports = kern::osdep::ModuleExport(main, "gWBRTVersion") != nullptr ||
                             kern::osdep::ModuleExport(main, "AZNewHandle") != nullptr;
        return exports ? main : nullptr;
    }();
    return runtime;
}

} // namespace

void SetRuntimeModule(void* module) noexcept {
    runtimeModule.store(module);
}

void SetRuntimeTlsIndex(uint32_t index) noexcept {
    runtimeTlsIndex.store(index);
}

void* CurrentRuntimeModule() noexcept {
    const uint32_t index = runtimeTlsIndex.load();
    if (index != kNoRuntimeTlsIndex) {
        if (void* const module = pthread_getspecific(static_cast<pthread_key_t>(index))) {
            return module;
        }
    }
    if (void* const module = runtimeModule.load()) {
        return module;
    }
    if (void* const module = MainModuleIfRuntime()) {
        return module;
    }
    if (void* const module = kern::osdep::LoadedModule("libwbrt.so")) {
        return module;
    }
    return kern::osdep::LoadedModule("libwbffrt.so");
}

} // namespace qv::host::rt
