// The module's providers: every live provider, and which one (if any) is the current provider
// that the host gets back when it asks for the shared one.
#pragma once

#include "com/ComPtr.h"

#include <mutex>
#include <vector>

class CqxProvider;

class CqxProviderList {
public:
    // The list of this module.
    static CqxProviderList& Module();

    // Records a new PROVIDER (no reference is kept). When MAKECURRENT it becomes the current
    // provider; otherwise it is a private instance and the module has no current provider
    // afterwards. May throw std::bad_alloc.
    void Add(CqxProvider* provider, bool makeCurrent);
    // Forgets PROVIDER (called as it is destroyed); clears the current provider if it was.
    void Remove(const CqxProvider* provider) noexcept;
    // The current provider with a reference, or empty when there is none or it is already being
    // destroyed.
    qv::com::ComPtr<CqxProvider> Current();
    // Number of live providers recorded.
    size_t Size() const;
    // Whether PROVIDER is recorded and is the current provider.
    bool IsCurrent(const CqxProvider* provider) const;
    // Forgets every provider and frees the storage (when the module is torn down).
    void ReleaseStorage() noexcept;

private:
    mutable std::mutex lock_;
    std::vector<CqxProvider*> providers_;
    CqxProvider* current_ = nullptr;
};
