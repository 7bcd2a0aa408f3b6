// QueryInterfaceForWBRefNum: the runtime function through which modules reach host objects.
#include "runtime/RefnumTable.h"
#include "runtime/Runtime.h"

#include <cstring>

int32_t QueryInterfaceForWBRefNum(const WBRefNum* refnum, const void* iid, void** object) {
    if (object == nullptr)
        return E_POINTER;
    *object = nullptr;
    // The answer is a COM status, never a host error code: callers return a failing answer as
    // their own status, and a positive host code would read there as success.
    if (refnum == nullptr || iid == nullptr)
        return E_POINTER;
    try {
        // The identifier is copied out: a caller's 16 bytes need not be aligned as a GUID is.
        IID wanted;
        std::memcpy(&wanted, iid, sizeof wanted);
        return wbhost::runtime::RefnumTable::Instance().Query(*refnum, wanted, object);
    } catch (...) {
        return E_FAIL;
    }
}
