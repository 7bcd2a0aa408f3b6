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

// The address of the export `name` defined by the module itself (not by one of its dependencies
// or by another global module), or null when it has none. `handle` must be loaded.
void* ModuleExport(void* handle, const char* name) noexcept;

} // namespace qv::kern::osdep
