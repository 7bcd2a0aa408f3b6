// What the host keeps about the runner's work beyond the runs: the host references it made and
// which of them are still open, and the failures a test makes it give.
#pragma once

#include "com/HResult.h"

#include <cstdint>
#include <map>
#include <mutex>
#include <set>

namespace wbhost::runner {

// The steps of a program's use that can be made to fail.
enum class RunnerStep {
    Reference, // making a host reference
    Open,      // opening a program file
    Input,     // setting an input
    Run,       // running
    Output,    // reading an output
};

class RunnerLedger {
public:
    // Counts of the host references made through the runners, and of those not released yet.
    struct References {
        size_t made = 0;
        size_t open = 0;
    };

    void ReferenceMade(uint64_t reference);
    // False when REFERENCE was not made through a runner or was released already.
    bool ReferenceReleased(uint64_t reference);
    References Counts() const;

    // Makes every later STEP answer STATUS (a failure) until the failures are cleared.
    void Fail(RunnerStep step, HRESULT status);
    void ClearFailures();
    // The injected failure of STEP, or S_OK when it has none.
    HRESULT FailureAt(RunnerStep step) const;

private:
    mutable std::mutex lock_;
    size_t made_ = 0;
    std::set<uint64_t> open_;
    std::map<RunnerStep, HRESULT> failures_;
};

} // namespace wbhost::runner
