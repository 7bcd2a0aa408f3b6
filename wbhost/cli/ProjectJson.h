// The project as `wbhost project list --json` prints it: for scripts and tests that read the
// items' state rather than the listing meant for people.
#pragma once

#include "project/Project.h"

#include <iosfwd>

namespace wbhost::cli {

// Writes PROJECT to OUT as one JSON document: its name and, per target (name, identifier,
// description file), the Tangent I/O items with their path, identifier, resource, status (the
// number and "bound", "missing" or "conflict"; null while not reported), hidden flag,
// feature-set version and compile configuration (left out when the item's object gives none).
void WriteProjectJson(project::Project& project, std::ostream& out);

} // namespace wbhost::cli
