// The plug-in module as this host loads it: dlopen, and its exports looked up by name.
#pragma once

#include <string>

namespace wbhost::cli {

class HostedModule {
public:
    // Loads the module file PATH; Loaded() tells whether it worked and Error() why not.
    explicit HostedModule(const std::string& path);
    // Unloads the module (its code stays mapped: see the constructor).
    ~HostedModule();
    HostedModule(const HostedModule&) = delete;
    HostedModule& operator=(const HostedModule&) = delete;

    // Whether the module is loaded.
    bool Loaded() const noexcept { return handle_ != nullptr; }
    // Why loading failed; empty after a successful load.
    const std::string& Error() const noexcept { return error_; }
    // The export NAME as a function of type FN; null when the module does not export it.
    template <class Fn> Fn* Find(const char* name) const {
        return reinterpret_cast<Fn*>(FindSymbol(name));
    }

private:
    void* FindSymbol(const char* name) const;
    void* handle_ = nullptr;
    std::string error_;
};

} // namespace wbhost::cli
