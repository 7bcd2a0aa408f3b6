// The module's provider list. It holds plain pointers: a provider removes itself as it dies,
// and Current promotes only a provider whose count has not yet reached zero, so a provider
// released on another thread is never handed out again.
#include "framework/CqxProviderList.h"

#include "framework/CqxProvider.h"

#include <algorithm>
#include <new>

namespace {
// Frees the list's storage when the module's statics are torn down (the module may be unloaded
// and its memory unmapped afterwards).
struct StorageReleaser {
    ~StorageReleaser() { CqxProviderList::Module().ReleaseStorage(); }
};
} // namespace

CqxProviderList& CqxProviderList::Module() {
    // The list itself is never destroyed: a provider that the host still holds when the statics
    // are torn down can leave it as it dies.
    alignas(CqxProviderList) static unsigned char storage[sizeof(CqxProviderList)];
    static CqxProviderList* const list = new (storage) CqxProviderList();
    static const StorageReleaser releaser;
    return *list;
}

void CqxProviderList::ReleaseStorage() noexcept {
    const std::lock_guard guard(lock_);
    std::vector<CqxProvider*>().swap(providers_);
    current_ = nullptr;
}

void CqxProviderList::Add(CqxProvider* provider, bool makeCurrent) {
    const std::lock_guard guard(lock_);
    providers_.push_back(provider);
    current_ = makeCurrent ? provider : nullptr;
}

void CqxProviderList::Remove(const CqxProvider* provider) noexcept {
    const std::lock_guard guard(lock_);
    std::erase(providers_, provider);
    if (current_ == provider) {
        current_ = nullptr;
    }
}

qv::com::ComPtr<CqxProvider> CqxProviderList::Current() {
    const std::lock_guard guard(lock_);
    if (current_ && current_->TryAddRef()) {
        return qv::com::ComPtr<CqxProvider>::Adopt(current_);
    }
    return {};
}

size_t CqxProviderList::Size() const {
    const std::lock_guard guard(lock_);
    return providers_.size();
}

bool CqxProviderList::IsCurrent(const CqxProvider* provider) const {
    const std::lock_guard guard(lock_);
    return provider && current_ == provider;
}
