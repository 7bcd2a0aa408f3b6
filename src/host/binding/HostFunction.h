// A host runtime function bound by name on first call, with its address cached per runtime module.
#pragma once

#include <atomic>
#include <cstddef>
#include <cstdint>

namespace qv::host::rt {

// One cache entry: a runtime module, its stamp, where it was loaded and the function's address in
// it. A stamp of 0 marks a free entry. `sequence` is odd while the entry is being rewritten, so
// that a reader never pairs one module with another module's address.
struct HostFunctionSlot {
    std::atomic<void*> module{nullptr};
    std::atomic<uint64_t> stamp{0};
    std::atomic<void*> address{nullptr};
    std::atomic<uint32_t> sequence{0};
    // The module's load address: a handle handed out again after a dlclose names a new load.
    std::atomic<uintptr_t> base{0};
};

// The descriptor of one bound host function: eight cache entries (one per runtime module seen)
// and the export name. Descriptors live for the whole process and are constant-initialised.
struct HostFunction {
    static constexpr size_t kSlotCount = 8;

    constexpr explicit HostFunction(const char* exportName) noexcept : name(exportName) {}
    HostFunction(const HostFunction&) = delete;
    HostFunction& operator=(const HostFunction&) = delete;

    HostFunctionSlot slots[kSlotCount];
    const char* const name;
};

// The address of `function` in the calling thread's runtime module. Never null: when there is no
// runtime module, or no cache entry can be used, or the module lacks the export, the process ends
// through the fatal error hook.
void* Resolve(HostFunction& function);

// The same resolution without the fatal path: null when there is no runtime module, no entry can
// be used or the module lacks the export.
void* TryResolve(HostFunction& function) noexcept;

} // namespace qv::host::rt
