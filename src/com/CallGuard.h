// Keeps exceptions inside: interface methods run their body through GuardCall and answer a
// status whatever the body throws.
#pragma once

#include "com/HResult.h"
#include "kern/exception/Exception.h"

#include <new>

namespace qv::com {

// The status for an exception caught at an interface boundary: E_OUTOFMEMORY for an allocation
// failure, the code of a kern exception when it is a failure status, E_FAIL otherwise.
HRESULT StatusFromCurrentException() noexcept;

// Runs BODY (returning HRESULT) and turns any exception into a status.
template <class Body> HRESULT GuardCall(Body&& body) noexcept {
    try {
        return body();
    } catch (...) {
        return StatusFromCurrentException();
    }
}

} // namespace qv::com
