// The work behind `wbhost program`: one host program run through the runner the module would
// use, with its inputs from the command line and its dialogs answered from the session.
#pragma once

#include "cli/HostOptions.h"

#include <iosfwd>
#include <string>
#include <vector>

namespace wbhost::cli {

// Where the program FILE is: FILE itself when it exists or names a folder, else the module's
// programs folder ("wbtio/private" beside MODULEPATH) when FILE is a bare file name there.
std::string LocateProgram(const std::string& file, const std::string& modulePath);

// Opens the program FILE (see LocateProgram) through the root object's runner service, sets
// the inputs INPUTS ("index=value", values as answers take them), runs it and writes its
// outputs to OUT. Fails on ERR when an input is malformed, or the program cannot be opened, set
// or run (with the runner's status).
int RunProgram(const HostOptions& options, const std::string& file,
               const std::vector<std::string>& inputs, std::ostream& out, std::ostream& err);

} // namespace wbhost::cli
