// A failing status of a host interface call carried as an exception, so the algorithms behind an
// interface method read straight through and the method's guard hands the first failure back.
#pragma once

#include "com/HResult.h"
#include "kern/exception/Exception.h"

namespace qv::host {

// The failure STATUS of a host call; its error code is that status.
class StatusError : public kern::exception::Exception {
public:
    explicit StatusError(HRESULT status) noexcept : status_(status) {}
    const char* what() const noexcept override { return "a host call failed"; }
    uint32_t GetErrorCode() const noexcept override { return static_cast<uint32_t>(status_); }
    HRESULT Status() const noexcept { return status_; }

private:
    HRESULT status_;
};

// STATUS when it succeeded (S_OK, S_FALSE, ...); throws StatusError when it failed.
inline HRESULT CheckStatus(HRESULT status) {
    if (FAILED(status))
        QV_THROW(StatusError(status));
    return status;
}

} // namespace qv::host
