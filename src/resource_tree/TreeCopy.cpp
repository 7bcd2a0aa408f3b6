// The resource-tree builder: merging, prototype and names copies, and variables.
#include "resource_tree/ListText.h"
#include "resource_tree/ParseStack.h"

namespace wbhw {

ResTreePosition ParseStack::MergeOrReplace(ResTreeNode& node, const std::u16string& name,
                                           const std::u16string& type, bool ordered, bool overwrite,
                                           ResTreeNode** guarded) {
    const ResTreeNode::Place place = node.Locate(name);
    if (!place.found)
        return place.position;
    const ResTreePosition found = place.position;
    ResTreeNode* child = found->Child();
    if (overwrite && child != nullptr && qv::kern::EqualsNoCase(child->Type(), type) &&
        child->IsOrdered() == ordered)
        return found;
    // A prototype inside the entry about to go would be read after it was deleted.
    if (guarded != nullptr && *guarded != nullptr && child != nullptr &&
        IsAncestorOrSelf(child, *guarded))
        *guarded = nullptr;
    if (!node.RemoveAt(found)) {
        AddError(node, u"Unable to replace a node that is still being loaded: " + name);
        return found;
    }
    return node.End();
}

void ParseStack::CopyEntries(ResTreeNode& source, ResTreeNode& destination, bool overwrite,
                             int depth) {
    if (depth > context_.settings.maxElementDepth) {
        AddError(destination, u"The copy is nested too deeply; its deeper levels are left out.");
        return;
    }
    for (ResTreePosition at = source.Begin(); at != source.End(); ++at) {
        const EntryKind kind = at->Kind();
        if (IsTextKind(kind)) {
            CountEntry(at->Name().size() + at->Text()->size());
            const auto added =
                destination.AddText(destination.End(), at->Name(), *at->Text(), kind);
            if (!added.inserted && overwrite)
                destination.SetTextAt(added.position, *at->Text());
        } else if (kind == EntryKind::Child && at->Child() != nullptr) {
            ResTreeNode& from = *at->Child();
            const ResTreePosition place = MergeOrReplace(destination, at->Name(), from.Type(),
                                                         from.IsOrdered(), overwrite, nullptr);
            CountEntry(at->Name().size() + from.Type().size());
            const auto made =
                destination.AddChildAt(destination.IsOrdered() ? destination.End() : place,
                                       at->Name(), from.Type(), from.IsOrdered());
            if (made.node != nullptr && !IsAncestorOrSelf(&from, made.node) &&
                !IsAncestorOrSelf(made.node, &from))
                CopyEntries(from, *made.node, overwrite, depth + 1);
        } else if (kind == EntryKind::Link) {
            // The copy points at the node the original points at.
            const std::u16string target = JoinResourcePath(source.Path(), *at->Text());
            CountEntry(at->Name().size() + target.size());
            destination.AddLink(destination.End(), at->Name(),
                                RelativeResourcePath(destination.Path(), target));
        }
    }
}

void ParseStack::MakeNameCopies(Frame& frame) {
    const std::vector<ExpandedName> names = std::move(frame.pendingNames);
    frame.pendingNames.clear();
    ResTreeNode* const model = frame.namesTemplate;
    frame.namesTemplate = nullptr;
    if (model == nullptr || names.size() < 2)
        return;
    ResTreeNode& node = *frame.node;
    NodeInUse keepModel(model);
    // The previous copy stays in use so that a later name cannot delete it and strand the
    // insertion point.
    std::unique_ptr<NodeInUse> keepPrevious;
    ResTreePosition previous = frame.templatePosition;
    for (size_t i = 1; i < names.size(); ++i) {
        const ExpandedName& copy = names[i];
        ResTreePosition at = MergeOrReplace(node, copy.name, model->Type(), model->IsOrdered(),
                                            frame.namesOverwrite, nullptr);
        if (node.IsOrdered()) {
            at = previous;
            ++at;
        }
        CountEntry(copy.name.size() + model->Type().size());
        const auto made = node.AddChildAt(at, copy.name, model->Type(), model->IsOrdered());
        if (made.node == nullptr || IsAncestorOrSelf(model, made.node)) {
            AddError(node, u"Unable to copy the node for the name: " + copy.name);
            continue;
        }
        CopyEntries(*model, *made.node, frame.namesOverwrite, 0);
        VariableMap variables{{u"name", copy.name}};
        if (!copy.variable.empty())
            variables.emplace(copy.variable, DecimalText(copy.index));
        SubstituteInSubtree(*made.node, variables, 0);
        previous = made.position;
        keepPrevious = std::make_unique<NodeInUse>(made.node);
    }
    VariableMap own{{u"name", names.front().name}};
    if (!names.front().variable.empty())
        own.emplace(names.front().variable, DecimalText(names.front().index));
    SubstituteInSubtree(*model, own, 0);
}

void ParseStack::SubstituteInSubtree(ResTreeNode& node, const VariableMap& variables, int depth) {
    if (variables.empty() || depth > context_.settings.maxElementDepth)
        return;
    NodeInUse keep(&node);
    if (node.Find(u":DeferredLoadPath") != node.End())
        node.LoadDeferred();
    std::vector<ResTreeNode*> children;
    for (ResTreePosition at = node.Begin(); at != node.End(); ++at) {
        if (at->Kind() == EntryKind::Child && at->Child() != nullptr) {
            children.push_back(at->Child());
            continue;
        }
        if (!IsTextKind(at->Kind()) || at->Text()->find(u"#{") == std::u16string::npos)
            continue;
        std::u16string text = *at->Text();
        if (SubstituteVariables(text, variables)) {
            CountText(text.size());
            node.SetTextAt(at, std::move(text));
        }
    }
    // Loading deferred content below may change this node's entries; the children are held in
    // use so that none of them is deleted before its turn.
    std::vector<std::unique_ptr<NodeInUse>> held;
    held.reserve(children.size());
    for (ResTreeNode* child : children)
        held.push_back(std::make_unique<NodeInUse>(child));
    for (ResTreeNode* child : children)
        SubstituteInSubtree(*child, variables, depth + 1);
}

VariableMap ParseStack::ContextVariables() const {
    VariableMap variables;
    for (size_t i = 0; i < depth_; ++i) {
        for (const auto& [key, value] : frames_[i]->pendingAttributes)
            variables.emplace(key, value);
    }
    if (const ResTreeNode* root = frames_[0]->documentRoot)
        variables.emplace(u"document-root", root->Path());
    for (size_t i = 0; i < depth_; ++i) {
        for (const ExpandedName& pending : frames_[i]->pendingNames) {
            if (!pending.variable.empty())
                variables.erase(pending.variable);
        }
    }
    variables.erase(u"name");
    return variables;
}

} // namespace wbhw
