// The target item's object.
#include "project/TargetObject.h"

#include "com/CallGuard.h"

namespace wbhost::project {

HRESULT TargetObject::ItemChanged(IUnknown* item) {
    if (item == nullptr)
        return E_POINTER;
    if (suspended_) {
        ++suspendedChanges_;
        return S_OK;
    }
    return qv::com::GuardCall([&] {
        changed_.push_back(qv::com::ComPtr<IUnknown>::Share(item));
        return S_OK;
    });
}

HRESULT TargetObject::SuspendChangeHandling(int32_t suspend, int32_t* previous) {
    if (previous != nullptr)
        *previous = suspended_ ? 1 : 0;
    suspended_ = suspend != 0;
    return S_OK;
}

HRESULT TargetObject::RestoreChangeHandling(int32_t previous) {
    suspended_ = previous != 0;
    return S_OK;
}

HRESULT TargetObject::GetResourceTreeRoot(IwbhwResourceTreeNode** root) {
    if (root == nullptr)
        return E_POINTER;
    *root = nullptr;
    const auto provider = target_->hardware.As<IwbhwResourceTreeProvider>();
    return provider ? provider->GetResourceTreeRoot(root) : E_UNEXPECTED;
}

HRESULT TargetObject::ListResourceNames(const char16_t* ioInterface, const char16_t* protocolFilter,
                                        BSTR** names, uint32_t* count) {
    return target_->hardware->ListResourceNames(ioInterface, protocolFilter, names, count);
}

} // namespace wbhost::project
