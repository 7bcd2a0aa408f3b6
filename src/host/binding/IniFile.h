// Reading one value from an INI-style file: the executable's profile file, and the file that
// stands in for the registry (its sections are key paths).
#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace qv::host::rt {

// The value of `key` in `section` of the INI file at `path`, with surrounding blanks removed.
// Section and key names compare without regard to ASCII case; the first match wins. Lines
// starting with ";" or "#" are comments. nullopt when the file, section or key is missing.
std::optional<std::string> ReadIniValue(const std::string& path, std::string_view section,
                                        std::string_view key);

} // namespace qv::host::rt
