// The host's texts for its error codes.
#pragma once

#include <cstdint>

namespace wbhost::runtime {

// The text of a host error code, or null when the host has none for it.
const char* ErrorText(int32_t code) noexcept;

} // namespace wbhost::runtime
