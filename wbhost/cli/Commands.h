// The work behind wbhost's subcommands, apart from the command line so tests can run it too.
#pragma once

#include <iosfwd>
#include <string>
#include <vector>

namespace wbhost::cli {

// Loads the target description FILE into the resource service and writes to OUT the dump of
// the node at PATH (empty: the root), asked of the module at MODULEPATH through its
// TIOResTree_Dump. The loader's "XMLParseErrors" go to ERR, one line each, as RunTreeCheck
// writes them; characters the host's code page cannot represent are named there too. Answers
// kTreeFailed when the file cannot be read, the module does not load, PATH names no node, the
// export fails, or the description has errors (its dump is still written). Statuses are those of
// ExitStatus.h.
int RunTree(const std::string& modulePath, const std::string& file, const std::string& path,
            std::ostream& out, std::ostream& err);

// Loads each description of FILES with the host's loader and writes its problems to OUT, one
// "FILE:LINE:COLUMN: error: MESSAGE" line each (CONTEXT: the input around each problem
// follows it), then a summary line. Answers kExitOk when no file had a problem, kExitFailed when
// one had, kExitTolerated when a file could not be read (told on ERR).
int RunTreeCheck(const std::vector<std::string>& files, bool context, std::ostream& out,
                 std::ostream& err);

// Compares the required description in the file REQUIRED with the offered one in OFFERED through
// the module's TIO_CompareTwoResourceTrees and writes "match", "not satisfied" or "tolerated
// difference" to OUT; answers 0, 1 or 2 as the comparison does. A file that cannot be read or a
// module that does not load is told on ERR and answers kExitCannotRun, as does a description
// holding characters the host's code page cannot represent: the module is handed its texts in
// that code page and would compare what it lost. A file is read as the loader reads one (a
// UTF-16 file with a byte-order mark is the same description as its UTF-8 twin). With EXPLAIN,
// the answer comes from the host's own copy of the comparison, whose walk also records what
// decided it; that follows the answer on OUT (CompareReport.h).
int RunCompare(const std::string& modulePath, const std::string& required,
               const std::string& offered, bool explain, std::ostream& out, std::ostream& err);

// Writes to OUT the host's VERSION, the module file at MODULEPATH and what its GetInfo answers.
// A module that does not load, or has no GetInfo, is told on ERR and answers kExitFailed.
int RunVersion(const std::string& version, const std::string& modulePath, std::ostream& out,
               std::ostream& err);

} // namespace wbhost::cli
