// qxGetProvider's rules for the current and private providers.
#include "provider/ProviderEntry.h"

#include "com/CallGuard.h"
#include "com/ComObject.h"
#include "com/ComPtr.h"
#include "framework/CqxProviderList.h"
#include "kern/osdep/CqvCS.h"
#include "provider/TIOProvider.h"

#include <mutex>

namespace tio {

namespace {

// Re-entrant: a provider released while the lock is held may come back into qxGetProvider on
// the same thread.
Bytefair::CqvCS& ProviderLock() {
    static Bytefair::CqvCS lock;
    return lock;
}

HRESULT CreateProvider(bool makeCurrent, void** provider) {
    CQVComObject<TIOProvider>* raw = nullptr;
    const HRESULT hr = CQVComObject<TIOProvider>::CreateInstance(&raw);
    if (FAILED(hr)) {
        return hr;
    }
    // Holds the creation reference; the caller keeps the one the query adds.
    const auto created = qv::com::ComPtr<CQVComObject<TIOProvider>>::Adopt(raw);
    CqxProviderList::Module().Add(raw, makeCurrent);
    return raw->QueryInterface(IqxProvider::iid, provider);
}

} // namespace

HRESULT GetProvider(int32_t mode, void** provider) {
    const std::lock_guard guard(ProviderLock());
    if (!provider) {
        return E_POINTER;
    }
    *provider = nullptr;
    return qv::com::GuardCall([&] {
        if (mode != 0) {
            return CreateProvider(false, provider);
        }
        if (const auto current = CqxProviderList::Module().Current()) {
            return current->QueryInterface(IqxProvider::iid, provider);
        }
        return CreateProvider(true, provider);
    });
}

} // namespace tio
