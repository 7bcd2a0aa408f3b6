// Operating-system errors: OSException carries a message and an OS error code; WinError keeps
// the error as a Windows error code (mapped from errno on this platform) so that callers see the
// codes the rest of the system was written against.
#pragma once

#include "kern/exception/Exception.h"

#include <cstdint>
#include <string>

namespace qv::kern::osdep {

// An error reported by the operating system. what() is the message ("Unknown error" unless set),
// the error code 42 (the host's generic failure).
class OSException : public exception::Exception {
public:
    OSException() = default;
    // An error with the given message and OS error code; an empty message reads "Unknown error".
    OSException(std::string message, uint32_t osError);

    // The message ("Unknown error" when none is known).
    const char* what() const noexcept override { return message_.c_str(); }
    // 42, the host's code for a generic failure.
    uint32_t GetErrorCode() const noexcept override { return 42u; }
    // The OS error code behind the exception, 0 when none was given.
    virtual uint32_t GetOSErrorCode() const noexcept { return osError_; }

protected:
    // Replaces the message; an empty one reads "Unknown error".
    void SetMessage(std::string message);
    // Replaces the OS error code.
    void SetOSError(uint32_t osError) noexcept { osError_ = osError; }

private:
    std::string message_ = "Unknown error";
    uint32_t osError_ = 0;
};

// An error as a Windows error code. The message is the system's text for the error; a code
// without an equivalent on this platform keeps "Unknown error". GetErrorCode answers the host
// error code that the Windows code maps to (42 for codes without a mapping).
class WinError : public OSException {
public:
    // The calling thread's last error: errno, mapped to its Windows code (31, general failure,
    // for an errno without one); the text is the system's text for that errno.
    WinError();
    // The given Windows error code; the text is the system's text for the errno it stands for.
    explicit WinError(uint32_t windowsCode);

    uint32_t GetErrorCode() const noexcept override;

private:
    // errno is read into this before anything else runs, so nothing in between can change it.
    struct LastErrno {
        int value;
    };
    explicit WinError(LastErrno err);
};

// The Windows error code an errno value stands for; 0 for 0, 31 (general failure) when there is
// no closer code.
uint32_t WindowsCodeFromErrno(int err) noexcept;

// The errno value a Windows error code stands for; 0 when there is none.
int ErrnoFromWindowsCode(uint32_t windowsCode) noexcept;

// The host error code for a Windows error code (0 for 0, 42 for codes without a mapping).
uint32_t ErrorCodeFromWindowsCode(uint32_t windowsCode) noexcept;

} // namespace qv::kern::osdep
