// Checks of new Tangent I/O items' places and resources.
#include "cli/NewItemChecks.h"

#include "cli/HostText.h"
#include "cli/ItemListing.h"
#include "provider/TIOIdentifiers.h"
#include "resource_tree/ListText.h"

#include <algorithm>
#include <mutex>

namespace wbhost::cli {

using project::ProjectItem;

namespace {

// The child of PARENT called NAME (without regard to case), or null.
const ProjectItem* ChildNamed(const ProjectItem& parent, std::u16string_view name) {
    for (const auto& child : parent.Children()) {
        if (qv::kern::EqualsNoCase(child->Name(), name))
            return child.Get();
    }
    return nullptr;
}

void CollectIONames(const ProjectItem& scope, NameSet& names) {
    for (const auto& child : scope.Children()) {
        if (IsEqualGUID(child->Type(), tio::kIOItemType))
            names.insert(child->Name());
        CollectIONames(*child.Get(), names);
    }
}

} // namespace

std::string Quoted(std::u16string_view text) {
    std::string quoted(1, '"');
    quoted += ToUtf8(text);
    quoted += '"';
    return quoted;
}

std::vector<std::u16string> PlaceParts(std::u16string_view name) {
    std::vector<std::u16string> parts = wbhw::SplitListText(name, u'/', false);
    const bool emptyPart =
        std::any_of(parts.begin(), parts.end(), [](const auto& part) { return part.empty(); });
    return emptyPart ? std::vector<std::u16string>() : parts;
}

NameSet IOItemNames(const ProjectItem& target) {
    NameSet names;
    CollectIONames(target, names);
    return names;
}

std::string PlaceConflict(const ProjectItem& target, const std::vector<std::u16string>& parts,
                          const NameSet& ioNames) {
    const ProjectItem* folder = &target;
    for (size_t i = 0; i + 1 < parts.size() && folder != nullptr; ++i) {
        const ProjectItem* existing = ChildNamed(*folder, parts[i]);
        if (existing != nullptr && !IsEqualGUID(existing->Type(), wbproj::kFolderType))
            return Quoted(parts[i]) + " below " + Quoted(folder->Name()) + " is a " +
                   ItemTypeName(existing->Type()) + ", not a folder";
        folder = existing;
    }
    // A folder that is still to be made holds nothing yet.
    if (const ProjectItem* existing = folder ? ChildNamed(*folder, parts.back()) : nullptr)
        return Quoted(folder->Name()) + " already has an item called " + Quoted(existing->Name());
    if (const auto named = ioNames.find(parts.back()); named != ioNames.end())
        return "target " + Quoted(target.Name()) + " already has an I/O item called " +
               Quoted(*named);
    return {};
}

std::u16string ResourceNodePath(project::Project& project, ProjectItem& target,
                                std::u16string_view path) {
    project::TargetObject* object = project.TargetOf(target);
    if (object == nullptr || path.empty())
        return {};
    resources::ResourceTree& tree = *object->Target().tree;
    const std::lock_guard hold(tree.Mutex());
    const wbhw::ResTreeNode* node = tree.Find(path);
    const std::u16string found = node != nullptr ? node->Path() : std::u16string();
    return found == u"/" ? std::u16string() : found;
}

} // namespace wbhost::cli
