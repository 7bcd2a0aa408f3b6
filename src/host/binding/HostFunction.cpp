// The resolver. Any thread may resolve any function: entries are claimed with compare-and-exchange
// and filled without a lock, so two threads binding the same function for different runtime
// modules take different entries.
#include "host/binding/HostFunction.h"

#include "host/binding/FatalError.h"
#include "host/binding/RuntimeSelection.h"
#include "kern/osdep/DynamicModule.h"

#include <cstdio>

namespace qv::host::rt {

namespace {

constexpr const char kNoRuntimeMessage[] =
    "wirebenchv.lib was not called from a Wirebench process.";

void* Bind(HostFunctionSlot& slot, const char* name, void* module, uint64_t stamp) noexcept {
    void* const address = kern::osdep::ModuleExport(module, name);
    slot.address.store(address);
    slot.module.store(module);
    slot.stamp.store(stamp);
    return address;
}

// The first entry that decides answers: one already bound to this stamp or this module, or a free
// one we manage to claim. Null when none decides (or the module lacks the export).
void* WalkCache(HostFunction& function, void* module, uint64_t stamp) noexcept {
    for (HostFunctionSlot& slot : function.slots) {
        const uint64_t slotStamp = slot.stamp.load();
        if (slotStamp == stamp) {
            if (slot.module.load() == module) {
                return slot.address.load();
            }
            return Bind(slot, function.name, module, stamp);
        }
        if (slot.module.load() == module) {
            return Bind(slot, function.name, module, stamp);
        }
        uint64_t expected = 0;
        if (slot.stamp.compare_exchange_strong(expected, stamp)) {
            return Bind(slot, function.name, module, stamp);
        }
    }
    return nullptr;
}

// Takes over the entry of a module that has been unloaded since it was cached.
void* ReclaimUnloaded(HostFunction& function, void* module, uint64_t stamp) noexcept {
    for (HostFunctionSlot& slot : function.slots) {
        void* old = slot.module.load();
        if (old == module && slot.stamp.load() == stamp) {
            return slot.address.load();
        }
        if (old == nullptr || kern::osdep::IsModuleLoaded(old)) {
            continue;
        }
        if (slot.module.compare_exchange_strong(old, module)) {
            return Bind(slot, function.name, module, stamp);
        }
    }
    return nullptr;
}

void* ResolveIn(HostFunction& function, void* module) noexcept {
    const uint64_t stamp = kern::osdep::ModuleStamp(module);
    if (void* const address = WalkCache(function, module, stamp)) {
        return address;
    }
    if (void* const address = ReclaimUnloaded(function, module, stamp)) {
        return address;
    }
    return WalkCache(function, module, stamp);
}

} // namespace

void* TryResolve(HostFunction& function) noexcept {
    void* const module = CurrentRuntimeModule();
    return module != nullptr ? ResolveIn(function, module) : nullptr;
}

void* Resolve(HostFunction& function) {
    void* const module = CurrentRuntimeModule();
    if (module == nullptr) {
        FatalBindingError(kNoRuntimeMessage);
    }
    if (void* const address = ResolveIn(function, module)) {
        return address;
    }
    // The same fixed-size message buffer as ever: an overlong name is cut, never overrun.
    char message[256];
    std::snprintf(message, sizeof message,
                  "wirebenchv.lib was unable to locate a suitable location to resolve \"%s\". This "
                  "may happen when too many instances of Wirebench have been loaded into the same "
                  "process.",
                  function.name);
    FatalBindingError(message);
}

} // namespace qv::host::rt
