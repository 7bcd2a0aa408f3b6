// What every project command shares.
#include "cli/HostOptions.h"

#include "cli/Answers.h"
#include "cli/HostText.h"
#include "kern/Collate.h"

#include <filesystem>
#include <ostream>

namespace wbhost::cli {

bool StartSession(const HostOptions& options, session::HostSession& session, std::ostream& err) {
    std::string error;
    if (!session.Open(options.modulePath, &error)) {
        err << "wbhost: " << error << "\n";
        return false;
    }
    if (!ApplyAnswers(options.answerFiles, options.answers, session.Programs(), error)) {
        err << "wbhost: " << error << "\n";
        return false;
    }
    return true;
}

bool StartProjectSession(const HostOptions& options, session::HostSession& session,
                         const std::string& projectPath, std::ostream& err) {
    if (!StartSession(options, session, err))
        return false;
    std::string error;
    if (!session.OpenProject(projectPath, &error)) {
        err << "wbhost: " << error << "\n";
        return false;
    }
    return true;
}

void FinishSession(const HostOptions& options, session::HostSession& session, std::ostream& out) {
    if (!options.record)
        return;
    out << "-- program runs\n";
    PrintRuns(session.Programs(), out);
}

// gcc 12 at -O2 and above warns (-Wrestrict) that the inlined std::string concatenation below
// may copy overlapping memory, with sizes near 2^63 that no string reaches: a known false
// positive of that release's middle end. Only this function is exempt, and only from gcc's check;
// the sanitizers still watch its copies.
#if defined(__GNUC__) && !defined(__clang__)
#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wrestrict"
#endif
project::ProjectItem* FindTarget(project::Project& project, std::string_view name,
                                 std::ostream& err) {
    const std::u16string wanted = FromUtf8(name);
    std::string known;
    for (const auto& target : project.Targets()) {
        if (qv::kern::EqualsNoCase(target->Name(), wanted))
            return target.Get();
        known += (known.empty() ? " " : ", ") + ("\"" + ToUtf8(target->Name()) + "\"");
    }
    err << "wbhost: the project has no target called \"" << name
        << "\" (targets:" << (known.empty() ? " none" : known) << ")\n";
    return nullptr;
}

project::ProjectItem* OpenProjectTarget(const HostOptions& options, session::HostSession& session,
                                        const std::string& projectPath, std::string_view targetName,
                                        std::ostream& err) {
    if (!StartProjectSession(options, session, projectPath, err))
        return nullptr;
    return FindTarget(*session.Project(), targetName, err);
}
#if defined(__GNUC__) && !defined(__clang__)
#pragma GCC diagnostic pop
#endif

std::string AbsolutePath(const std::string& path) {
    std::error_code failed;
    const auto absolute = std::filesystem::absolute(path, failed);
    return failed ? path : absolute.lexically_normal().string();
}

} // namespace wbhost::cli
