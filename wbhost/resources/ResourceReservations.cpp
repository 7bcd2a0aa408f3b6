// Reservations of host resource-tree nodes by project items.
#include "resources/ResourceTree.h"

#include <algorithm>

namespace wbhost::resources {
namespace {

constexpr uint32_t kSharedMode = 3;

bool Holds(const qv::com::ComPtr<IwbProjectItem>& holder, IwbProjectItem* item) {
    return holder.Get() == item;
}

} // namespace

HRESULT ResourceTree::Reserve(wbhw::ResTreeNode& node, IwbProjectItem* item, uint32_t mode) {
    if (item == nullptr)
        return E_POINTER;
    if (mode != kSharedMode)
        return E_NOTIMPL;
    if (FAILED(reserveFailure_))
        return reserveFailure_;
    const std::lock_guard guard(mutex_);
    const std::shared_ptr<NodeState> state = Track(node);
    auto& holders = state->holders;
    const auto at = std::find_if(holders.begin(), holders.end(),
                                 [item](const auto& h) { return Holds(h, item); });
    if (at == holders.end()) {
        holders.push_back(qv::com::ComPtr<IwbProjectItem>::Share(item));
        // Whoever watches the node learns that its holders changed (the new item may be the
        // second one asking, which the first one's status depends on).
        Deliver(state, wbhw::node_event::kFromReservation);
    }
    // Delivery may have changed the list; the answer is about the list as it is now.
    const auto& now = state->holders;
    return !now.empty() && Holds(now.front(), item) ? S_OK : S_FALSE;
}

HRESULT ResourceTree::QueryReservation(wbhw::ResTreeNode& node, IwbProjectItem* item) {
    if (item == nullptr)
        return E_POINTER;
    const std::lock_guard guard(mutex_);
    const NodeState* state = FindState(node);
    return state != nullptr && !state->holders.empty() && Holds(state->holders.front(), item)
               ? S_OK
               : S_FALSE;
}

HRESULT ResourceTree::ReleaseReservation(wbhw::ResTreeNode& node, IwbProjectItem* item) {
    if (item == nullptr)
        return E_POINTER;
    const std::lock_guard guard(mutex_);
    if (FindState(node) == nullptr)
        return S_FALSE;
    const std::shared_ptr<NodeState> state = Track(node);
    auto& holders = state->holders;
    const auto at = std::find_if(holders.begin(), holders.end(),
                                 [item](const auto& h) { return Holds(h, item); });
    if (at == holders.end())
        return S_FALSE;
    // Kept until the list is settled and the watchers told: the item may go with this reference.
    const qv::com::ComPtr<IwbProjectItem> released = std::move(*at);
    holders.erase(at);
    Deliver(state, wbhw::node_event::kFromReservation);
    return S_OK;
}

std::vector<IwbProjectItem*> ResourceTree::ReservingItems(wbhw::ResTreeNode& node,
                                                          IwbProjectItem* except) {
    const std::lock_guard guard(mutex_);
    std::vector<IwbProjectItem*> items;
    if (const NodeState* state = FindState(node)) {
        for (const auto& holder : state->holders) {
            if (holder.Get() != except)
                items.push_back(holder.Get());
        }
    }
    return items;
}

} // namespace wbhost::resources
