// One target's resource tree as the host's hardware-resource service keeps it: the nodes, and
// for each node its observers, its reservations and the COM object that stands for it.
#pragma once

#include "com/ComPtr.h"
#include "host/contracts/IwbProjectItem.h"
#include "host/contracts/IwbhwResourceTreeNode.h"
#include "host/contracts/IwbhwResourceTreeNodeObserver.h"
#include "resource_tree/ResTreeNode.h"
#include "resources/NodeLookup.h"

#include <cstdint>
#include <memory>
#include <mutex>
#include <string_view>
#include <unordered_map>
#include <utility>
#include <vector>

namespace wbhost::resources {

class HostResourceNode;

// What the service keeps for a node beyond its entries. It outlives the node when a COM object
// still refers to it: NODE then reads null and every call on that object fails.
struct NodeState {
    struct Registration {
        qv::com::ComPtr<IwbhwResourceTreeNodeObserver> observer;
        uint32_t mask;
        uint32_t kind;
    };
    wbhw::ResTreeNode* node = nullptr;
    std::vector<Registration> observers;
    // Reserving items in the order they asked; the first one holds the reservation.
    std::vector<qv::com::ComPtr<IwbProjectItem>> holders;
    bool silenced = false;
    bool removing = false;              // its removal is being announced
    HostResourceNode* object = nullptr; // the node's COM object while it lives; not owning
};

class ResourceTree : public std::enable_shared_from_this<ResourceTree> {
public:
    // A tree over ROOT (never null).
    static std::shared_ptr<ResourceTree> Create(std::unique_ptr<wbhw::ResTreeNode> root);
    ~ResourceTree();
    ResourceTree(const ResourceTree&) = delete;
    ResourceTree& operator=(const ResourceTree&) = delete;

    // Guards the nodes and their states. Recursive: observers are called with it held and may
    // call back into the tree.
    std::recursive_mutex& Mutex() const noexcept { return mutex_; }
    // The root node.
    wbhw::ResTreeNode& Root() noexcept { return *root_; }
    // The node at PATH below FROM (the root when null), or null; see FindDescendant.
    wbhw::ResTreeNode* Find(std::u16string_view path, wbhw::ResTreeNode* from = nullptr,
                            uint32_t* matched = nullptr);
    // The whole answer of the walk along PATH from FROM (the root when null): the node, how much
    // of PATH matched and the deepest node reached.
    NodeLookup Lookup(std::u16string_view path, wbhw::ResTreeNode* from = nullptr);
    // The COM object of NODE, with a reference; one object per node while it lives. E_POINTER
    // for a null OUT, E_INVALIDARG for a null node.
    HRESULT NodeObject(wbhw::ResTreeNode* node, IwbhwResourceTreeNode** out);
    // Called by a node's COM object as it goes, so the next request makes a new one.
    void ForgetObject(NodeState& state, const HostResourceNode* object);

    // Observers. A second registration of OBSERVER with KIND replaces the mask. Removal: 1 when
    // nothing was registered; KIND 0xFFFFFFFF removes every kind, below NODE too when WHOLESUBTREE.
    HRESULT AddObserver(wbhw::ResTreeNode& node, IwbhwResourceTreeNodeObserver* observer,
                        uint32_t mask, uint32_t kind);
    HRESULT RemoveObserver(wbhw::ResTreeNode& node, IwbhwResourceTreeNodeObserver* observer,
                           uint32_t kind, bool wholeSubtree);
    // The node's notification state (1 silenced, 0 not); saving silences the node.
    uint32_t SaveNotificationState(wbhw::ResTreeNode& node);
    void RestoreNotificationState(wbhw::ResTreeNode& node, uint32_t state);

    // Edits; each tells the observers of every node it affects.
    // Sets the text entry NAME (0x8 added or 0x4 changed; "DisplayName" also 0x2, and 0x200 on
    // the parent). 1 when NAME is empty or names a child or link entry.
    HRESULT SetAttribute(wbhw::ResTreeNode& node, std::u16string_view name,
                         std::u16string_view value);
    // Removes the text entry NAME (0x10; "DisplayName" also 0x2, and 0x200 on the parent). 1
    // when NODE has no text entry of that name.
    HRESULT RemoveAttribute(wbhw::ResTreeNode& node, std::u16string_view name);
    // Renames NODE (0x2 on it, 0x200 on its parent, 0x20 on every descendant). E_INVALIDARG for
    // an empty name or one that a sibling already has; the root is renamed too.
    HRESULT Rename(wbhw::ResTreeNode& node, std::u16string_view newName);
    // Loads the resource-tree document XML as a new part below NODE (0x100 on NODE). A document
    // that does not load changes nothing and answers E_FAIL; an empty one E_INVALIDARG.
    HRESULT InsertSubTree(wbhw::ResTreeNode& node, std::u16string_view xml);
    // Removes the child NAME of NODE with its subtree: 0x400, the descendants' own 0x400 and
    // 0x1, then 0x1 on the child, and 0x80 on NODE. 1 when NODE has no such child.
    HRESULT RemoveChild(wbhw::ResTreeNode& node, std::u16string_view name);

    // Reservations of NODE by project items. Mode 3 records ITEM and answers 0 when it holds the
    // reservation, 1 when another item does; other modes answer E_NOTIMPL. A change of holder
    // raises 0x40 on the node.
    HRESULT Reserve(wbhw::ResTreeNode& node, IwbProjectItem* item, uint32_t mode);
    // Test hook: Reserve answers STATUS (a failure) and records nothing, until S_OK is given.
    void FailReservations(HRESULT status) noexcept { reserveFailure_ = status; }
    // 0 when ITEM holds the reservation, 1 when not.
    HRESULT QueryReservation(wbhw::ResTreeNode& node, IwbProjectItem* item);
    // Forgets ITEM's request; 1 when it had none. The next item in line then holds it.
    HRESULT ReleaseReservation(wbhw::ResTreeNode& node, IwbProjectItem* item);
    // The reserving items other than EXCEPT (may be null), in order, without references added.
    std::vector<IwbProjectItem*> ReservingItems(wbhw::ResTreeNode& node, IwbProjectItem* except);

    // How many observer calls the tree has made so far (for measurements).
    uint64_t Notifications() const noexcept { return notifications_; }

    // Drops every observer and reservation (they hold references on items, which hold references
    // on nodes); the service calls it when it lets a tree go.
    void Shutdown();

private:
    explicit ResourceTree(std::unique_ptr<wbhw::ResTreeNode> root);

    // Deliveries to make, in order. Observers run in between and may edit the tree, so nodes
    // are held through their states, which read null once a node is gone.
    using Plan = std::vector<std::pair<std::shared_ptr<NodeState>, uint32_t>>;

    NodeState& StateOf(wbhw::ResTreeNode& node);
    NodeState* FindState(const wbhw::ResTreeNode& node);
    std::shared_ptr<NodeState> Track(wbhw::ResTreeNode& node);
    // Tells the observers of the node of STATE (when it still lives) of EVENTS, each only of the
    // bits in its mask.
    void Deliver(const std::shared_ptr<NodeState>& state, uint32_t events);
    void Run(const Plan& plan);
    // Tells NODE's observers of EVENTS, a change of its text entry NAME ("DisplayName" also
    // changes the display name, which NODE's parent hears of).
    void RunAttributeChange(wbhw::ResTreeNode& node, std::u16string_view name, uint32_t events);
    // EVENTS for every observed node below NODE, parents before children.
    void PlanDescendants(wbhw::ResTreeNode& node, uint32_t events, Plan& plan);
    // 0x400 for NODE, then its descendants' own 0x400 and 0x1, then 0x1 for NODE.
    void PlanRemoval(wbhw::ResTreeNode& node, Plan& plan);
    // Marks the states of NODE and everything below as gone; answers what they held.
    std::vector<NodeState> RetireSubtree(wbhw::ResTreeNode& node);
    void Rekey(const std::vector<std::pair<wbhw::ResTreeNode*, wbhw::ResTreeNode*>>& moved);

    mutable std::recursive_mutex mutex_;
    std::unique_ptr<wbhw::ResTreeNode> root_;
    std::unordered_map<const wbhw::ResTreeNode*, std::shared_ptr<NodeState>> states_;
    uint64_t notifications_ = 0;
    HRESULT reserveFailure_ = S_OK;
};

} // namespace wbhost::resources
