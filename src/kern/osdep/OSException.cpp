// OS errors: errno is translated to the Windows error codes the design speaks of, and those to
// the host's error codes.
#include "kern/osdep/OSException.h"

#include <cerrno>
#include <cstring>

namespace qv::kern::osdep {
namespace {

// One row per errno/Windows pair. Rows marked forward give the Windows code of an errno; the
// first row naming a Windows code gives the errno whose text describes it.
struct ErrnoRow {
    int err;
    uint32_t windowsCode;
    bool forward;
};

constexpr ErrnoRow kErrnoRows[] = {
    {ENOENT, 2, true},         // file not found
    {ENOENT, 3, false},        // path not found: a missing directory on the way
    {ENOTDIR, 3, true},        //
    {EMFILE, 4, true},         // too many open files
    {ENFILE, 4, true},         //
    {EACCES, 5, true},         // access denied
    {EPERM, 5, true},          //
    {EISDIR, 5, true},         // opening a directory as a file is refused the same way
    {EBADF, 6, true},          // invalid handle
    {ENOMEM, 8, true},         // not enough memory
    {ENOEXEC, 11, true},       // bad format
    {ENOMEM, 14, false},       // out of memory
    {ENODEV, 15, true},        // invalid drive
    {EBUSY, 16, false},        // the current directory cannot be removed
    {EXDEV, 17, true},         // not the same device
    {EROFS, 19, true},         // write protected
    {ENXIO, 20, true},         // bad unit
    {EIO, 23, true},           // data error
    {EBUSY, 32, true},         // sharing violation
    {ETXTBSY, 32, true},       //
    {EDEADLK, 33, true},       // lock violation
    {ENODATA, 38, true},       // end of file
    {ENOSPC, 39, true},        // disk full
    {EDQUOT, 39, true},        //
    {ENOSPC, 112, false},      //
    {EOPNOTSUPP, 50, true},    // not supported (ENOTSUP has the same value here)
    {ENOSYS, 50, true},        //
    {EEXIST, 80, true},        // file exists
    {EINVAL, 87, true},        // invalid parameter
    {EPIPE, 109, true},        // broken pipe
    {ENOENT, 126, false},      // module not found
    {ENOTEMPTY, 145, true},    // directory not empty
    {EAGAIN, 170, true},       // resource busy
    {EEXIST, 183, false},      // already exists
    {ENAMETOOLONG, 206, true}, // file name too long
    {EFBIG, 223, true},        // file too large
    {EFAULT, 487, true},       // invalid address
    {EILSEQ, 1113, true},      // no mapping for the character
    {ECANCELED, 1223, true},   // cancelled
    {ETIMEDOUT, 1460, true},   // timeout
    {ELOOP, 1921, true},       // link cannot be resolved
};

constexpr uint32_t kGeneralFailure = 31;

// The GNU and the XSI strerror_r differ in their answer; both are handled.
[[maybe_unused]] std::string ErrorText(const char* answer, const char*) {
    return answer;
}
[[maybe_unused]] std::string ErrorText(int answer, const char* buffer) {
    return answer == 0 ? std::string(buffer) : std::string();
}

// The system's text for an errno value; empty when there is none.
std::string SystemText(int err) {
    if (err == 0)
        return std::string();
    char buffer[256] = {};
    return ErrorText(strerror_r(err, buffer, sizeof buffer), buffer);
}

} // namespace

OSException::OSException(std::string message, uint32_t osError) : osError_(osError) {
    SetMessage(std::move(message));
}

void OSException::SetMessage(std::string message) {
    message_ = message.empty() ? std::string("Unknown error") : std::move(message);
}

uint32_t WindowsCodeFromErrno(int err) noexcept {
    if (err == 0)
        return 0;
    for (const ErrnoRow& row : kErrnoRows) {
        if (row.forward && row.err == err)
            return row.windowsCode;
    }
    return kGeneralFailure;
}

int ErrnoFromWindowsCode(uint32_t windowsCode) noexcept {
    for (const ErrnoRow& row : kErrnoRows) {
        if (row.windowsCode == windowsCode)
            return row.err;
    }
    return 0;
}

uint32_t ErrorCodeFromWindowsCode(uint32_t windowsCode) noexcept {
    switch (windowsCode) {
    case 0:
        return 0;
    case 2:
    case 3:
    case 15:
        return 7;
    case 4:
        return 11;
    case 5:
        return 0x80070005u;
    case 6:
    case 87:
        return 1;
    case 8:
    case 14:
        return 2;
    case 11:
        return 23;
    case 16:
    case 19:
    case 32:
    case 33:
        return 8;
    case 20:
        return 37;
    case 23:
        return 0xFFFFFE04u; // -508
    case 38:
        return 4;
    case 39:
        return 9;
    case 80:
        return 0xFFFFFF9Eu; // -98
    default:
        return 42;
    }
}

WinError::WinError() : WinError(LastErrno{errno}) {}

WinError::WinError(LastErrno err) {
    SetOSError(WindowsCodeFromErrno(err.value));
    // The errno itself describes the failure better than the errno the Windows code maps back
    // to (EPERM and EACCES share one code).
    SetMessage(SystemText(err.value));
}

WinError::WinError(uint32_t windowsCode) {
    SetOSError(windowsCode);
    SetMessage(SystemText(ErrnoFromWindowsCode(windowsCode)));
}

uint32_t WinError::GetErrorCode() const noexcept {
    return ErrorCodeFromWindowsCode(GetOSErrorCode());
}

} // namespace qv::kern::osdep
