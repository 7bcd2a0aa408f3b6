// The runner's ledger of references and injected failures.
#include "runner/RunnerLedger.h"

namespace wbhost::runner {

void RunnerLedger::ReferenceMade(uint64_t reference) {
    const std::lock_guard hold(lock_);
    ++made_;
    open_.insert(reference);
}

bool RunnerLedger::ReferenceReleased(uint64_t reference) {
    const std::lock_guard hold(lock_);
    return open_.erase(reference) != 0;
}

RunnerLedger::References RunnerLedger::Counts() const {
    const std::lock_guard hold(lock_);
    return {made_, open_.size()};
}

void RunnerLedger::Fail(RunnerStep step, HRESULT status) {
    const std::lock_guard hold(lock_);
    failures_[step] = status;
}

void RunnerLedger::ClearFailures() {
    const std::lock_guard hold(lock_);
    failures_.clear();
}

HRESULT RunnerLedger::FailureAt(RunnerStep step) const {
    const std::lock_guard hold(lock_);
    const auto found = failures_.find(step);
    return found == failures_.end() ? S_OK : found->second;
}

} // namespace wbhost::runner
