// The fatal path of the binding. The process may be in any state here (a host function is needed
// and cannot be found), so the default report uses only write() and _exit().
#include "host/binding/FatalError.h"

#include <atomic>
#include <cstring>
#include <unistd.h>

namespace qv::host::rt {

namespace {

void WriteAll(const char* text) noexcept {
    size_t left = std::strlen(text);
    while (left > 0) {
        const ssize_t written = write(STDERR_FILENO, text, left);
        if (written <= 0) {
            return;
        }
        text += written;
        left -= static_cast<size_t>(written);
    }
}

void ReportAndExit(const char* message) {
    WriteAll("Fatal Error: ");
    WriteAll(message);
    WriteAll("\n");
    _exit(1);
}

std::atomic<FatalErrorHook> fatalHook{ReportAndExit};

} // namespace

FatalErrorHook SetFatalErrorHook(FatalErrorHook hook) noexcept {
    return fatalHook.exchange(hook != nullptr ? hook : ReportAndExit);
}

void FatalBindingError(const char* message) {
    fatalHook.load()(message);
    _exit(1);
}

} // namespace qv::host::rt
