// The host's own folder: what FGetSpecialDir answers for kWBHostFolder, and so where the
// resource-tree loaders (the host's and the module's) look for included and deferred files.
#pragma once

#include <string>

namespace wbhost::runtime {

// The host folder: the one SetHostFolder gave, else the executable's folder; empty when the
// system cannot tell where the executable is.
std::string HostFolder();

// Makes FOLDER (made absolute) the host folder, for a host whose shared files are not beside
// its executable. Set it before a module loads anything: loaders ask once and keep the answer.
void SetHostFolder(const std::string& folder);

} // namespace wbhost::runtime
