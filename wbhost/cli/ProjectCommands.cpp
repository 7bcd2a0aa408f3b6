// The work behind `wbhost project new|list|add-item`.
#include "cli/ProjectCommands.h"

#include "cli/AttributeSet.h"
#include "cli/HostText.h"
#include "cli/ItemList.h"
#include "cli/ItemListing.h"
#include "cli/ItemPlace.h"
#include "cli/NewItemChecks.h"
#include "cli/ProjectJson.h"
#include "kern/Collate.h"
#include "project/HexStatus.h"
#include "session/NewItemWizard.h"

#include <filesystem>
#include <ostream>
#include <set>

namespace wbhost::cli {
namespace {

using project::ProjectItem;

// Makes the wizard program answer TEXT as the one item to create, unless the session's answers
// say otherwise already.
void AnswerWizard(runner::ProgramSession& programs, std::u16string text) {
    const std::string behaviour = "new-item-wizard";
    const runner::Terminals given = programs.AnswersFor(behaviour);
    if (given.find(0) == given.end())
        programs.SetAnswer(behaviour, 0, int32_t{0});
    if (given.find(3) == given.end())
        programs.SetAnswer(behaviour, 3, std::vector<std::u16string>{std::move(text)});
}

bool SaveProject(session::HostSession& session, const std::string& path, std::ostream& err) {
    std::string error;
    if (session.Save(path, &error))
        return true;
    err << "wbhost: " << error << "\n";
    return false;
}

} // namespace

int RunProjectNew(const HostOptions& options, const std::string& projectPath,
                  const std::vector<std::string>& targets, bool replace, std::ostream& out,
                  std::ostream& err) {
    if (!replace && std::filesystem::exists(projectPath)) {
        err << "wbhost: " << projectPath << " exists already (--force replaces it)\n";
        return kProjectFailed;
    }
    session::HostSession session;
    std::string error;
    if (!StartSession(options, session, err))
        return kProjectFailed;
    const std::u16string projectName = FromUtf8(std::filesystem::path(projectPath).stem().string());
    if (!session.NewProject(projectName, &error)) {
        err << "wbhost: " << error << "\n";
        return kProjectFailed;
    }
    project::Project& project = *session.Project();
    std::set<std::u16string> seen;
    for (const std::string& text : targets) {
        const size_t equals = text.find('=');
        if (equals == std::string::npos || equals == 0 || equals + 1 == text.size()) {
            err << "wbhost: target \"" << text << "\" is not of the form NAME=DESCRIPTION.xml\n";
            return kProjectFailed;
        }
        const std::u16string name = FromUtf8(text.substr(0, equals));
        if (ChildNamed(project.Root(), name) != nullptr) {
            err << "wbhost: two targets are called \"" << text.substr(0, equals) << "\"\n";
            return kProjectFailed;
        }
        const auto target = project.AddTarget(name, AbsolutePath(text.substr(equals + 1)), &error);
        if (!target) {
            err << "wbhost: " << error << "\n";
            return kProjectFailed;
        }
        for (const auto& problem : project.TargetOf(*target.Get())->Target().problems)
            err << "warning: " << text.substr(equals + 1) << ": " << ToUtf8(problem.path) << ": "
                << ToUtf8(problem.message) << "\n";
    }
    if (!SaveProject(session, projectPath, err))
        return kProjectFailed;
    out << "created " << projectPath << "\n";
    PrintItemTree(project.Root(), out);
    FinishSession(options, session, out);
    return kProjectOk;
}

int RunProjectList(const HostOptions& options, const std::string& projectPath, std::ostream& out,
                   std::ostream& err) {
    session::HostSession session;
    if (!StartProjectSession(options, session, projectPath, err))
        return kProjectFailed;
    PrintItemTree(session.Project()->Root(), out);
    FinishSession(options, session, out);
    return kProjectOk;
}

int RunProjectJson(const HostOptions& options, const std::string& projectPath, std::ostream& out,
                   std::ostream& err) {
    session::HostSession session;
    if (!StartProjectSession(options, session, projectPath, err))
        return kProjectFailed;
    WriteProjectJson(*session.Project(), out);
    // The program runs go to the error stream here, so that OUT stays one JSON document.
    FinishSession(options, session, err);
    return kProjectOk;
}

int RunAddItem(const HostOptions& options, const std::string& projectPath,
               const AddItemRequest& request, std::ostream& out, std::ostream& err) {
    session::HostSession session;
    ProjectItem* const target =
        OpenProjectTarget(options, session, projectPath, request.target, err);
    if (target == nullptr)
        return kProjectFailed;
    project::Project& project = *session.Project();
    // Resource paths are kept as the tree writes them, whatever spelling found the node.
    const std::u16string resource = ResourceNodePath(project, *target, FromUtf8(request.resource));
    if (resource.empty()) {
        err << "wbhost: target \"" << request.target << "\" has no resource \"" << request.resource
            << "\"\n";
        return kProjectFailed;
    }
    const std::u16string place = request.name.empty()
                                     ? resource.substr(resource.find_last_of(u'/') + 1)
                                     : FromUtf8(request.name);
    const std::vector<std::u16string> parts = PlaceParts(place);
    if (parts.empty()) {
        err << "wbhost: \"" << ToUtf8(place) << "\" is no item name (empty name or folder)\n";
        return kProjectFailed;
    }
    if (const std::string conflict = PlaceConflict(*target, parts, IOItemNames(*target));
        !conflict.empty()) {
        err << "wbhost: " << conflict << "\n";
        return kProjectFailed;
    }
    std::vector<SetAttribute> attributes;
    for (const std::string& text : request.attributes) {
        std::pair<std::string, std::string> attribute;
        if (const auto why = SplitAttributeText(text, attribute)) {
            err << "wbhost: " << *why << "\n";
            return kProjectFailed;
        }
        attributes.emplace_back(FromUtf8(attribute.first), FromUtf8(attribute.second));
    }
    // The wizard program's answer, as a user filling it in would give it; answers given on the
    // command line (a cancelled wizard, say) stand.
    AnswerWizard(session.Programs(), NewItemAttributeSet(place, resource, attributes));
    const session::WizardOutcome wizard = session::RunNewItemWizard(session, *target);
    if (FAILED(wizard.status)) {
        err << "wbhost: the module's wizard did not add \"" << ToUtf8(place) << "\" (status "
            << HexStatus(wizard.status) << ")\n";
        return kProjectFailed;
    }
    if (wizard.cancelled) {
        out << "the wizard was cancelled: nothing was added\n";
        FinishSession(options, session, out);
        return kProjectOk;
    }
    if (!SaveProject(session, projectPath, err))
        return kProjectFailed;
    out << "added \"" << ToUtf8(place) << "\" for " << request.resource << " to target \""
        << ToUtf8(target->Name()) << "\" through the wizard";
    if (!wizard.offered.empty())
        out << " (" << ToUtf8(wizard.offered) << ")";
    out << "\n";
    PrintItemTree(*target, out);
    FinishSession(options, session, out);
    return kProjectOk;
}

int RunRemoveItem(const HostOptions& options, const std::string& projectPath,
                  const std::string& targetName, const std::string& itemPath, std::ostream& out,
                  std::ostream& err) {
    session::HostSession session;
    ProjectItem* const target = OpenProjectTarget(options, session, projectPath, targetName, err);
    if (target == nullptr)
        return kProjectFailed;
    project::Project& project = *session.Project();
    ProjectItem* item = ItemAt(*target, FromUtf8(itemPath));
    if (item == nullptr) {
        err << "wbhost: target \"" << targetName << "\" has no item \"" << itemPath << "\"\n";
        return kProjectFailed;
    }
    if (const HRESULT hr = project.RemoveItem(*item); FAILED(hr))
        err << "warning: the item's object answered its removal with status " << HexStatus(hr)
            << "\n";
    if (!SaveProject(session, projectPath, err))
        return kProjectFailed;
    out << "removed \"" << itemPath << "\" from target \"" << targetName << "\"\n";
    PrintItemTree(*target, out);
    FinishSession(options, session, out);
    return kProjectOk;
}

} // namespace wbhost::cli
