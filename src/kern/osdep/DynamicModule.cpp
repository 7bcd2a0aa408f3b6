// Loaded modules through the dynamic linker. On glibc a module handle is the module's link_map,
// which is what lets us compare handles against the live list without touching freed memory.
#include "kern/osdep/DynamicModule.h"

#include <cstring>
#include <dlfcn.h>
#include <elf.h>
#include <link.h>
#include <utility>

namespace qv::kern::osdep {

DynamicModule::DynamicModule(const std::string& path) {
    handle_ = dlopen(path.c_str(), RTLD_NOW | RTLD_LOCAL);
    if (handle_ == nullptr) {
        const char* text = dlerror();
        error_ = text != nullptr ? text : "cannot load module";
    }
}

DynamicModule DynamicModule::OpenMain() {
    DynamicModule main;
    main.handle_ = dlopen(nullptr, RTLD_LAZY);
    return main;
}

DynamicModule::DynamicModule(DynamicModule&& other) noexcept
    : handle_(std::exchange(other.handle_, nullptr)), error_(std::move(other.error_)) {}

DynamicModule& DynamicModule::operator=(DynamicModule&& other) noexcept {
    if (this != &other) {
        Reset();
        handle_ = std::exchange(other.handle_, nullptr);
        error_ = std::move(other.error_);
    }
    return *this;
}

DynamicModule::~DynamicModule() {
    Reset();
}

void DynamicModule::Reset() noexcept {
    if (handle_ != nullptr) {
        dlclose(handle_);
        handle_ = nullptr;
    }
}

void* MainModule() noexcept {
    static void* const main = dlopen(nullptr, RTLD_LAZY);
    return main;
}

void* LoadedModule(const char* name) noexcept {
    if (name == nullptr) {
        return nullptr;
    }
    void* const handle = dlopen(name, RTLD_LAZY | RTLD_NOLOAD);
    if (handle != nullptr) {
        // RTLD_NOLOAD still counts a reference; give it back, whoever loaded the module keeps it.
        dlclose(handle);
    }
    return handle;
}

namespace {

const link_map* MainLinkMap() noexcept {
    static const link_map* const map = [] {
        link_map* found = nullptr;
        if (MainModule() == nullptr || dlinfo(MainModule(), RTLD_DI_LINKMAP, &found) != 0) {
            return static_cast<link_map*>(nullptr);
        }
        return found;
    }();
    return map;
}

// The state of one walk over the loaded modules. The walk runs inside dl_iterate_phdr, which
// holds the loader's lock, so no module can go away while we read the list or its notes.
struct ModuleProbe {
    const void* handle = nullptr;
    const link_map* main = nullptr;
    bool wantStamp = false;
    bool searched = false;
    bool loaded = false;
    ElfW(Addr) base = 0;
    const char* name = nullptr;
    uint32_t buildId = 0;
};

uint32_t BuildIdPrefix(const dl_phdr_info& info) noexcept {
    for (ElfW(Half) i = 0; i < info.dlpi_phnum; ++i) {
        const ElfW(Phdr)& ph = info.dlpi_phdr[i];
        if (ph.p_type != PT_NOTE) {
            continue;
        }
        const size_t align = ph.p_align == 8 ? 8 : 4;
        const auto* p = reinterpret_cast<const unsigned char*>(info.dlpi_addr + ph.p_vaddr);
        const auto* const end = p + ph.p_memsz;
        while (p + sizeof(ElfW(Nhdr)) <= end) {
            ElfW(Nhdr) note;
            std::memcpy(&note, p, sizeof note);
            const size_t nameSize = (note.n_namesz + align - 1) & ~(align - 1);
            const size_t descSize = (note.n_descsz + align - 1) & ~(align - 1);
            const unsigned char* const name = p + sizeof note;
            const unsigned char* const desc = name + nameSize;
            if (desc + descSize > end || desc < name) {
                break;
            }
            if (note.n_type == NT_GNU_BUILD_ID && note.n_namesz == 4 &&
                std::memcmp(name, "GNU", 4) == 0 && note.n_descsz >= 4) {
                uint32_t prefix = 0;
                std::memcpy(&prefix, desc, sizeof prefix);
                return prefix;
            }
            p = desc + descSize;
        }
    }
    return 0;
}

int VisitModule(dl_phdr_info* info, size_t, void* data) {
    auto& probe = *static_cast<ModuleProbe*>(data);
    if (!probe.searched) {
        probe.searched = true;
        for (const link_map* map = probe.main; map != nullptr; map = map->l_next) {
            if (map == probe.handle) {
                probe.loaded = true;
                probe.base = map->l_addr;
                probe.name = map->l_name;
                break;
            }
        }
        if (!probe.loaded || !probe.wantStamp) {
            return 1;
        }
    }
    // dl_iterate_phdr reports each object with its link_map's base and name pointer.
    if (info->dlpi_addr == probe.base && info->dlpi_name == probe.name) {
        probe.buildId = BuildIdPrefix(*info);
        return 1;
    }
    return 0;
}

ModuleProbe Probe(const void* handle, bool wantStamp) noexcept {
    ModuleProbe probe;
    probe.handle = handle;
    probe.main = MainLinkMap();
    probe.wantStamp = wantStamp;
    if (handle != nullptr && probe.main != nullptr) {
        dl_iterate_phdr(VisitModule, &probe);
    }
    return probe;
}

} // namespace

bool IsModuleLoaded(const void* handle) noexcept {
    return Probe(handle, false).loaded;
}

ModuleIdentity IdentifyModule(const void* handle) noexcept {
    auto identify = [](const void* module) {
        const ModuleProbe probe = Probe(module, true);
        return ModuleIdentity{probe.buildId != 0 ? probe.buildId : 1u,
                              probe.loaded ? static_cast<uintptr_t>(probe.base) : 0u};
    };
    // The executable never goes away, so it cannot change: the common case of a host that is
    // itself the runtime skips the walk.
    static const ModuleIdentity main = identify(MainModule());
    return handle == MainModule() ? main : identify(handle);
}

uint64_t ModuleStamp(const void* handle) noexcept {
    return IdentifyModule(handle).stamp;
}

void* ModuleExport(void* handle, const char* name) noexcept {
    if (handle == nullptr || name == nullptr) {
        return nullptr;
    }
    void* const address = dlsym(handle, name);
    if (address == nullptr) {
        return nullptr;
    }
    // dlsym also searches the module's dependencies (and, for the main executable, every global
    // module); only the module's own definition counts as its export.
    Dl_info info;
    link_map* owner = nullptr;
    if (dladdr1(address, &info, reinterpret_cast<void**>(&owner), RTLD_DL_LINKMAP) == 0) {
        return nullptr;
    }
    return owner == handle ? address : nullptr;
}

} // namespace qv::kern::osdep
