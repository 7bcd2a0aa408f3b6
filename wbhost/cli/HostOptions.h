// What every project command shares: the module to load, the answers for its dialog programs,
// and whether to print the programs' runs at the end.
#pragma once

#include "session/HostSession.h"

#include <iosfwd>
#include <string>
#include <vector>

namespace wbhost::cli {

struct HostOptions {
    std::string modulePath;               // the module file to load
    std::vector<std::string> answerFiles; // files of "behaviour:index=value" lines
    std::vector<std::string> answers;     // single answers, applied after the files
    bool record = false;                  // print the recorded program runs at the end
};

// Loads the module into SESSION and gives its program session the answers of OPTIONS. False,
// with the reason on ERR, when the module does not load or an answer is malformed.
bool StartSession(const HostOptions& options, session::HostSession& session, std::ostream& err);

// StartSession, then opens the project file PROJECTPATH in SESSION. False, with the reason on
// ERR, when either fails.
bool StartProjectSession(const HostOptions& options, session::HostSession& session,
                         const std::string& projectPath, std::ostream& err);

// Prints the recorded program runs of SESSION on OUT when OPTIONS ask for them.
void FinishSession(const HostOptions& options, session::HostSession& session, std::ostream& out);

// The target of PROJECT called NAME (compared without regard to case); null, with the names
// of the targets there are on ERR, when there is none.
project::ProjectItem* FindTarget(project::Project& project, std::string_view name,
                                 std::ostream& err);

// StartProjectSession, then FindTarget(TARGETNAME) in the project opened: what every command on
// one target of a project begins with. Null, with the reason on ERR, when any step fails.
project::ProjectItem* OpenProjectTarget(const HostOptions& options, session::HostSession& session,
                                        const std::string& projectPath, std::string_view targetName,
                                        std::ostream& err);

// PATH made absolute, so a project keeps finding its descriptions from any working folder;
// PATH itself when that fails.
std::string AbsolutePath(const std::string& path);

} // namespace wbhost::cli
