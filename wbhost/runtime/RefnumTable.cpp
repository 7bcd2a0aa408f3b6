// The host's reference numbers.
#include "runtime/RefnumTable.h"

#include <vector>

namespace wbhost::runtime {

RefnumTable& RefnumTable::Instance() {
    // Never destroyed: modules may still ask for refnums while the process's statics go away.
    static RefnumTable* const table = new RefnumTable();
    return *table;
}

RefnumTable::~RefnumTable() {
    for (auto& [refnum, object] : objects_)
        object->Release();
}

WBRefNum RefnumTable::Add(IUnknown* object) {
    if (object == nullptr)
        return 0;
    const std::lock_guard guard(lock_);
    // Numbers are handed out once and never reused while the process lives (a stale refnum must
    // not reach a newer object); after 2^32 - 1 of them the table is full.
    if (next_ == 0)
        return 0;
    const WBRefNum refnum = next_++;
    objects_.emplace(refnum, object);
    object->AddRef();
    return refnum;
}

bool RefnumTable::Remove(WBRefNum refnum) {
    IUnknown* object = nullptr;
    {
        const std::lock_guard guard(lock_);
        const auto found = objects_.find(refnum);
        if (found == objects_.end())
            return false;
        object = found->second;
        objects_.erase(found);
    }
    // Released outside the lock: the object's destructor may itself use refnums.
    object->Release();
    return true;
}

HRESULT RefnumTable::Query(WBRefNum refnum, const IID& iid, void** object) {
    if (object == nullptr)
        return E_POINTER;
    *object = nullptr;
    IUnknown* target = nullptr;
    {
        const std::lock_guard guard(lock_);
        const auto found = objects_.find(refnum);
        if (found == objects_.end())
            return E_INVALIDARG;
        target = found->second;
        target->AddRef();
    }
    const HRESULT hr = target->QueryInterface(iid, object);
    target->Release();
    if (FAILED(hr))
        *object = nullptr;
    return hr;
}

size_t RefnumTable::Count() const {
    const std::lock_guard guard(lock_);
    return objects_.size();
}

} // namespace wbhost::runtime
