// A callable host runtime function: calling it resolves the address in the calling thread's
// runtime module (cached per module) and forwards the arguments unchanged.
#pragma once

#include "host/binding/HostFunction.h"

namespace qv::host::rt {

template <class Signature> class BoundFunction;

template <class R, class... Args> class BoundFunction<R(Args...)> {
public:
    using Pointer = R (*)(Args...);

    constexpr explicit BoundFunction(const char* exportName) noexcept : function_(exportName) {}

    // Calls the host function; ends the process (fatal hook) when it cannot be bound.
    R operator()(Args... args) const {
        return reinterpret_cast<Pointer>(Resolve(function_))(args...);
    }

    // The host function's address without the fatal path; null when it cannot be bound.
    Pointer TryAddress() const noexcept { return reinterpret_cast<Pointer>(TryResolve(function_)); }

    // The descriptor, for tests and diagnostics.
    HostFunction& descriptor() const noexcept { return function_; }

private:
    // Descriptors are process-wide state shared by every caller; a call is logically const.
    mutable HostFunction function_;
};

} // namespace qv::host::rt
