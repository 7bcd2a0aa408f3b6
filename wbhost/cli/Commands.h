// The work behind wbhost's subcommands, apart from the command line so tests can run it too.
#pragma once

#include <iosfwd>
#include <string>

namespace wbhost::cli {

// Exit codes of `wbhost tree`.
enum TreeExit : int { kTreeOk = 0, kTreeFailed = 1 };

// Loads the target description FILE into the resource service and writes to OUT the dump of
// the node at PATH (empty: the root), asked of the module at MODULEPATH through its
// TIOResTree_Dump. The loader's "XMLParseErrors" go to ERR, one line each. Answers kTreeFailed
// when the file cannot be read, the module does not load, PATH names no node, the export fails,
// or the description has errors (its dump is still written).
int RunTree(const std::string& modulePath, const std::string& file, const std::string& path,
            std::ostream& out, std::ostream& err);

// Compares the required description in the file REQUIRED with the offered one in OFFERED through
// the module's TIO_CompareTwoResourceTrees and writes "match", "not satisfied" or "tolerated
// difference" to OUT; answers 0, 1 or 2 as the comparison does. A file that cannot be read or a
// module that does not load is told on ERR and answers 3.
int RunCompare(const std::string& modulePath, const std::string& required,
               const std::string& offered, std::ostream& out, std::ostream& err);

// The exit code of RunCompare when the comparison could not run.
inline constexpr int kCompareFailed = 3;

} // namespace wbhost::cli
