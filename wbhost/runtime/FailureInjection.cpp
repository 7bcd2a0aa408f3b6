// Armed failures of the memory functions.
#include "runtime/FailureInjection.h"

#include <array>
#include <atomic>

namespace wbhost::runtime {
namespace {

struct Armed {
    std::atomic<uint32_t> remaining{0}; // calls until the failing one; 0 = not armed
    std::atomic<WBErr> error{kWBNoErr};
};

std::array<Armed, static_cast<size_t>(FailingCall::Count)> armed;

Armed& Slot(FailingCall call) {
    return armed[static_cast<size_t>(call)];
}

} // namespace

void FailNthCall(FailingCall call, uint32_t n, WBErr error) {
    Slot(call).error = error;
    Slot(call).remaining = n;
}

WBErr InjectedFailure(FailingCall call) {
    Armed& slot = Slot(call);
    uint32_t remaining = slot.remaining.load();
    // Counts down only while armed; the call that takes it from 1 to 0 is the failing one.
    while (remaining != 0 && !slot.remaining.compare_exchange_weak(remaining, remaining - 1)) {
    }
    return remaining == 1 ? slot.error.load() : kWBNoErr;
}

FailureScope::~FailureScope() {
    for (Armed& slot : armed)
        slot.remaining = 0;
}

} // namespace wbhost::runtime
