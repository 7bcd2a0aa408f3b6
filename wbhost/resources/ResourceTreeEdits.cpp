// The edits of a host resource tree and the change bits each of them raises.
#include "kern/Collate.h"
#include "resource_tree/ResTreeWriter.h"
#include "resources/ResourceTree.h"

#include <unordered_map>

namespace wbhost::resources {
namespace {

using wbhw::ResTreeNode;
using NodePairs = std::vector<std::pair<ResTreeNode*, ResTreeNode*>>;
namespace event = wbhw::node_event;

constexpr std::u16string_view kDisplayName = u"DisplayName";

// The entry of NODE that owns CHILD; NODE's End() when none does.
ResTreeNode::Position EntryOf(const ResTreeNode& node, const ResTreeNode* child) {
    for (auto entry = node.Begin(); entry != node.End(); ++entry) {
        if (entry->Child() == child)
            return entry;
    }
    return node.End();
}

// Copies the entries of FROM into TO in order, recording every node copied with its copy.
void CopyEntries(ResTreeNode& from, ResTreeNode& to, NodePairs& copies) {
    for (auto entry = from.Begin(); entry != from.End(); ++entry) {
        const wbhw::EntryKind kind = entry->Kind();
        if (wbhw::IsTextKind(kind)) {
            to.AddText(to.End(), entry->Name(), *entry->Text(), kind);
        } else if (kind == wbhw::EntryKind::Link) {
            to.AddLink(to.End(), entry->Name(), *entry->Text());
        } else if (ResTreeNode* child = entry->Child()) {
            ResTreeNode* copy =
                to.AddChild(to.End(), entry->Name(), child->Type(), child->IsOrdered()).node;
            copies.emplace_back(child, copy);
            CopyEntries(*child, *copy, copies);
        }
    }
}

// Copies NODE under PARENT as NAME, before BEFORE (ordered parents); the new node, or null when
// PARENT already holds an entry of that name and keeps names unique.
ResTreeNode* CopyChild(ResTreeNode& node, ResTreeNode& parent, ResTreeNode::Position before,
                       const wbhw::WString& name, NodePairs& copies) {
    const auto added = parent.AddChild(before, name, node.Type(), node.IsOrdered());
    if (!added.created)
        return nullptr;
    copies.emplace_back(&node, added.node);
    CopyEntries(node, *added.node, copies);
    return added.node;
}

} // namespace

HRESULT ResourceTree::SetAttribute(ResTreeNode& node, std::u16string_view name,
                                   std::u16string_view value) {
    if (name.empty())
        return S_FALSE;
    const std::lock_guard guard(mutex_);
    const auto found = node.FindLoading(name);
    uint32_t events = 0;
    if (found == node.End()) {
        node.AddText(node.End(), name, wbhw::WString(value));
        events = event::kValueAdded;
    } else if (node.SetTextAt(found, wbhw::WString(value))) {
        events = event::kValueChanged;
    } else {
        return S_FALSE; // a child or a link of that name: not a property
    }
    RunAttributeChange(node, name, events);
    return S_OK;
}

HRESULT ResourceTree::RemoveAttribute(ResTreeNode& node, std::u16string_view name) {
    const std::lock_guard guard(mutex_);
    const auto found = node.FindLoading(name);
    if (found == node.End() || !wbhw::IsTextKind(found->Kind()))
        return S_FALSE;
    // The entry's own spelling: NAME may differ in case, and the plan reads it after removal.
    const wbhw::WString removed = found->Name();
    node.RemoveAt(found);
    RunAttributeChange(node, removed, event::kValueRemoved);
    return S_OK;
}

void ResourceTree::RunAttributeChange(ResTreeNode& node, std::u16string_view name,
                                      uint32_t events) {
    const bool displayName = qv::kern::EqualsNoCase(name, kDisplayName);
    Plan plan{{Track(node), events | (displayName ? event::kDisplayName : 0)}};
    if (displayName && node.Parent() != nullptr)
        plan.emplace_back(Track(*node.Parent()), event::kChildDisplayName);
    Run(plan);
}

HRESULT ResourceTree::Rename(ResTreeNode& node, std::u16string_view newName) {
    if (newName.empty())
        return E_INVALIDARG;
    const std::lock_guard guard(mutex_);
    ResTreeNode* parent = node.Parent();
    if (parent == nullptr) {
        node.SetNameAndType(wbhw::WString(newName), node.Type());
    } else {
        const auto own = EntryOf(*parent, &node);
        const auto clash = parent->Find(newName);
        if (own == parent->End() || (clash != parent->End() && clash != own))
            return E_INVALIDARG;
        // An entry's name is its key in the parent, so a renamed node is a copy under the new
        // name in the old place. The copy is made aside first, since the old entry may hold the
        // new name already (a change of case only); the states move with the nodes.
        ResTreeNode aside(u"", u"", true);
        NodePairs toAside;
        ResTreeNode* parked = CopyChild(node, aside, aside.End(), node.Name(), toAside);
        auto next = own;
        ++next;
        parent->RemoveAt(own);
        NodePairs toParent;
        ResTreeNode* renamed = CopyChild(*parked, *parent, next, wbhw::WString(newName), toParent);
        if (renamed == nullptr)
            return E_FAIL; // cannot happen: the name was checked and the old entry is gone
        // Paired through the parked copy by identity: the two copies need not be walked in the
        // same order (a node that keeps its entries sorted lists them otherwise).
        std::unordered_map<const ResTreeNode*, ResTreeNode*> finalOf;
        for (const auto& [parkedNode, final] : toParent)
            finalOf.emplace(parkedNode, final);
        NodePairs moved;
        for (const auto& [original, parkedNode] : toAside)
            moved.emplace_back(original, finalOf.at(parkedNode));
        Rekey(moved);
        Plan plan{{Track(*renamed), event::kDisplayName},
                  {Track(*parent), event::kChildDisplayName}};
        PlanDescendants(*renamed, event::kFromAncestor, plan);
        Run(plan);
        return S_OK;
    }
    Plan plan{{Track(node), event::kDisplayName}};
    PlanDescendants(node, event::kFromAncestor, plan);
    Run(plan);
    return S_OK;
}

void ResourceTree::Rekey(const NodePairs& moved) {
    // Taken out first, put back after: the copies may live at addresses the old nodes had (their
    // memory is reused), so moving one state at a time could land on a key not moved yet.
    std::vector<std::pair<std::shared_ptr<NodeState>, ResTreeNode*>> taken;
    for (const auto& [from, to] : moved) {
        const auto found = states_.find(from);
        if (found == states_.end())
            continue;
        taken.emplace_back(std::move(found->second), to);
        states_.erase(found);
    }
    for (auto& [state, to] : taken) {
        state->node = to;
        states_[to] = std::move(state);
    }
}

HRESULT ResourceTree::InsertSubTree(ResTreeNode& node, std::u16string_view xml) {
    if (xml.empty())
        return E_INVALIDARG;
    const std::lock_guard guard(mutex_);
    // A document that fails half way would leave half a part behind: it is tried aside first.
    ResTreeNode trial(u"", u"", true);
    if (trial.ParseText(xml, true) != 0)
        return E_FAIL;
    if (node.ParseText(xml, true) != 0)
        return E_FAIL;
    Deliver(Track(node), event::kChildAdded);
    return S_OK;
}

HRESULT ResourceTree::RemoveChild(ResTreeNode& node, std::u16string_view name) {
    const std::lock_guard guard(mutex_);
    const auto found = node.FindLoading(name);
    if (found == node.End() || found->Child() == nullptr)
        return S_FALSE;
    const std::shared_ptr<NodeState> child = Track(*found->Child());
    // Its removal is already being announced: an observer asking again must not start a second
    // announcement, which would ask again, and so on.
    if (child->removing)
        return S_FALSE;
    Plan plan;
    PlanRemoval(*child->node, plan);
    child->removing = true;
    Run(plan);
    child->removing = false;
    // The observers may have edited the tree meanwhile (even removed this part or its parent);
    // what is left to do is worked out from the tree as it is now.
    if (child->node == nullptr || child->node->Parent() == nullptr)
        return S_OK;
    ResTreeNode& parent = *child->node->Parent();
    const auto entry = EntryOf(parent, child->node);
    if (entry == parent.End())
        return S_OK;
    const std::vector<NodeState> released = RetireSubtree(*child->node);
    parent.RemoveAt(entry);
    Deliver(Track(parent), event::kChildRemoved);
    return S_OK;
}

std::vector<NodeState> ResourceTree::RetireSubtree(ResTreeNode& node) {
    std::vector<NodeState> released;
    std::vector<ResTreeNode*> pending{&node};
    while (!pending.empty()) {
        ResTreeNode* at = pending.back();
        pending.pop_back();
        for (auto entry = at->Begin(); entry != at->End(); ++entry) {
            if (entry->Child() != nullptr)
                pending.push_back(entry->Child());
        }
        const auto found = states_.find(at);
        if (found == states_.end())
            continue;
        NodeState& state = *found->second;
        NodeState dropped;
        dropped.observers = std::move(state.observers);
        dropped.holders = std::move(state.holders);
        state.observers.clear();
        state.holders.clear();
        state.node = nullptr;
        released.push_back(std::move(dropped));
        states_.erase(found);
    }
    return released;
}

} // namespace wbhost::resources
