// The hardware-item base.
#include "items/BaseItemUI.h"

#include "com/CallGuard.h"
#include "com/ComPtr.h"

namespace wbhw {

HRESULT BaseItemUI::DropAllowed(IUnknown* dragged, IwbProjectItem*) {
    if (dragged == nullptr || !qv::com::QueryAs<IqxDragData>(dragged))
        return S_FALSE;
    return qv::com::GuardCall([&] { return CheckDropCompatibility(dragged); });
}

HRESULT BaseItemUI::Drop(int32_t, int32_t, int32_t, int32_t, uint32_t, uint32_t* effect) {
    if (effect != nullptr)
        *effect = 1;
    return S_OK;
}

HRESULT BaseItemUI::PrepareCutCopyPaste(uint32_t, int32_t keepSource) {
    keepCutSource_ = keepSource != 0;
    return S_OK;
}

HRESULT BaseItemUI::RunPendingWork() {
    return qv::com::GuardCall([&]() -> HRESULT {
        while (!pending_.empty()) {
            if (const HRESULT hr = pending_.front()(); FAILED(hr))
                return hr;
            pending_.pop_front();
        }
        return S_OK;
    });
}

HRESULT BaseItemUI::Refresh() {
    return enabled_ ? OnRefresh() : S_OK;
}

HRESULT BaseItemUI::CheckDropCompatibility(IUnknown*) {
    return S_OK;
}

} // namespace wbhw
