// The target item's object.
#include "project/TargetObject.h"

#include "com/CallGuard.h"
#include "com/PutBstr.h"
#include "host/ResourceNode.h"
#include "host/StatusError.h"
#include "kern/Collate.h"

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

HRESULT TargetObject::GetProperty(const char16_t* name, BSTR* value) {
    if (name == nullptr || value == nullptr)
        return E_POINTER;
    *value = nullptr;
    return qv::com::GuardCall([&]() -> HRESULT {
        if (qv::kern::EqualsNoCase(name, u"Type"))
            return qv::com::PutBstr(u"{B824FFC7-1B3E-4521-A49E-679E3411987D}", value);
        if (!qv::kern::EqualsNoCase(name, u"Target Class"))
            return S_FALSE;
        IwbhwResourceTreeNode* root = nullptr;
        qv::host::CheckStatus(GetResourceTreeRoot(&root));
        const auto targetClass = qv::host::ResourceNode::Adopt(root).Attribute(u"TargetClass");
        return qv::com::PutBstr(targetClass.value_or(std::u16string()), value);
    });
}

} // namespace wbhost::project
