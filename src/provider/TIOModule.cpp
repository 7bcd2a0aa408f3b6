// The module's own handle, found from the address of a function inside it.
#include "provider/TIOModule.h"

#include "kern/osdep/DynamicModule.h"

#include <dlfcn.h>

namespace tio {

static void* FindOwnModule() {
    Dl_info info{};
    if (dladdr(reinterpret_cast<void*>(&FindOwnModule), &info) == 0 || !info.dli_fname) {
        return nullptr;
    }
    return qv::kern::osdep::LoadedModule(info.dli_fname);
}

void* ModuleInstance() {
    static void* const instance = FindOwnModule();
    return instance;
}

} // namespace tio
