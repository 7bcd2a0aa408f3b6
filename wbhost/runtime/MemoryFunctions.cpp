// The memory manager functions of the host runtime, over the handle table.
#include "runtime/FailureInjection.h"
#include "runtime/HandleTable.h"
#include "runtime/Runtime.h"

namespace {

using wbhost::runtime::FailingCall;
using wbhost::runtime::HandleTable;
using wbhost::runtime::InjectedFailure;

// Element size of a NumericArrayResize type code, 0 for an unknown code.
size_t ElementSize(int32_t typeCode) {
    switch (typeCode) {
    case kWBTypeI8:
    case kWBTypeU8:
        return 1;
    case kWBTypeI16:
    case kWBTypeU16:
        return 2;
    case kWBTypeI32:
    case kWBTypeU32:
    case kWBTypeF32:
        return 4;
    case kWBTypeI64:
    case kWBTypeU64:
    case kWBTypeF64:
        return 8;
    default:
        return 0;
    }
}

constexpr int32_t kMaxDimensions = 64;

} // namespace

WBHandle DSNewHandle(size_t size) {
    if (InjectedFailure(FailingCall::DSNewHandle) != kWBNoErr)
        return nullptr;
    return HandleTable::Instance().Allocate(size, false);
}

WBHandle DSNewHClr(size_t size) {
    return HandleTable::Instance().Allocate(size, true);
}

WBErr DSSetHSzClr(WBHandle handle, size_t size) {
    return HandleTable::Instance().Resize(handle, size, true);
}

WBErr DSDisposeHandle(WBHandle handle) {
    return HandleTable::Instance().Dispose(handle);
}

size_t DSGetHandleSize(WBHandle handle) {
    return HandleTable::Instance().SizeOf(handle);
}

WBErr NumericArrayResize(int32_t typeCode, int32_t numDims, WBHandle* handle, size_t numElements) {
    const size_t element = ElementSize(typeCode);
    if (element == 0 || numDims < 1 || numDims > kMaxDimensions || handle == nullptr) {
        return kWBArgErr;
    }
    if (const WBErr injected = InjectedFailure(FailingCall::NumericArrayResize))
        return injected;
    // The data follows the dimension sizes, aligned to its element size (at most 8).
    const size_t dims = 4 * static_cast<size_t>(numDims);
    const size_t header = (dims + element - 1) / element * element;
    if (numElements > (HandleTable::kMaxBlockSize - header) / element) {
        return kWBMemFullErr;
    }
    const size_t size = header + numElements * element;
    if (*handle == nullptr) {
        *handle = HandleTable::Instance().Allocate(size, false);
        return *handle != nullptr ? kWBNoErr : kWBMemFullErr;
    }
    return HandleTable::Instance().Resize(*handle, size, false);
}
