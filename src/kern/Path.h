// Path texts: joining and separators for platform paths, and the long-path form of
// Windows-form paths (kept as a pure text transform so that stored Windows paths stay usable).
#pragma once

#include <string>
#include <string_view>

namespace qv::kern {

// dir + "/" + name, without doubling a separator. An empty dir gives name, an empty name gives
// dir, and an absolute name (starting with "/") is returned as it stands.
std::string JoinPath(std::string_view dir, std::string_view name);

// The path with a "/" appended unless it already ends with one; raises InvalidArgument when the
// path is empty.
std::string AddTrailingSeparator(std::string_view path);

// The Windows long-path form of a Windows-form path: a path starting with "\\?\" (or the device
// prefix "\\.\") is returned unchanged; otherwise "/" becomes "\", the path is made absolute
// against currentDirectory (an absolute Windows path: "X:\..." or "\\server\share\...") and "."
// and ".." are resolved (never above the drive or share), then "\\?\" is prefixed, or "\\?\UNC"
// for a network path. Empty input gives an empty result; a relative path with a current
// directory that is not absolute raises InvalidArgument.
std::u16string ToLongPathForm(std::u16string_view path, std::u16string_view currentDirectory);

} // namespace qv::kern
