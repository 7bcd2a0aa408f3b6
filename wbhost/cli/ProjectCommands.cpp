// The work behind `wbhost project new|list|add-item`.
#include "cli/ProjectCommands.h"

#include "cli/AttributeSet.h"
#include "cli/HostText.h"
#include "cli/ItemListing.h"
#include "cli/ProjectJson.h"
#include "kern/Collate.h"
#include "project/HexStatus.h"
#include "provider/TIOIdentifiers.h"

#include <filesystem>
#include <ostream>
#include <set>

namespace wbhost::cli {
namespace {

using project::ProjectItem;

// The child of PARENT called NAME (without regard to case), or null.
ProjectItem* ChildNamed(const ProjectItem& parent, std::u16string_view name) {
    for (const auto& child : parent.Children()) {
        if (qv::kern::EqualsNoCase(child->Name(), name))
            return child.Get();
    }
    return nullptr;
}

// NAME split at "/" into folder names and the item's name; empty when a part is empty.
std::vector<std::u16string> SplitPlace(std::u16string_view name) {
    std::vector<std::u16string> parts;
    while (true) {
        const size_t slash = name.find(u'/');
        parts.emplace_back(name.substr(0, slash));
        if (parts.back().empty())
            return {};
        if (slash == std::u16string_view::npos)
            return parts;
        name.remove_prefix(slash + 1);
    }
}

// The folder FOLDERNAME below PARENT, made when absent; null, with the reason on ERR, when an
// item of another type holds the name or the folder cannot be made.
ProjectItem* FolderIn(ProjectItem& parent, const std::u16string& folderName, std::ostream& err) {
    if (ProjectItem* existing = ChildNamed(parent, folderName)) {
        if (IsEqualGUID(existing->Type(), wbproj::kFolderType))
            return existing;
        err << "wbhost: \"" << ToUtf8(folderName) << "\" below \"" << ToUtf8(parent.Name())
            << "\" is a " << ItemTypeName(existing->Type()) << ", not a folder\n";
        return nullptr;
    }
    if (const HRESULT made = parent.CreateChild(wbproj::kFolderType, folderName.c_str(), nullptr);
        FAILED(made)) {
        err << "wbhost: cannot make the folder \"" << ToUtf8(folderName) << "\" (status "
            << HexStatus(made) << ")\n";
        return nullptr;
    }
    return ChildNamed(parent, folderName);
}

// The Tangent I/O item called NAME anywhere below SCOPE, or null.
const ProjectItem* IOItemNamed(const ProjectItem& scope, std::u16string_view name) {
    for (const auto& child : scope.Children()) {
        if (IsEqualGUID(child->Type(), tio::kIOItemType) &&
            qv::kern::EqualsNoCase(child->Name(), name))
            return child.Get();
        if (const ProjectItem* below = IOItemNamed(*child.Get(), name))
            return below;
    }
    return nullptr;
}

// Makes the Tangent I/O item NAME below PARENT with the attribute set BAG stored before its
// object loads, as a new item arrives with its bag; null with the reason on ERR. I/O item names
// are unique in their whole target (TARGET), folders or not.
ProjectItem* NewIOItem(project::Project& project, ProjectItem& target, ProjectItem& parent,
                       const std::u16string& name, const std::u16string& bag, std::ostream& err) {
    if (ProjectItem* existing = ChildNamed(parent, name)) {
        err << "wbhost: \"" << ToUtf8(parent.Name()) << "\" already has an item called \""
            << ToUtf8(existing->Name()) << "\"\n";
        return nullptr;
    }
    if (const ProjectItem* existing = IOItemNamed(target, name)) {
        err << "wbhost: target \"" << ToUtf8(target.Name())
            << "\" already has an I/O item called \"" << ToUtf8(existing->Name()) << "\"\n";
        return nullptr;
    }
    project::Property text;
    text.text = bag;
    qv::com::ComPtr<ProjectItem> item;
    if (const HRESULT made =
            project.CreateItem(parent, tio::kIOItemType, name, {{u"tioAttrBag", text}}, &item);
        FAILED(made)) {
        err << "wbhost: the module's provider cannot make a Tangent I/O item now (status "
            << HexStatus(made) << ")\n";
        return nullptr;
    }
    if (item->Object() == nullptr) {
        // A module that does not know the type leaves a bare item behind: not worth keeping.
        parent.RemoveChild(item.Get());
        err << "wbhost: the loaded module's provider does not make Tangent I/O items\n";
        return nullptr;
    }
    return item.Get();
}

// The path of the resource node PATH names in TARGET's tree, as the tree writes it; empty when
// there is no such node.
std::u16string ResourceNodePath(project::Project& project, ProjectItem& target,
                                std::u16string_view path) {
    project::TargetObject* object = project.TargetOf(target);
    if (object == nullptr)
        return {};
    resources::ResourceTree& tree = *object->Target().tree;
    const std::lock_guard hold(tree.Mutex());
    const wbhw::ResTreeNode* node = tree.Find(path);
    return node != nullptr ? node->Path() : std::u16string();
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
    if (!StartProjectSession(options, session, projectPath, err))
        return kProjectFailed;
    project::Project& project = *session.Project();
    ProjectItem* target = FindTarget(project, request.target, err);
    if (target == nullptr)
        return kProjectFailed;
    const std::u16string asked = FromUtf8(request.resource);
    const std::u16string resource =
        asked.empty() ? std::u16string() : ResourceNodePath(project, *target, asked);
    if (resource.empty() || resource == u"/") {
        err << "wbhost: target \"" << request.target << "\" has no resource \"" << request.resource
            << "\"\n";
        return kProjectFailed;
    }
    const std::u16string place = request.name.empty()
                                     ? resource.substr(resource.find_last_of(u'/') + 1)
                                     : FromUtf8(request.name);
    // Resource paths are kept as the tree writes them, whatever spelling found the node.
    const std::vector<std::u16string> parts = SplitPlace(place);
    if (parts.empty()) {
        err << "wbhost: \"" << ToUtf8(place) << "\" is no item name (empty name or folder)\n";
        return kProjectFailed;
    }
    ProjectItem* parent = target;
    for (size_t i = 0; i + 1 < parts.size() && parent != nullptr; ++i)
        parent = FolderIn(*parent, parts[i], err);
    ProjectItem* item = parent == nullptr ? nullptr
                                          : NewIOItem(project, *target, *parent, parts.back(),
                                                      NewItemAttributeSet(place, resource), err);
    if (item == nullptr)
        return kProjectFailed;
    if (!SaveProject(session, projectPath, err))
        return kProjectFailed;
    out << "added \"" << ToUtf8(place) << "\" for " << request.resource << " to target \""
        << ToUtf8(target->Name()) << "\"\n";
    PrintItemTree(*target, out);
    FinishSession(options, session, out);
    return kProjectOk;
}

int RunRemoveItem(const HostOptions& options, const std::string& projectPath,
                  const std::string& targetName, const std::string& itemPath, std::ostream& out,
                  std::ostream& err) {
    session::HostSession session;
    if (!StartProjectSession(options, session, projectPath, err))
        return kProjectFailed;
    project::Project& project = *session.Project();
    ProjectItem* target = FindTarget(project, targetName, err);
    if (target == nullptr)
        return kProjectFailed;
    ProjectItem* item = target;
    for (const std::u16string& part : SplitPlace(FromUtf8(itemPath))) {
        item = ChildNamed(*item, part);
        if (item == nullptr)
            break;
    }
    if (item == nullptr || item == target) {
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
