// A handle on a node of a host resource tree (IwbhwResourceTreeNode) that reads like the tree
// it stands for: lookups answer an empty handle or an absent value, failing host calls throw
// StatusError with the host's status.
#pragma once

#include "com/ComPtr.h"
#include "host/contracts/IwbProjectItem.h"
#include "host/contracts/IwbhwResourceTreeNode.h"

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace qv::host {

class ResourceNode {
public:
    ResourceNode() = default;
    // Holds NODE (a reference of its own); null gives an empty handle.
    explicit ResourceNode(IwbhwResourceTreeNode* node);
    // Adopts the reference NODE carries.
    static ResourceNode Adopt(IwbhwResourceTreeNode* node);
    // The node OBJECT (any interface of it) answers; empty when it is no resource-tree node.
    static ResourceNode From(IUnknown* object);

    explicit operator bool() const noexcept { return static_cast<bool>(node_); }
    IwbhwResourceTreeNode* Get() const noexcept { return node_.Get(); }
    // Same node: the objects' identities match (both empty counts as the same).
    bool SameAs(const ResourceNode& other) const;

    std::u16string Name() const;
    std::u16string Path() const;
    std::u16string ElementType() const;
    std::u16string Value() const;
    // The attribute NAME, or nothing when the node has none.
    std::optional<std::u16string> Attribute(std::u16string_view name) const;
    // The attributes in the node's order.
    std::vector<std::pair<std::u16string, std::u16string>> Attributes() const;
    void SetAttribute(std::u16string_view name, std::u16string_view value) const;
    // The parent; empty at the root.
    ResourceNode Parent() const;
    // The children, all or those of element TYPE, in order.
    std::vector<ResourceNode> Children() const;
    std::vector<ResourceNode> ChildrenOfType(std::u16string_view type) const;
    // The descendant at the relative PATH, or empty; MATCHED (optional) receives how many
    // characters of PATH named existing nodes.
    ResourceNode Find(std::u16string_view path, uint32_t* matched = nullptr) const;

    void AddObserver(IwbhwResourceTreeNodeObserver* observer, uint32_t mask, uint32_t kind) const;
    // Removes OBSERVER's registration of KIND (1 when there was none: not a failure).
    void RemoveObserver(IwbhwResourceTreeNodeObserver* observer, uint32_t kind,
                        bool wholeSubtree = false) const;

    // Reserve (0 granted, 1 held by another), QueryReservation (0 held by ITEM, 1 not) and
    // ReleaseReservation (1 when ITEM held none), with the host's answers.
    HRESULT Reserve(IwbProjectItem* item, uint32_t mode) const;
    HRESULT QueryReservation(IwbProjectItem* item) const;
    HRESULT ReleaseReservation(IwbProjectItem* item) const;
    // The project items other than EXCEPT (may be null) that reserve the node, in the host's
    // order.
    std::vector<qv::com::ComPtr<IwbProjectItem>> ReservingItems(IwbProjectItem* except) const;

    // Runs BODY with the node's notifications silenced, restoring them whatever BODY does.
    template <class Body> void Silenced(Body&& body) const;

private:
    uint32_t SaveNotificationState() const;
    void RestoreNotificationState(uint32_t state) const noexcept;
    qv::com::ComPtr<IwbhwResourceTreeNode> node_;
};

template <class Body> void ResourceNode::Silenced(Body&& body) const {
    const uint32_t saved = SaveNotificationState();
    try {
        body();
    } catch (...) {
        RestoreNotificationState(saved);
        throw;
    }
    RestoreNotificationState(saved);
}

} // namespace qv::host
