// The plug-in module as this host loads it.
#include "cli/HostedModule.h"

#include <dlfcn.h>

namespace wbhost::cli {

HostedModule::HostedModule(const std::string& path) {
    // RTLD_LOCAL: the module's own copies of the libraries it shares names with stay its own.
    // RTLD_NODELETE: a host keeps its plug-ins mapped for the life of the process, and the
    // process-wide caches of the libraries a module brings are meant to live that long.
    handle_ = dlopen(path.c_str(), RTLD_NOW | RTLD_LOCAL | RTLD_NODELETE);
    if (handle_ == nullptr) {
        const char* why = dlerror();
        error_ = why != nullptr ? why : "the module could not be loaded: " + path;
    }
}

HostedModule::~HostedModule() {
    if (handle_ != nullptr)
        dlclose(handle_);
}

void* HostedModule::FindSymbol(const char* name) const {
    return handle_ != nullptr ? dlsym(handle_, name) : nullptr;
}

} // namespace wbhost::cli
