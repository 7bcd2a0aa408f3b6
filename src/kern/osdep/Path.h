// Where things are on disk: the directory of a loaded module, the main executable's path, and a
// file search by name pattern.
#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace qv::kern::osdep {

// The directory of a loaded module, absolute and with a trailing "/". moduleHandle is a handle
// from dlopen; null means the main executable. A handle that is not (or no longer) loaded raises
// WinError (126, module not found).
std::string GetModuleDirectory(void* moduleHandle);

// The directory, with a trailing "/", of the module whose code or data holds address (pass the
// address of one of the module's own functions). Raises WinError (126) when no module holds it.
std::string GetModuleDirectoryOf(const void* address);

// The absolute path of the main executable; raises WinError when the system cannot tell.
std::string GetExePath();

// The entries (files and folders, without "." and "..") whose names match the last component
// of pattern, in name order, each given with the pattern's directory part ("dir/*.gx" gives
// "dir/a.gx"). The last component may hold "*" and "?" ("*.*" matches every name); other
// characters match themselves, case-sensitively. A folder that does not exist, or an empty
// pattern, gives an empty list; a folder that cannot be read raises WinError.
std::vector<std::string> FindFiles(std::string_view pattern);

} // namespace qv::kern::osdep
