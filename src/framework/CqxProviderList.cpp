// The module's provider list. It holds plain pointers: a provider removes itself as it dies,
// and Current promotes only a provider whose count has not yet reached zero, so a provider
// released on another thread is never handed out again.
#include "framework/CqxProviderList.h"

#include "framework/CqxProvider.h"

#include <algorithm>

CqxProviderList& CqxProviderList::Module() {
    // Never destroyed: providers still held by the host when the module's statics are torn down
    // leave the list as they die.
    union Holder {
        Holder() : list() {}
        ~Holder() {}
        CqxProviderList list;
    };
    static Holder holder;
    return holder.list;
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
