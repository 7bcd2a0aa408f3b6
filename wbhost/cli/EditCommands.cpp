// The work behind `wbhost edit`.
#include "cli/EditCommands.h"

#include "cli/HostText.h"
#include "cli/ItemListing.h"
#include "cli/ItemStates.h"
#include "project/AtomicFile.h"
#include "resource_tree/ResTreeWriter.h"
#include "resources/InputFile.h"

#include <filesystem>
#include <optional>
#include <ostream>

namespace wbhost::cli {
namespace {

using project::ProjectItem;
using wbhw::ResTreeNode;

// Sets or removes the attribute (text entry) of NODE that REQUEST names; false with the reason
// on ERR.
bool ApplyAttributeEdit(resources::ResourceTree& tree, ResTreeNode& node,
                        const EditRequest& request, std::ostream& out, std::ostream& err) {
    const std::u16string name = FromUtf8(request.argument);
    const std::string where = ToUtf8(node.Path());
    if (request.kind == EditKind::SetAttribute) {
        if (tree.SetAttribute(node, name, FromUtf8(request.value)) != S_OK) {
            err << "wbhost: " << where << " has a child or link called \"" << request.argument
                << "\", not an attribute\n";
            return false;
        }
        out << "set " << request.argument << "=\"" << request.value << "\" on " << where << "\n";
        return true;
    }
    if (tree.RemoveAttribute(node, name) != S_OK) {
        err << "wbhost: " << where << " has no attribute \"" << request.argument << "\"\n";
        return false;
    }
    out << "removed the attribute " << request.argument << " of " << where << "\n";
    return true;
}

// Applies REQUEST to TREE and tells OUT what changed; false with the reason on ERR.
bool ApplyEdit(resources::ResourceTree& tree, const EditRequest& request, std::ostream& out,
               std::ostream& err) {
    const std::lock_guard hold(tree.Mutex());
    const std::u16string path = FromUtf8(request.node == "/" ? std::string() : request.node);
    ResTreeNode* node = tree.Find(path);
    if (node == nullptr) {
        err << "wbhost: target \"" << request.target << "\" has no node \"" << request.node
            << "\"\n";
        return false;
    }
    const std::string where = ToUtf8(node->Path());
    switch (request.kind) {
    case EditKind::Rename:
        if (FAILED(tree.Rename(*node, FromUtf8(request.argument)))) {
            err << "wbhost: cannot rename " << where << " to \"" << request.argument
                << "\" (an empty name, or a sibling has it)\n";
            return false;
        }
        out << "renamed " << where << " to \"" << request.argument << "\"\n";
        return true;
    case EditKind::Remove:
        if (node->Parent() == nullptr) {
            err << "wbhost: the root of a target cannot be removed\n";
            return false;
        }
        if (tree.RemoveChild(*node->Parent(), node->Name()) != S_OK) {
            err << "wbhost: cannot remove " << where << "\n";
            return false;
        }
        out << "removed " << where << "\n";
        return true;
    case EditKind::Insert: {
        std::string document;
        std::string error;
        if (!project::ReadWholeFile(request.argument, document, &error)) {
            err << "wbhost: cannot read " << error << "\n";
            return false;
        }
        if (FAILED(tree.InsertSubTree(*node, resources::DecodeDocument(document)))) {
            err << "wbhost: " << request.argument
                << " does not load as a resource-tree document; nothing was inserted\n";
            return false;
        }
        out << "inserted " << request.argument << " under " << where << "\n";
        return true;
    }
    case EditKind::SetAttribute:
    case EditKind::RemoveAttribute:
        return ApplyAttributeEdit(tree, *node, request, out, err);
    }
    return false;
}

// Writes TREE to the file KEPT, atomically; PREVIOUS receives what KEPT held (nullopt: there
// was no such file), so a failed save can put it back. False with the reason on ERR.
bool KeepTree(resources::ResourceTree& tree, const std::string& kept,
              std::optional<std::string>& previous, std::ostream& err) {
    std::string content;
    if (project::ReadWholeFile(kept, content, nullptr))
        previous = std::move(content);
    const wbhw::ResTreeDocument document = [&] {
        const std::lock_guard hold(tree.Mutex());
        return wbhw::WriteResTree(tree.Root());
    }();
    if (!document.faithful)
        err << "warning: parts of the changed tree (a link that leads nowhere now, for example) "
               "do not read back the same from "
            << kept << "\n";
    std::string error;
    if (project::WriteFileAtomically(kept, ToUtf8(document.xml), &error))
        return true;
    err << "wbhost: cannot keep the changed tree: " << error << "\n";
    return false;
}

// Puts the file KEPT back as KeepTree found it.
void RestoreKept(const std::string& kept, const std::optional<std::string>& previous) {
    if (previous) {
        project::WriteFileAtomically(kept, *previous, nullptr);
        return;
    }
    std::error_code ignored;
    std::filesystem::remove(kept, ignored);
}

} // namespace

bool ParseEdit(const std::string& action, const std::vector<std::string>& arguments,
               EditRequest& request, std::string& error) {
    struct Shape {
        const char* action;
        EditKind kind;
        size_t count;
        const char* usage;
    };
    static constexpr Shape kShapes[] = {
        {"rename", EditKind::Rename, 2, "rename NODE NEWNAME"},
        {"remove", EditKind::Remove, 1, "remove NODE"},
        {"insert", EditKind::Insert, 2, "insert PARENT DOCUMENT.xml"},
        {"set-attribute", EditKind::SetAttribute, 3, "set-attribute NODE NAME VALUE"},
        {"remove-attribute", EditKind::RemoveAttribute, 2, "remove-attribute NODE NAME"},
    };
    for (const Shape& shape : kShapes) {
        if (action != shape.action)
            continue;
        if (arguments.size() != shape.count) {
            error = std::string("usage: edit PROJECT TARGET ") + shape.usage;
            return false;
        }
        request.kind = shape.kind;
        request.node = arguments[0];
        request.argument = shape.count > 1 ? arguments[1] : std::string();
        request.value = shape.count > 2 ? arguments[2] : std::string();
        return true;
    }
    error = "unknown edit \"" + action +
            "\" (rename, remove, insert, set-attribute or remove-attribute)";
    return false;
}

std::string EditedDescriptionPath(const std::string& projectPath, std::u16string_view targetName) {
    std::string name;
    for (const char c : ToUtf8(targetName)) {
        const bool plain = (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') ||
                           (c >= '0' && c <= '9') || c == '-' || c == '_';
        name += plain ? c : '_';
    }
    return projectPath + "." + name + ".xml";
}

int RunEdit(const HostOptions& options, const std::string& projectPath, const EditRequest& request,
            std::ostream& out, std::ostream& err) {
    session::HostSession session;
    if (!StartProjectSession(options, session, projectPath, err))
        return 1;
    project::Project& project = *session.Project();
    ProjectItem* target = FindTarget(project, request.target, err);
    if (target == nullptr)
        return 1;
    resources::ResourceTree& tree = *project.TargetOf(*target)->Target().tree;
    if (!ApplyEdit(tree, request, out, err))
        return 1;

    // The project refers to its targets' descriptions, so the changed tree must outlive this
    // process or a reopened project would show its items the tree they no longer follow.
    const std::string kept = AbsolutePath(EditedDescriptionPath(projectPath, target->Name()));
    std::optional<std::string> previous;
    if (!KeepTree(tree, kept, previous, err))
        return 1;
    target->SetDescriptionFile(kept);
    std::string error;
    if (!session.Save(projectPath, &error)) {
        // The project file still refers to what it did; so must the kept tree.
        RestoreKept(kept, previous);
        err << "wbhost: " << error << "\n";
        return 1;
    }
    out << "items of target \"" << ToUtf8(target->Name()) << "\" now:\n";
    PrintItemTree(*target, out, 1);
    out << "what they report:\n";
    PrintItemStates(*target, out);
    FinishSession(options, session, out);
    return 0;
}

} // namespace wbhost::cli
