// The object behind a target item: its resource tree and its I/O items' change handling.
#pragma once

#include "com/ComObject.h"
#include "com/ComPtr.h"
#include "host/contracts/IwbChildPlacement.h"
#include "host/contracts/IwbProjectItemScope.h"
#include "host/contracts/IwbTargetItemChange.h"
#include "host/contracts/IwbhwResourceTreeProvider.h"
#include "host/contracts/IwbhwTargetResources.h"
#include "project/HostItemObject.h"
#include "resources/ResourceService.h"

#include <vector>

namespace wbhost::project {

// A target is a name scope: I/O item names need only be unique below it. It takes items of
// every type below it, and as a candidate for placement below an FPGA host it tells its type
// (an FPGA target), its class (its tree root's "TargetClass", "" when absent: the root itself
// describes it) and its tree, where the hosts it supports are described.
class TargetObject : public HostItemObject,
                     public IwbTargetItemChange,
                     public IwbhwResourceTreeProvider,
                     public IwbhwTargetResources,
                     public IwbProjectItemScope,
                     public IwbChildTypeValidator,
                     public IwbItemObjectProperties,
                     public IwbProjectResourceService {
public:
    using Interfaces = HostItemObject::Interfaces::Append<
        IwbTargetItemChange, IwbhwResourceTreeProvider, IwbhwTargetResources, IwbProjectItemScope,
        IwbChildTypeValidator, IwbItemObjectProperties, IwbProjectResourceService>;
    // The object of ITEM, which owns TARGET (kept alive by the service, which outlives the
    // project).
    TargetObject(IwbProjectItem* item, resources::Target* target)
        : HostItemObject(item), target_(target) {}
    virtual ~TargetObject() = default;

    // Records ITEM (E_POINTER when null); while suspended, the change is only counted.
    HRESULT ItemChanged(IUnknown* item) override;
    HRESULT SuspendChangeHandling(int32_t suspend, int32_t* previous) override;
    HRESULT RestoreChangeHandling(int32_t previous) override;
    HRESULT GetResourceTreeRoot(IwbhwResourceTreeNode** root) override;
    HRESULT ListResourceNames(const char16_t* ioInterface, const char16_t* protocolFilter,
                              BSTR** names, uint32_t* count) override;
    HRESULT AllowsChildType(const GUID&) override { return S_OK; }
    HRESULT GetProperty(const char16_t* name, BSTR* value) override;
    HRESULT GetResourceTree(IwbhwResourceTreeNode** root) override {
        return GetResourceTreeRoot(root);
    }

    // Host side: the items handled while not suspended, in order (references held).
    const std::vector<qv::com::ComPtr<IUnknown>>& Changed() const noexcept { return changed_; }
    // Changes that arrived while suspended.
    int SuspendedChanges() const noexcept { return suspendedChanges_; }
    bool Suspended() const noexcept { return suspended_; }
    resources::Target& Target() const noexcept { return *target_; }
    // Drops the recorded items (they may hold this object through their item).
    void Clear() { changed_.clear(); }

private:
    resources::Target* target_;
    bool suspended_ = false;
    int suspendedChanges_ = 0;
    std::vector<qv::com::ComPtr<IUnknown>> changed_;
};

using TargetObjectInstance = CQVComObject<TargetObject>;

} // namespace wbhost::project
