// Run-time engine version names: the shortened form tried after the full one, and what is kept.
#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace qv::host::rt {

// The shortened form of a version text: up to (not including) its second "."; or, at the first
// "." followed by a digit, one of "d", "a", "b", "f" and another digit, up to and including that
// first digit ("16.0.0f1" -> "16.0", "8.2f1" -> "8.2"). Only the first eleven characters are
// scanned; nullopt when no such point lies there (also for an empty text).
std::optional<std::string> ShortVersionName(std::string_view version);

// The name a connection keeps for `version`: the text itself, or empty for texts of twelve
// characters or more, which are not kept.
std::string StoredVersionName(std::string_view version);

} // namespace qv::host::rt
