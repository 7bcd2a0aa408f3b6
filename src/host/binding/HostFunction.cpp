// The resolver. Any thread may resolve any function: entries are claimed with compare-and-exchange
// and filled without a lock, so two threads binding the same function for different runtime
// modules take different entries.
#include "host/binding/HostFunction.h"

#include "host/binding/FatalError.h"
#include "host/binding/RuntimeSelection.h"
#include "kern/osdep/DynamicModule.h"

#include <cstdio>
#include <thread>

namespace qv::host::rt {

namespace {

constexpr const char kNoRuntimeMessage[] =
    "wirebenchv.lib was not called from a Wirebench process.";

// Rewrites of one entry are serialised, and readers retry while one is under way: two modules
// with one stamp share an entry and rebind it in turn, and a thread must never call one module's
// address believing it belongs to the other.
class SlotRewrite {
public:
    explicit SlotRewrite(HostFunctionSlot& slot) : slot_(slot) {
        for (;;) {
            uint32_t current = slot_.sequence.load();
            if ((current & 1) == 0 && slot_.sequence.compare_exchange_weak(current, current + 1)) {
                return;
            }
            std::this_thread::yield();
        }
    }
    ~SlotRewrite() { slot_.sequence.fetch_add(1); }
    SlotRewrite(const SlotRewrite&) = delete;
    SlotRewrite& operator=(const SlotRewrite&) = delete;

private:
    HostFunctionSlot& slot_;
};

using kern::osdep::ModuleIdentity;

struct SlotBinding {
    void* module;
    void* address;
    uintptr_t base;
};

// The module, address and load address of an entry as one consistent set.
SlotBinding ReadSlot(const HostFunctionSlot& slot) noexcept {
    for (;;) {
        const uint32_t before = slot.sequence.load();
        if ((before & 1) == 0) {
            const SlotBinding binding{slot.module.load(), slot.address.load(), slot.base.load()};
            if (slot.sequence.load() == before) {
                return binding;
            }
        }
        std::this_thread::yield();
    }
}

// Fills an entry the caller owns (under its rewrite guard) with MODULE.
void* Fill(HostFunctionSlot& slot, void* address, void* module,
           const ModuleIdentity& identity) noexcept {
    slot.address.store(address);
    slot.module.store(module);
    slot.base.store(identity.base);
    slot.stamp.store(identity.stamp);
    return address;
}

void* Bind(HostFunctionSlot& slot, const char* name, void* module,
           const ModuleIdentity& identity) noexcept {
    // The lookup runs before the entry is taken: it may be slow, and readers wait meanwhile.
    void* const address = kern::osdep::ModuleExport(module, name);
    const SlotRewrite rewrite(slot);
    return Fill(slot, address, module, identity);
}

// True when the entry (read as BINDING) is bound to this very load of MODULE.
bool BindsLoad(const HostFunctionSlot& slot, const SlotBinding& binding, void* module,
               const ModuleIdentity& identity) noexcept {
    return binding.module == module && binding.base == identity.base &&
           slot.stamp.load() == identity.stamp;
}

// True when the entry's module is gone, or its handle now names another load (a handle is handed
// out again after a dlclose): nobody can use the entry as it stands.
bool IsStale(const HostFunctionSlot& slot, const SlotBinding& binding) noexcept {
    if (!kern::osdep::IsModuleLoaded(binding.module))
        return true;
    return kern::osdep::IdentifyModule(binding.module) !=
           ModuleIdentity{slot.stamp.load(), binding.base};
}

// The first entry that decides answers: one already bound to this stamp or this module, or a free
// one we manage to claim. Null when none decides (or the module lacks the export).
void* WalkCache(HostFunction& function, void* module, const ModuleIdentity& identity) noexcept {
    for (HostFunctionSlot& slot : function.slots) {
        const uint64_t slotStamp = slot.stamp.load();
        if (slotStamp == identity.stamp) {
            const SlotBinding binding = ReadSlot(slot);
            if (binding.module == module && binding.base == identity.base) {
                return binding.address;
            }
            return Bind(slot, function.name, module, identity);
        }
        if (slot.module.load() == module) {
            return Bind(slot, function.name, module, identity);
        }
        uint64_t expected = 0;
        if (slot.stamp.compare_exchange_strong(expected, identity.stamp)) {
            return Bind(slot, function.name, module, identity);
        }
    }
    return nullptr;
}

// Takes over the entry of a module that has been unloaded since it was cached (or whose handle
// now names another load).
void* ReclaimUnloaded(HostFunction& function, void* module,
                      const ModuleIdentity& identity) noexcept {
    for (HostFunctionSlot& slot : function.slots) {
        const SlotBinding binding = ReadSlot(slot);
        void* const old = binding.module;
        if (BindsLoad(slot, binding, module, identity)) {
            return binding.address;
        }
        if (old == nullptr || !IsStale(slot, binding)) {
            continue;
        }
        // Claimed only if the entry still holds the unloaded module once we own it; taking it
        // under the rewrite guard keeps readers from pairing our module with the old address.
        void* const address = kern::osdep::ModuleExport(module, function.name);
        const SlotRewrite rewrite(slot);
        if (slot.module.load() != old || slot.base.load() != binding.base) {
            continue;
        }
        return Fill(slot, address, module, identity);
    }
    return nullptr;
}

// One look for an entry: a free or matching one, else one whose module has gone.
void* ResolveOnce(HostFunction& function, void* module, const ModuleIdentity& identity) noexcept {
    if (void* const address = WalkCache(function, module, identity)) {
        return address;
    }
    if (void* const address = ReclaimUnloaded(function, module, identity)) {
        return address;
    }
    return WalkCache(function, module, identity);
}

// True when an entry is bound to this very load of MODULE.
bool HoldsModule(const HostFunction& function, void* module,
                 const ModuleIdentity& identity) noexcept {
    for (const HostFunctionSlot& slot : function.slots) {
        if (BindsLoad(slot, ReadSlot(slot), module, identity)) {
            return true;
        }
    }
    return false;
}

// A look judges each entry at its own moment: while other threads load and unload modules, every
// entry can hold a live module when it is looked at and yet one of them be gone a moment later.
// A miss is therefore looked at again a few times before the cache counts as full, so that a
// process never ends for want of an entry that was free all along.
constexpr int kResolveAttempts = 16;

void* ResolveIn(HostFunction& function, void* module) noexcept {
    const ModuleIdentity identity = kern::osdep::IdentifyModule(module);
    for (int attempt = 0; attempt < kResolveAttempts; ++attempt) {
        if (void* const address = ResolveOnce(function, module, identity)) {
            return address;
        }
        if (HoldsModule(function, module, identity)) {
            return nullptr; // an entry answers: the module lacks the export
        }
        std::this_thread::yield();
    }
    return nullptr;
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
