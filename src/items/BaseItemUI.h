// The common base of hardware project items: the framework's project item plus queued work,
// refresh hooks and the default answers for drag and drop and cut, copy and paste.
#pragma once

#include "framework/CqxProjectItemUI.h"
#include "framework/IwbProjectCutCopyPaste3.h"
#include "framework/IwbProjectDragDrop.h"
#include "framework/IwbProjectItemObserver.h"

#include <deque>
#include <functional>

namespace wbhw {

class BaseItemUI : public CqxProjectItemUI,
                   public IwbProjectDragDrop,
                   public IwbProjectDragDropped,
                   public IwbProjectItemObserver,
                   public IwbProjectCutCopyPaste3 {
public:
    using Interfaces =
        CqxProjectItemUI::Interfaces::Append<IwbProjectDragDrop, IwbProjectDragDropped,
                                             IwbProjectItemObserver, IwbProjectCutCopyPaste3>;

    // Refuses without a dragged object or one that is not the framework's drag data; otherwise
    // the base's compatibility check decides.
    HRESULT DropAllowed(IUnknown* dragged, IwbProjectItem* target) override;
    // Leaves the drop to the framework: answers 0 and sets EFFECT to 1.
    HRESULT Drop(int32_t first, int32_t second, int32_t third, int32_t fourth, uint32_t effects,
                 uint32_t* effect) override;
    // The base has nothing to do once dropped.
    HRESULT Dropped() override { return S_OK; }
    // The base lets every item be cut.
    HRESULT QueryCanCut() override { return S_OK; }
    // The base has nothing to follow: every event is taken.
    HRESULT OnProjectItemEvents(uint32_t, const WbProjectItemEvent*) override { return S_OK; }
    // Remembers whether KEEPSOURCE was non-zero.
    HRESULT PrepareCutCopyPaste(uint32_t operation, int32_t keepSource) override;

protected:
    BaseItemUI() = default;

    // A piece of queued work; a failure stops the queue.
    using PendingWork = std::function<HRESULT()>;
    void QueueWork(PendingWork work) { pending_.push_back(std::move(work)); }
    // Runs the queued work first come first, until the queue is empty or a piece fails (that
    // piece stays queued and its status is answered).
    HRESULT RunPendingWork();
    // Runs the item's refresh when the item is enabled.
    HRESULT Refresh();
    // The item's resource refresh; the base has none.
    virtual HRESULT RefreshResources() { return S_OK; }
    // Whether a drop of DRAGGED suits this item beyond being drag data; the base takes it.
    virtual HRESULT CheckDropCompatibility(IUnknown* dragged);

    void Enable() noexcept { enabled_ = true; }
    bool KeepsCutSource() const noexcept { return keepCutSource_; }

private:
    // The item's own refresh, run only while enabled; the base has none.
    virtual HRESULT OnRefresh() { return S_OK; }

    std::deque<PendingWork> pending_;
    bool enabled_ = false;
    bool keepCutSource_ = false;
};

} // namespace wbhw
