// The host resource tree: node states, node objects, observers and change delivery.
#include "resources/ResourceTree.h"

#include "resources/HostResourceNode.h"
#include "resources/NodeLookup.h"

#include <algorithm>

namespace wbhost::resources {
namespace {

constexpr uint32_t kAnyKind = 0xFFFFFFFFu;

using NodeObjectImpl = CQVComObject<HostResourceNode>;

} // namespace

std::shared_ptr<ResourceTree> ResourceTree::Create(std::unique_ptr<wbhw::ResTreeNode> root) {
    return std::shared_ptr<ResourceTree>(new ResourceTree(std::move(root)));
}

ResourceTree::ResourceTree(std::unique_ptr<wbhw::ResTreeNode> root) : root_(std::move(root)) {}

ResourceTree::~ResourceTree() = default;

NodeState* ResourceTree::FindState(const wbhw::ResTreeNode& node) {
    const auto found = states_.find(&node);
    return found != states_.end() ? found->second.get() : nullptr;
}

NodeState& ResourceTree::StateOf(wbhw::ResTreeNode& node) {
    auto& slot = states_[&node];
    if (!slot) {
        slot = std::make_shared<NodeState>();
        slot->node = &node;
    }
    return *slot;
}

wbhw::ResTreeNode* ResourceTree::Find(std::u16string_view path, wbhw::ResTreeNode* from,
                                      uint32_t* matched) {
    const NodeLookup found = Lookup(path, from);
    if (matched != nullptr)
        *matched = found.matched;
    return found.node;
}

NodeLookup ResourceTree::Lookup(std::u16string_view path, wbhw::ResTreeNode* from) {
    const std::lock_guard guard(mutex_);
    return FindDescendant(from != nullptr ? *from : *root_, path);
}

HRESULT ResourceTree::NodeObject(wbhw::ResTreeNode* node, IwbhwResourceTreeNode** out) {
    if (out == nullptr)
        return E_POINTER;
    *out = nullptr;
    if (node == nullptr)
        return E_INVALIDARG;
    const std::lock_guard guard(mutex_);
    NodeState& state = StateOf(*node);
    // The object may be on its way out (its count reached zero); then a new one takes its place.
    if (state.object != nullptr && static_cast<NodeObjectImpl*>(state.object)->TryAddRef()) {
        *out = state.object;
        return S_OK;
    }
    NodeObjectImpl* created = nullptr;
    const HRESULT hr = NodeObjectImpl::CreateInstance(&created, shared_from_this(), states_[node]);
    if (FAILED(hr))
        return hr;
    state.object = created;
    *out = created;
    return S_OK;
}

void ResourceTree::ForgetObject(NodeState& state, const HostResourceNode* object) {
    const std::lock_guard guard(mutex_);
    if (state.object == object)
        state.object = nullptr;
}

HRESULT ResourceTree::AddObserver(wbhw::ResTreeNode& node, IwbhwResourceTreeNodeObserver* observer,
                                  uint32_t mask, uint32_t kind) {
    if (observer == nullptr)
        return E_POINTER;
    const std::lock_guard guard(mutex_);
    auto& list = StateOf(node).observers;
    for (auto& r : list) {
        if (r.observer.Get() == observer && r.kind == kind) {
            r.mask = mask;
            return S_OK;
        }
    }
    list.push_back({qv::com::ComPtr<IwbhwResourceTreeNodeObserver>::Share(observer), mask, kind});
    return S_OK;
}

HRESULT ResourceTree::RemoveObserver(wbhw::ResTreeNode& node,
                                     IwbhwResourceTreeNodeObserver* observer, uint32_t kind,
                                     bool wholeSubtree) {
    if (observer == nullptr)
        return E_POINTER;
    const std::lock_guard guard(mutex_);
    // Released after the lists are settled: a release may run an observer's destructor.
    std::vector<NodeState::Registration> removed;
    auto removeFrom = [&](wbhw::ResTreeNode& at) {
        NodeState* state = FindState(at);
        if (state == nullptr)
            return;
        auto& list = state->observers;
        for (auto it = list.begin(); it != list.end();) {
            if (it->observer.Get() == observer && (kind == kAnyKind || it->kind == kind)) {
                removed.push_back(std::move(*it));
                it = list.erase(it);
            } else {
                ++it;
            }
        }
    };
    if (kind == kAnyKind && wholeSubtree) {
        std::vector<wbhw::ResTreeNode*> pending{&node};
        while (!pending.empty()) {
            wbhw::ResTreeNode* at = pending.back();
            pending.pop_back();
            removeFrom(*at);
            for (auto entry = at->Begin(); entry != at->End(); ++entry) {
                if (entry->Child() != nullptr)
                    pending.push_back(entry->Child());
            }
        }
    } else {
        removeFrom(node);
    }
    return removed.empty() ? S_FALSE : S_OK;
}

uint32_t ResourceTree::SaveNotificationState(wbhw::ResTreeNode& node) {
    const std::lock_guard guard(mutex_);
    NodeState& state = StateOf(node);
    const uint32_t saved = state.silenced ? 1 : 0;
    state.silenced = true;
    return saved;
}

void ResourceTree::RestoreNotificationState(wbhw::ResTreeNode& node, uint32_t saved) {
    const std::lock_guard guard(mutex_);
    StateOf(node).silenced = saved != 0;
}

std::shared_ptr<NodeState> ResourceTree::Track(wbhw::ResTreeNode& node) {
    StateOf(node);
    return states_[&node];
}

void ResourceTree::Deliver(const std::shared_ptr<NodeState>& state, uint32_t events) {
    if (state == nullptr || state->node == nullptr || state->silenced || state->observers.empty())
        return;
    // Observers may register, unregister or edit the tree while they are called: work from a
    // copy that holds its own references, and skip what was unregistered meanwhile.
    const std::vector<NodeState::Registration> registrations = state->observers;
    qv::com::ComPtr<IwbhwResourceTreeNode> object;
    if (FAILED(NodeObject(state->node, object.Put())))
        return;
    for (const auto& r : registrations) {
        const uint32_t due = events & r.mask;
        if (due == 0 || state->node == nullptr || state->silenced)
            continue;
        const auto& now = state->observers;
        const bool stillRegistered = std::any_of(now.begin(), now.end(), [&](const auto& c) {
            return c.observer.Get() == r.observer.Get() && c.kind == r.kind;
        });
        if (!stillRegistered)
            continue;
        ++notifications_;
        r.observer->OnNodeEvent(object.Get(), due, r.kind);
    }
}

void ResourceTree::Run(const Plan& plan) {
    for (const auto& [state, events] : plan)
        Deliver(state, events);
}

void ResourceTree::PlanDescendants(wbhw::ResTreeNode& node, uint32_t events, Plan& plan) {
    for (auto entry = node.Begin(); entry != node.End(); ++entry) {
        wbhw::ResTreeNode* child = entry->Child();
        if (child == nullptr)
            continue;
        const auto found = states_.find(child);
        if (found != states_.end() && !found->second->observers.empty())
            plan.emplace_back(found->second, events);
        PlanDescendants(*child, events, plan);
    }
}

void ResourceTree::PlanRemoval(wbhw::ResTreeNode& node, Plan& plan) {
    // Every node of the part is planned, watched or not: an observer that hears a node go may
    // start watching its parent, which goes too, and must then hear that as well.
    const std::shared_ptr<NodeState> state = Track(node);
    plan.emplace_back(state, wbhw::node_event::kAboutToBeRemoved);
    for (auto entry = node.Begin(); entry != node.End(); ++entry) {
        if (entry->Child() != nullptr)
            PlanRemoval(*entry->Child(), plan);
    }
    plan.emplace_back(state, wbhw::node_event::kDetached);
}

void ResourceTree::Shutdown() {
    std::vector<NodeState> dropped;
    {
        const std::lock_guard guard(mutex_);
        for (auto& [node, state] : states_) {
            NodeState moved;
            moved.observers = std::move(state->observers);
            moved.holders = std::move(state->holders);
            state->observers.clear();
            state->holders.clear();
            dropped.push_back(std::move(moved));
        }
    }
}

} // namespace wbhost::resources
