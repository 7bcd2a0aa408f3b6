// Change delivery of resource-tree nodes: observers, deferral, watching parents and reservations.
#include "resource_tree/ResTreeNode.h"

#include <algorithm>

namespace wbhw {
namespace {

enum : uint32_t { kActive = 0, kRemoved = 1, kAdded = 2 };

// The cookie under which a node registers with the nodes it watches.
constexpr uint32_t kWatchCookie = 1;
// What a node asks of the nodes it watches: the bits it forwards.
constexpr uint32_t kForwardedChanges = kDisplayNameChanged | kAncestorChanged | kReservationChanged;

// The pass whose observers are being called on this thread (0 outside any delivery), and the
// last identity handed out. A change forwarded by a watching node carries the pass it came with,
// so a node can tell its own delivery coming back round a ring of watchers from a change that
// somebody made while it was delivering.
thread_local uint64_t tDeliveringPass = 0;
thread_local uint64_t tLastPass = 0;

// Makes PASS the delivering pass for the life of the object, then puts the previous one back.
class DeliveringPass {
public:
    explicit DeliveringPass(uint64_t pass) noexcept : previous_(tDeliveringPass) {
        tDeliveringPass = pass;
    }
    ~DeliveringPass() { tDeliveringPass = previous_; }
    DeliveringPass(const DeliveringPass&) = delete;
    DeliveringPass& operator=(const DeliveringPass&) = delete;

private:
    uint64_t previous_;
};

} // namespace

ResTreeNode::Observers& ResTreeNode::EnsureObservers() {
    if (!observers_)
        observers_ = std::make_unique<Observers>();
    return *observers_;
}

void ResTreeNode::RaiseChanges(uint32_t changes) {
    pendingChanges_ |= changes;
    if (deferDepth_ == 0)
        NotifyChanges(kAllChanges);
}

void ResTreeNode::EndDeferral() {
    if (deferDepth_ > 0)
        --deferDepth_;
    if (deferDepth_ == 0)
        NotifyChanges(kAllChanges);
}

void ResTreeNode::NotifyChanges(uint32_t mask) {
    Deliver(mask, 0);
}

void ResTreeNode::Deliver(uint32_t mask, uint64_t inherited) {
    // Nobody listens: what would be delivered is simply dropped, as a pass would do.
    if (!observers_ || observers_->registrations.empty()) {
        pendingChanges_ &= ~mask;
        return;
    }
    for (;;) {
        const uint32_t remembered = pendingChanges_;
        const int32_t rememberedDepth = deferDepth_;
        notifying_ = true;
        deferDepth_ = 1;
        pendingChanges_ = 0;
        const uint32_t due = remembered & mask;
        observers_->pass = inherited != 0 ? inherited : ++tLastPass;
        inherited = 0;
        if (due != 0) {
            const DeliveringPass delivering(observers_->pass);
            auto& list = observers_->registrations;
            // Observers may add registrations while being called; indices survive that.
            for (size_t i = 0; i < list.size(); ++i) {
                const Registration r = list[i];
                if (r.state == kActive && (r.mask & due) != 0)
                    r.observer->OnNodeChanged(this, due, r.cookie);
            }
            std::erase_if(list, [](const Registration& r) { return r.state == kRemoved; });
            for (Registration& r : list)
                r.state = kActive;
        }
        pendingChanges_ |= remembered & ~mask;
        notifying_ = false;
        observers_->pass = 0;
        deferDepth_ = rememberedDepth != 0 ? 1 : 0;
        if (rememberedDepth != 0 || (pendingChanges_ & mask) == 0)
            return;
    }
}

void ResTreeNode::OnNodeChanged(ResTreeNode* /*node*/, uint32_t changes, uint32_t /*cookie*/) {
    const uint32_t forwarded = changes & kForwardedChanges;
    if (forwarded == 0)
        return;
    // A change of this node's own pass, arriving while it delivers, is that delivery echoed
    // through a ring of watchers (a node reserving its ancestor, two nodes reserving each
    // other): taking it would start another pass, and so on for ever. Any other change that
    // arrives meanwhile (say an observer renamed an ancestor) goes out in a further pass.
    if (notifying_ && observers_->pass == tDeliveringPass)
        return;
    pendingChanges_ |= forwarded;
    if (deferDepth_ == 0)
        Deliver(kAllChanges, tDeliveringPass);
}

bool ResTreeNode::HasActiveRegistration(uint32_t bit) const noexcept {
    if (!observers_)
        return false;
    return std::any_of(
        observers_->registrations.begin(), observers_->registrations.end(),
        [bit](const Registration& r) { return r.state != kRemoved && (r.mask & bit); });
}

bool ResTreeNode::IsWatching(const ResTreeNode& other) const noexcept {
    if (!observers_)
        return false;
    const auto& w = observers_->watching;
    return std::find(w.begin(), w.end(), &other) != w.end();
}

void ResTreeNode::Watch(ResTreeNode& other) {
    if (&other == this || IsWatching(other))
        return;
    // Recorded first: registering may make OTHER watch its own parent and reservations, and a
    // ring of reservations must find this link already in place.
    EnsureObservers().watching.push_back(&other);
    other.EnsureObservers().watchers.push_back(this);
    other.AddObserver(this, kForwardedChanges, kWatchCookie);
}

void ResTreeNode::Unwatch(ResTreeNode& other) {
    if (!IsWatching(other))
        return;
    other.RemoveObserver(this, kAnyCookie);
    std::erase(observers_->watching, &other);
    if (other.observers_)
        std::erase(other.observers_->watchers, this);
}

void ResTreeNode::StopWatchingAll() noexcept {
    if (!observers_)
        return;
    // Forget the nodes this one watches, and make the nodes watching this one forget it, so that
    // neither side keeps a pointer to a deleted node whatever order a tree is torn down in.
    const std::vector<ResTreeNode*> watching = observers_->watching;
    for (ResTreeNode* other : watching)
        Unwatch(*other);
    for (ResTreeNode* watcher : observers_->watchers) {
        if (watcher->observers_)
            std::erase(watcher->observers_->watching, this);
    }
    observers_->watchers.clear();
}

void ResTreeNode::AddObserver(ResTreeNodeChangeObserver* observer, uint32_t mask, uint32_t cookie) {
    if (observer == nullptr)
        return;
    EnsureObservers().registrations.push_back(
        {observer, cookie, mask, notifying_ ? uint32_t{kAdded} : uint32_t{kActive}});
    if ((mask & kAncestorChanged) != 0 && parent_ != nullptr)
        Watch(*parent_);
    if ((mask & kReservationChanged) != 0) {
        for (ResTreeNode* reserved : ReservedNodes(true))
            Watch(*reserved);
    }
}

void ResTreeNode::RemoveObserver(ResTreeNodeChangeObserver* observer, uint32_t cookie) {
    if (!observers_)
        return;
    auto matches = [&](const Registration& r) {
        return r.observer == observer && (cookie == kAnyCookie || r.cookie == cookie);
    };
    auto& list = observers_->registrations;
    if (notifying_) {
        for (Registration& r : list) {
            if (matches(r))
                r.state = kRemoved;
        }
    } else {
        std::erase_if(list, matches);
    }
    if (!HasActiveRegistration(kAncestorChanged) && parent_ != nullptr)
        Unwatch(*parent_);
    if (!HasActiveRegistration(kReservationChanged)) {
        const std::vector<ResTreeNode*> watching = observers_->watching;
        for (ResTreeNode* other : watching) {
            if (other != parent_)
                Unwatch(*other);
        }
    }
}

} // namespace wbhw
