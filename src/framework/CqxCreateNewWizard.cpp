// The framework's create-new wizard base.
#include "framework/CqxCreateNewWizard.h"

#include "com/CallGuard.h"
#include "com/TaskMem.h"

using qv::com::ComPtr;
using qv::com::GuardCall;

HRESULT CqxCreateNewWizard::Bind(IwbProjectItem* parent) {
    if (!parent) {
        return E_INVALIDARG;
    }
    parent_ = ComPtr<IwbProjectItem>::Share(parent);
    return GuardCall([&] { return OnBind(parent); });
}

HRESULT CqxCreateNewWizard::Run(const QxCreateNewRequest* request) {
    if (!request) {
        return E_POINTER;
    }
    return GuardCall([&] { return OnRun(*request); });
}

HRESULT CqxCreateNewWizard::GetNewItemDescriptions(const QxCreateNewRequest* request,
                                                   uint32_t* count,
                                                   QxNewItemDescription** descriptions) {
    if (!request || !count || !descriptions) {
        return E_POINTER;
    }
    *count = 0;
    *descriptions = nullptr;
    return GuardCall([&] {
        descriptions_.clear();
        HRESULT hr = OnDescribe(descriptions_, *request);
        if (FAILED(hr)) {
            return hr;
        }
        std::vector<QxNewItemDescription> records(descriptions_.size());
        hr = qv::com::CopyToTaskMem(records, descriptions, count);
        for (size_t i = 0; SUCCEEDED(hr) && i < descriptions_.size(); ++i) {
            const CqxNewItemDescription& d = descriptions_[i];
            QxNewItemDescription& out = (*descriptions)[i];
            out = QxNewItemDescription{d.itemType, d.position, 0, qv::com::AllocBstr(d.displayName),
                                       d.icon};
            if (!out.displayName) {
                for (size_t j = 0; j < i; ++j) {
                    SysFreeString((*descriptions)[j].displayName);
                }
                CoTaskMemFree(*descriptions);
                *descriptions = nullptr;
                *count = 0;
                hr = E_OUTOFMEMORY;
            }
        }
        return hr;
    });
}

void CqxCreateNewWizard::AttachProvider(IqxProvider* provider) {
    if (provider) {
        provider_ = ComPtr<IqxProvider>::Share(provider);
    }
}

HRESULT CqxCreateNewWizard::OnBind(IwbProjectItem*) {
    return S_OK;
}

HRESULT CqxCreateNewWizard::OnRun(const QxCreateNewRequest&) {
    return S_OK;
}

HRESULT CqxCreateNewWizard::OnDescribe(std::vector<CqxNewItemDescription>&,
                                       const QxCreateNewRequest&) {
    return S_OK;
}
