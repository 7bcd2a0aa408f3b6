// Loaded modules (shared objects and the main executable) as the dynamic linker sees them: an
// owning handle, lookups that never take a reference, exports and the module stamp.
#pragma once

#include <cstdint>
#include <string>

namespace qv::kern::osdep {

// An owned reference to a loaded module, released (dlclose) on destruction. Empty when loading
// failed; error() then holds the dynamic linker's text.
class DynamicModule {
public:
    DynamicModule() = default;
    // Loads `path` (a file path, or a bare name searched the usual way); empty on failure.
    explicit DynamicModule(const std::string& path);
    // A reference to the main executable (which is never unloaded).
    static DynamicModule OpenMain();
    DynamicModule(DynamicModule&& other) noexcept;
    DynamicModule& operator=(DynamicModule&& other) noexcept;
    DynamicModule(const DynamicModule&) = delete;
    DynamicModule& operator=(const DynamicModule&) = delete;
    ~DynamicModule();

    // The handle, null when empty.
    void* handle() const noexcept { return handle_; }
    explicit operator bool() const noexcept { return handle_ != nullptr; }
    // The dynamic linker's text for a failed load, empty otherwise.
    const std::string& error() const noexcept { return error_; }
    // Releases the reference now; afterwards the object is empty.
    void Reset() noexcept;

private:
    void* handle_ = nullptr;
    std::string error_;
};

// The main executable's handle. No reference is kept: the executable is never unloaded.
void* MainModule() noexcept;

// The handle of a module already loaded under `name` (its file name, path or soname), or null
// when none is; never loads anything and leaves the reference count as it was.
void* LoadedModule(const char* name) noexcept;

// Whether `handle` is still in the dynamic linker's list of loaded modules. A handle that was
// closed answers false; the handle is compared, never dereferenced. Null answers false.
bool IsModuleLoaded(const void* handle) noexcept;

// The module's stamp: the first 32 bits of its GNU build-id note, or 1 when it has none, the
// note reads 0, or the handle is not a loaded module. Never 0, so 0 can mean "no module".
uint64_t ModuleStamp(const void* handle) noexcept;

// Where a loaded module is: its stamp and the address it was loaded at (0 when the handle is not a
// loaded module). A handle that was closed may be handed out again by a later load, of the same
// file at another address or of another file: the pair tells such a load from the earlier one.
struct ModuleIdentity {
    uint64_t stamp = 1;
    uintptr_t base = 0;
    bool operator==(const ModuleIdentity&) const = default;
};
ModuleIdentity IdentifyModule(const void* handle) noexcept;

// The address of the export `name` defined by the module itself (not by one of its dependencies
// or by another global module), or null when it has none. `handle` must be loaded.
void* ModuleExport(void* handle, const char* name) noexcept;

} // namespace qv::kern::osdep
