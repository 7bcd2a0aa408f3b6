// `wbhost demo`: a whole session played on the example descriptions, as a user would type it,
// with a readable transcript and a check of every step's answer.
#pragma once

#include "cli/HostOptions.h"

#include <iosfwd>
#include <string>

namespace wbhost::cli {

struct DemoSettings {
    std::string examples = "examples"; // the folder holding KestrelK40.xml, K40X and K20
    std::string workFolder;            // where the project files go; empty: a temporary folder
};

// Plays the session: loads and checks the descriptions, compares them, creates a project with a
// target, adds items (bound; a second one on a taken resource in conflict; refused for a
// resource that does not exist or a name that is taken), renames the connector above them (they
// follow), removes a resource (its item is missing) and puts it back (bound again), changes a
// method's signature (counted once, also when set again in other case), reopens the project and
// checks every item's status, and runs host programs. Writes the transcript to OUT; answers 0
// only when every step exited and printed as it should, 1 otherwise (each failing step says why
// on ERR). A temporary work folder is removed at the end; one given in SETTINGS is kept.
int RunDemo(const HostOptions& options, const DemoSettings& settings, std::ostream& out,
            std::ostream& err);

} // namespace wbhost::cli
