// Raised here, so the location of every host error is this check, whichever call failed.
#include "host/errors/ThrowIfWBError.h"

#include "host/errors/WBErrorException.h"

namespace qv::host::errors {

namespace {

constexpr int32_t kOutOfMemory = 2;

} // namespace

void ThrowIfWBError(int32_t err) {
    if (err != 0) {
        QV_THROW(WBErrorException(err));
    }
}

void CheckArrayIndex(int64_t index, int64_t count) {
    if (index < 0 || index >= count) {
        QV_THROW(WBErrorException("Array index out of bounds."));
    }
}

void CheckNewArraySize(int64_t newSize) {
    if (newSize < 0) {
        QV_THROW(WBErrorException("Invalid new_size for array."));
    }
}

void ThrowIfNoHandle(const void* handle) {
    if (handle == nullptr) {
        QV_THROW(WBErrorException(kOutOfMemory));
    }
}

} // namespace qv::host::errors
