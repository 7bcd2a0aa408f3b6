// Errors of the host runtime: a host error code and the host's text for it.
#pragma once

#include "kern/exception/Exception.h"

#include <cstdint>
#include <string>

namespace qv::host::errors {

class WBErrorException : public kern::exception::Exception {
public:
    // The host error `code`; the text is "Error Code: <decimal> (<8 hex digits>): " followed by
    // the host's text for the code (asked of the host runtime), or by "Unknown error code or error
    // text unavailable." when the host has none.
    explicit WBErrorException(int32_t code);
    // Host error 1 with `text` (empty when null) after the same prefix.
    explicit WBErrorException(const char* text);

    const char* what() const noexcept override { return message_.c_str(); }
    // The host error code itself, as its 32-bit pattern.
    uint32_t GetErrorCode() const noexcept override { return static_cast<uint32_t>(code_); }
    // The host error code.
    int32_t code() const noexcept { return code_; }

private:
    std::string message_;
    int32_t code_;
};

} // namespace qv::host::errors
