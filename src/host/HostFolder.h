// The host's own folder, as the host runtime tells it.
#pragma once

#include <optional>
#include <string>

namespace qv::host {

// The host folder (FGetSpecialDir kWBHostFolder) in the file system's form; nothing when there is
// no host runtime, it lacks the path functions, or it does not answer. Never raises.
std::optional<std::string> AskHostFolder() noexcept;

} // namespace qv::host
