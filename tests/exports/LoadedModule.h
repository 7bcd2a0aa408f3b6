// The real wbtangio.qxx, loaded with dlopen as a host loads it, and its exports looked up by name.
#pragma once

#include <dlfcn.h>
#include <gtest/gtest.h>
#include <string>

namespace test {

class LoadedModule {
public:
    // NODELETE: the libraries the module brings (ICU) keep process-wide caches that are meant to
    // live as long as the process, as they do in a host, which keeps its plug-ins mapped.
    LoadedModule() : handle_(dlopen(WBT_MODULE_PATH, RTLD_NOW | RTLD_LOCAL | RTLD_NODELETE)) {}
    ~LoadedModule() {
        if (handle_ != nullptr)
            dlclose(handle_);
    }
    LoadedModule(const LoadedModule&) = delete;
    LoadedModule& operator=(const LoadedModule&) = delete;

    // Why the module did not load, or "" when it did.
    static std::string LoadError() {
        const char* error = dlerror();
        return error != nullptr ? error : "";
    }
    bool Loaded() const noexcept { return handle_ != nullptr; }

    // The export NAME as a pointer to a function of type FN; null when the module lacks it.
    template <class Fn> Fn* Find(const char* name) const {
        return handle_ != nullptr ? reinterpret_cast<Fn*>(dlsym(handle_, name)) : nullptr;
    }

private:
    void* handle_;
};

} // namespace test
