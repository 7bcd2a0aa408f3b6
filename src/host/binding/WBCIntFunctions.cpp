// Function-table versions: callers that need a newer table ask for its class and test validity.
#include "host/binding/WBCIntFunctions.h"

namespace qv::host::rt {

namespace {

constexpr uint32_t kOpenByNameRevision = 40;
constexpr size_t kOpenByNameSlot = 109;

template <class Version> std::unique_ptr<WBCIntFunctions> IfValid(const void* const* table) {
    auto wrapper = std::make_unique<Version>(table);
    return wrapper->IsValid() ? std::move(wrapper) : nullptr;
}

} // namespace

uint32_t WBCIntFunctions::Revision() const noexcept {
    if (table_ == nullptr) {
        return 0;
    }
    return static_cast<uint32_t>(reinterpret_cast<uintptr_t>(table_[0]));
}

WBCIntOpenByNameFn* WBCIntFunctions::OpenByName() const noexcept {
    return Revision() >= kOpenByNameRevision ? Function<WBCIntOpenByNameFn>(kOpenByNameSlot)
                                             : nullptr;
}

std::unique_ptr<WBCIntFunctions> WrapFunctionTable(const void* const* table) {
    if (auto wrapper = IfValid<WBCIntFunctions90>(table)) {
        return wrapper;
    }
    if (auto wrapper = IfValid<WBCIntFunctions82>(table)) {
        return wrapper;
    }
    if (auto wrapper = IfValid<WBCIntFunctions80>(table)) {
        return wrapper;
    }
    return IfValid<WBCIntFunctions>(table);
}

} // namespace qv::host::rt
