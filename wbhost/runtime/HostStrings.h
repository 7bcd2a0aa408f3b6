// Host strings (a 32-bit count, then the bytes) as the runtime's own functions hand them out
// and take them in.
#pragma once

#include "host/binding/runtime_api.h"

#include <optional>
#include <string>
#include <string_view>

namespace wbhost::runtime {

// Stores TEXT as a host string in the slot *OUT: a null slot receives a new handle, a live
// handle is resized (it may move). kWBArgErr for a null OUT or a slot holding anything else,
// kWBMemFullErr when there is no memory or TEXT is longer than a count can say.
WBErr StoreHostString(WBHandle* out, std::string_view text);

// The text of the host string HANDLE; nullopt unless it is a live handle whose count fits its
// block (a negative count reads as empty).
std::optional<std::string> ReadHostString(WBHandle handle);

} // namespace wbhost::runtime
