// The work behind `wbhost edit`.
#include "cli/EditCommands.h"

#include "cli/HostText.h"
#include "cli/HostedModule.h"
#include "cli/ItemListing.h"
#include "cli/ItemStates.h"
#include "project/AtomicFile.h"
#include "project/HexStatus.h"
#include "resource_tree/ResTreeWriter.h"
#include "resources/InputFile.h"
#include "resources/NodeLookup.h"

#include <filesystem>
#include <new>
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
    case EditKind::SetProperty:
        break; // through the module: ApplyPropertyEdit
    }
    return false;
}

// Sets the property REQUEST names through the module's TIOResTree_SetProperty, with the host
// strings a host program hands it; false with the reason on ERR.
bool ApplyPropertyEdit(const session::HostSession& session, const resources::Target& target,
                       const EditRequest& request, std::ostream& out, std::ostream& err) {
    using SetPropertyFn = int32_t(const WBRefNum*, WBHandle, WBHandle, uint8_t*);
    auto* setProperty = session.Module()->Find<SetPropertyFn>("TIOResTree_SetProperty");
    if (setProperty == nullptr) {
        err << "wbhost: the module does not export TIOResTree_SetProperty\n";
        return false;
    }
    const std::u16string path = FromUtf8(request.node);
    const resources::NodeLookup reached = target.tree->Lookup(path);
    const OwnedHandle hostPath = NewHostString(ToHostText(request.node));
    const OwnedHandle value = NewHostString(ToHostText(request.argument));
    if (!hostPath || !value)
        throw std::bad_alloc();
    uint8_t set = 0;
    const int32_t status = setProperty(&target.refnum, hostPath.get(), value.get(), &set);
    if (status != 0) {
        err << "wbhost: the module could not set " << request.node << " (status "
            << HexStatus(status) << ")\n";
        return false;
    }
    if (set == 0) {
        err << "wbhost: nothing was set: the end of \"" << request.node
            << "\" is no single property name below an existing node\n";
        return false;
    }
    std::u16string_view property = std::u16string_view(path).substr(reached.matched);
    if (!property.empty() && property.front() == u'/')
        property.remove_prefix(1);
    out << "set the property " << ToUtf8(property) << "=\"" << request.argument << "\" on "
        << ToUtf8(reached.deepest->Path()) << "\n";
    return true;
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
        {"set-property", EditKind::SetProperty, 2, "set-property PATH VALUE"},
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
            "\" (rename, remove, insert, set-attribute, remove-attribute or set-property)";
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
    ProjectItem* const target =
        OpenProjectTarget(options, session, projectPath, request.target, err);
    if (target == nullptr)
        return 1;
    project::Project& project = *session.Project();
    const resources::Target& hardware = project.TargetOf(*target)->Target();
    resources::ResourceTree& tree = *hardware.tree;
    const bool applied = request.kind == EditKind::SetProperty
                             ? ApplyPropertyEdit(session, hardware, request, out, err)
                             : ApplyEdit(tree, request, out, err);
    if (!applied)
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
