// Change delivery: observers, deferral, removal during a pass, watching parents and reservations.
#include "TreeTestSupport.h"
#include "resource_tree/ResTreeNode.h"

#include <functional>
#include <gtest/gtest.h>

namespace wbhw {
namespace {
using namespace test;

// Records every delivery; an optional action runs inside the delivery.
class Recorder : public ResTreeNodeChangeObserver {
public:
    struct Call {
        ResTreeNode* node;
        uint32_t changes;
        uint32_t cookie;
    };
    std::vector<Call> calls;
    std::function<void()> during;

    void OnNodeChanged(ResTreeNode* node, uint32_t changes, uint32_t cookie) override {
        calls.push_back({node, changes, cookie});
        if (during)
            during();
    }
    uint32_t All() const {
        uint32_t bits = 0;
        for (const Call& c : calls)
            bits |= c.changes;
        return bits;
    }
};

TEST(ResTreeObservers, DisplayNameReachesChildAndParentRemovalTellsTheChildBeforeAndAfter) {
    ResTreeNode root(u"", u"Target", false);
    ResTreeNode* child = root.AddChild(root.End(), u"c", u"IOResource", false).node;
    child->SetText(u"DisplayName", u"old");
    Recorder onChild, onRoot;
    child->AddObserver(&onChild, kAllChanges, 7);
    root.AddObserver(&onRoot, kChildDisplayNameChanged, 9);
    child->SetText(u"displayname", u"new");
    EXPECT_EQ(onChild.All(), kValueChanged | kDisplayNameChanged);
    EXPECT_EQ(onChild.calls.front().cookie, 7u);
    EXPECT_EQ(onChild.calls.front().node, child);
    ASSERT_EQ(onRoot.calls.size(), 1u);
    EXPECT_EQ(onRoot.calls[0].changes, kChildDisplayNameChanged);

    // While the parent defers, its observers hear nothing; then one combined delivery.
    onRoot.calls.clear();
    root.BeginDeferral();
    child->SetText(u"DisplayName", u"newer");
    child->SetText(u"DisplayName", u"newest");
    root.AddText(root.End(), u"v", u"");
    EXPECT_TRUE(onRoot.calls.empty());
    root.EndDeferral();
    ASSERT_EQ(onRoot.calls.size(), 1u);
    EXPECT_EQ(onRoot.calls[0].changes, kChildDisplayNameChanged | kValueAdded);
    // Bits outside an observer's mask are not delivered to it but are not kept either.
    EXPECT_EQ(root.PendingChanges(), 0u);
    // Removal tells the child before and after its children go.
    ResTreeNode top(u"", u"Target", false);
    ResTreeNode* module = top.AddChild(top.End(), u"c", u"Module", false).node;
    module->AddChild(module->End(), u"g", u"IOResource", false);
    Recorder onModule, onTop;
    std::vector<uint32_t> order;
    module->AddObserver(&onModule, kAllChanges, 0);
    onModule.during = [&] { order.push_back(onModule.calls.back().changes); };
    top.AddObserver(&onTop, kAllChanges, 0);
    top.RemoveByName(u"c");
    EXPECT_EQ(order, (std::vector<uint32_t>{kDetaching, kChildRemoved, kDetached}));
    EXPECT_EQ(onTop.All(), kChildRemoved);
    top.AddText(top.End(), u"t", u"");
    top.RemoveByName(u"t");
    EXPECT_EQ(onTop.All(), kChildRemoved | kValueAdded | kValueRemoved);
}

TEST(ResTreeObservers, ObserversLeavingOrJoiningDuringAPass) {
    ResTreeNode node(u"", u"Target", false);
    Recorder leaver, stayer, joiner;
    leaver.during = [&] { node.RemoveObserver(&leaver, kAnyCookie); };
    stayer.during = [&] { node.AddObserver(&joiner, kAllChanges, 3); };
    node.AddObserver(&leaver, kAllChanges, 1);
    node.AddObserver(&stayer, kAllChanges, 2);
    node.AddText(node.End(), u"a", u"");
    EXPECT_EQ(leaver.calls.size(), 1u);
    EXPECT_EQ(stayer.calls.size(), 1u);
    EXPECT_TRUE(joiner.calls.empty()); // joined during the pass: not called in it
    stayer.during = nullptr;
    node.AddText(node.End(), u"b", u"");
    EXPECT_EQ(leaver.calls.size(), 1u);
    EXPECT_EQ(joiner.calls.size(), 1u);
    // Removal by cookie leaves the observer's other registrations.
    node.AddObserver(&joiner, kAllChanges, 4);
    node.RemoveObserver(&joiner, 3);
    node.AddText(node.End(), u"c", u"");
    ASSERT_EQ(joiner.calls.size(), 2u);
    EXPECT_EQ(joiner.calls[1].cookie, 4u);
}

TEST(ResTreeObservers, ChangesRaisedDuringDeliveryGoOutInAFurtherPassAWholeLoadInOne) {
    ResTreeNode node(u"", u"Target", false);
    Recorder recorder;
    recorder.during = [&] {
        if (recorder.calls.size() == 1)
            node.AddText(node.End(), u"more", u"");
    };
    node.AddObserver(&recorder, kAllChanges, 0);
    node.AddLink(node.End(), u"l", u"");
    ASSERT_EQ(recorder.calls.size(), 2u);
    EXPECT_EQ(recorder.calls[0].changes, kChildAdded);
    EXPECT_EQ(recorder.calls[1].changes, kValueAdded);
    // A whole load is one delivery.
    ResTreeNode root(u"", u"", false);
    Recorder onLoad;
    root.AddObserver(&onLoad, kAllChanges, 0);
    EXPECT_EQ(root.ParseText(u"<Top><A/><B/><M name='m'/></Top>", false), 0);
    ASSERT_EQ(onLoad.calls.size(), 1u);
    EXPECT_EQ(onLoad.calls[0].changes, kValueAdded | kChildAdded);
}

TEST(ResTreeObservers, AncestorAndReservationChangesAreForwardedRingsEndTheirDelivery) {
    ResTreeNode root(u"", u"Target", false);
    ResTreeNode* a = root.AddChild(root.End(), u"a", u"Module", false).node;
    ResTreeNode* pin = a->AddChild(a->End(), u"pin", u"IOResource", false).node;
    ResTreeNode* user = root.AddChild(root.End(), u"user", u"IOResource", false).node;
    user->SetText(u"Reserves", u"../a/pin");
    Recorder onPin, onUser;
    pin->AddObserver(&onPin, kAncestorChanged, 0);
    user->AddObserver(&onUser, kReservationChanged, 0);
    a->RaiseChanges(kAncestorChanged | kValueAdded);
    EXPECT_EQ(onPin.All(), kAncestorChanged);
    pin->RaiseChanges(kReservationChanged);
    EXPECT_EQ(onUser.All(), kReservationChanged);
    // Once nobody asks for the bit, the watching stops.
    pin->RemoveObserver(&onPin, kAnyCookie);
    onPin.calls.clear();
    a->RaiseChanges(kAncestorChanged);
    EXPECT_TRUE(onPin.calls.empty());
    // Rings end their delivery, yet changes made during it go out.
    // Two nodes reserving each other, and ra node reserving its own parent.
    ResTreeNode ring(u"", u"Target", false);
    ResTreeNode* ra = ring.AddChild(ring.End(), u"ra", u"IOResource", false).node;
    ResTreeNode* rb = ring.AddChild(ring.End(), u"rb", u"IOResource", false).node;
    ra->SetText(u"Reserves", u"../rb");
    rb->SetText(u"Reserves", u"../ra");
    rb->SetText(u"DisplayName", u"rb");
    ResTreeNode* self = ra->AddChild(ra->End(), u"self", u"IOResource", false).node;
    self->SetText(u"Reserves", u"..");
    Recorder onRa, onSelf;
    ra->AddObserver(&onRa, kReservationChanged | kDisplayNameChanged | kValueAdded, 0);
    self->AddObserver(&onSelf, kAncestorChanged | kReservationChanged, 0);
    rb->RaiseChanges(kReservationChanged);
    EXPECT_EQ(onRa.All(), kReservationChanged);
    EXPECT_LT(onRa.calls.size(), 4u);
    EXPECT_NE(onSelf.All() & kReservationChanged, 0u);

    // While A delivers ra change of its own, its observer renames B. That rename reaches A during
    // A's delivery but is news, not A's change coming back: it goes out in ra further pass, whose
    // own echo from B is dropped in turn.
    onRa.calls.clear();
    onRa.during = [&] {
        if (onRa.calls.size() == 1)
            rb->SetText(u"DisplayName", u"renamed");
    };
    ra->AddText(ra->End(), u"v", u"");
    ASSERT_EQ(onRa.calls.size(), 2u);
    EXPECT_EQ(onRa.calls[0].changes, kValueAdded);
    EXPECT_NE(onRa.calls[1].changes & kDisplayNameChanged, 0u);
}

TEST(ResTreeObservers, WatchingSurvivesAnyTeardownOrder) {
    // A node reserving its sibling: deleting either first must leave no stale registration.
    for (const bool reserverFirst : {true, false}) {
        auto root = test::NewRoot();
        root->SetOrdered(true);
        ResTreeNode* target = root->AddChild(root->End(), u"target", u"IOResource", false).node;
        ResTreeNode* user = root->AddChild(reserverFirst ? root->Begin() : root->End(), u"user",
                                           u"IOResource", false)
                                .node;
        user->SetText(u"Reserves", u"../target");
        Recorder onUser;
        user->AddObserver(&onUser, kReservationChanged, 0);
        target->RaiseChanges(kReservationChanged);
        ASSERT_EQ(onUser.All(), kReservationChanged) << reserverFirst;
        root->RemoveByName(reserverFirst ? u"user" : u"target");
        onUser.calls.clear();
        if (reserverFirst) {
            // The reserver is gone: its target's changes reach nobody.
            target->RaiseChanges(kReservationChanged);
            EXPECT_TRUE(onUser.calls.empty());
        } else {
            // The target is gone: the reserver still hears its own changes.
            user->RaiseChanges(kReservationChanged);
            EXPECT_EQ(onUser.All(), kReservationChanged);
        }
        root->AddText(root->End(), u"after", u"");
        root.reset(); // and the sanitizers tell if anything was left dangling
    }
}

} // namespace
} // namespace wbhw
