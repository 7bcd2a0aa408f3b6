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
// target, adds items (and is refused one for a resource that does not exist), reopens and lists
// the project, renames, removes and inserts parts of the target's tree, and lists the items
// again. Writes the transcript to OUT; answers 0 only when every step exited and printed as it
// should, 1 otherwise (each failing step says why on ERR). A temporary work folder is removed
// at the end; one given in SETTINGS is kept.
int RunDemo(const HostOptions& options, const DemoSettings& settings, std::ostream& out,
            std::ostream& err);

} // namespace wbhost::cli
