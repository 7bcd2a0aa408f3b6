// A test hook of the host runtime: the n-th call of a memory function fails as a host that has
// run out of memory (or any other host error) would, so callers' error paths can be driven.
#pragma once

#include "host/binding/runtime_api.h"

#include <cstdint>

namespace wbhost::runtime {

enum class FailingCall { NumericArrayResize, DSNewHandle, Count };

// Arms CALL: its N-th call from now (1 is the next) fails, once; N = 0 disarms it. A failing
// NumericArrayResize answers ERROR and leaves the handle alone; a failing DSNewHandle answers
// null (ERROR is not used there).
void FailNthCall(FailingCall call, uint32_t n, WBErr error = kWBMemFullErr);

// Counts one call of CALL; the host error it must answer, or 0 when it goes ahead.
WBErr InjectedFailure(FailingCall call);

// Disarms every call when it goes (so a failing test leaves nothing armed for the next).
class FailureScope {
public:
    FailureScope() = default;
    ~FailureScope();
    FailureScope(const FailureScope&) = delete;
    FailureScope& operator=(const FailureScope&) = delete;
};

} // namespace wbhost::runtime
