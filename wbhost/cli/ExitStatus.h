// What wbhost's exit statuses mean. `compare` gives 0, 1 and 2 a meaning of their own, so a
// command line that cannot be understood answers a status no command uses.
#pragma once

namespace wbhost::cli {

enum ExitStatus : int {
    kExitOk = 0,        // done; compare: match; tree --check: no problems
    kExitFailed = 1,    // refused or problems found; compare: not satisfied
    kExitTolerated = 2, // compare: tolerated difference; tree --check: a file cannot be read
    kExitCannotRun = 3, // compare could not run (a file, the module, a text the host cannot
                        // represent), or an unexpected failure of any command
    kExitUsage = 64,    // the command line is wrong: unknown option, missing argument
};

} // namespace wbhost::cli
