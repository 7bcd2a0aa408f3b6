// The host's reference numbers: 32-bit numbers that host programs hold in place of COM objects.
#pragma once

#include "com/IUnknown.h"
#include "host/binding/runtime_api.h"

#include <mutex>
#include <unordered_map>

namespace wbhost::runtime {

class RefnumTable {
public:
    // The table of this process.
    static RefnumTable& Instance();

    RefnumTable() = default;
    ~RefnumTable();
    RefnumTable(const RefnumTable&) = delete;
    RefnumTable& operator=(const RefnumTable&) = delete;

    // A new refnum for OBJECT, which the table holds a reference on; 0 (never a valid refnum)
    // for a null object or when every number is taken.
    WBRefNum Add(IUnknown* object);
    // Forgets REFNUM and releases the table's reference; false when it names no object.
    bool Remove(WBRefNum refnum);
    // The interface IID of the object behind REFNUM, with a reference, in *object. E_POINTER for
    // a null IID or OBJECT, E_INVALIDARG for a refnum the table does not know, else the object's
    // own answer. *object is null on every failure.
    HRESULT Query(WBRefNum refnum, const IID& iid, void** object);
    // Number of refnums in use.
    size_t Count() const;

private:
    mutable std::mutex lock_;
    std::unordered_map<WBRefNum, IUnknown*> objects_;
    WBRefNum next_ = 1;
};

} // namespace wbhost::runtime
