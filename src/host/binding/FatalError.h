// How the binding ends the process when no host function can be reached.
#pragma once

namespace qv::host::rt {

// Called with the message of a fatal binding error. The default writes "Fatal Error: " and the
// message to stderr and ends the process with status 1. A replacement may throw to let a test
// observe the message; when it returns, the process still ends.
using FatalErrorHook = void (*)(const char* message);

// Installs `hook` (null restores the default) and answers the previous one.
FatalErrorHook SetFatalErrorHook(FatalErrorHook hook) noexcept;

// Reports `message` through the hook, then ends the process with status 1.
[[noreturn]] void FatalBindingError(const char* message);

} // namespace qv::host::rt
