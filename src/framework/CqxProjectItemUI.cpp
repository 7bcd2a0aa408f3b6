// The framework's project item base.
#include "framework/CqxProjectItemUI.h"

#include "com/CallGuard.h"
#include "com/TaskMem.h"

#include <algorithm>

HRESULT CqxProjectItemUI::ValidateNewName(const char16_t* name) {
    if (!name) {
        return S_FALSE;
    }
    const std::u16string_view text(name);
    return text.find_first_of(InvalidNameChars()) == std::u16string_view::npos ? S_OK : S_FALSE;
}

HRESULT CqxProjectItemUI::ShowProperties() {
    return E_NOTIMPL;
}

HRESULT CqxProjectItemUI::UpdateOverlays() {
    return qv::com::GuardCall([&] {
        for (CqxOverlayRecord& record : pending_) {
            const auto shown = std::find(overlays_.begin(), overlays_.end(), record.image);
            if (record.add && shown == overlays_.end()) {
                overlays_.push_back(std::move(record.image));
            } else if (!record.add && shown != overlays_.end()) {
                overlays_.erase(shown);
            }
        }
        pending_.clear();
        return S_OK;
    });
}

HRESULT CqxProjectItemUI::GetOverlays(uint32_t* count, BSTR** images) {
    if (!count || !images) {
        return E_POINTER;
    }
    *count = 0;
    *images = nullptr;
    if (overlays_.empty()) {
        return S_OK;
    }
    auto* array = static_cast<BSTR*>(CoTaskMemAlloc(overlays_.size() * sizeof(BSTR)));
    if (!array) {
        return E_OUTOFMEMORY;
    }
    for (size_t i = 0; i < overlays_.size(); ++i) {
        array[i] = qv::com::AllocBstr(overlays_[i]);
        if (!array[i]) {
            for (size_t j = 0; j < i; ++j) {
                SysFreeString(array[j]);
            }
            CoTaskMemFree(array);
            return E_OUTOFMEMORY;
        }
    }
    *images = array;
    *count = static_cast<uint32_t>(overlays_.size());
    return S_OK;
}

HRESULT CqxProjectItemUI::QueryCanRemove() {
    return S_OK;
}

HRESULT CqxProjectItemUI::GetProjectItem(IwbProjectItem** item) {
    if (!item) {
        return E_POINTER;
    }
    *item = HostItem();
    if (!*item) {
        return S_FALSE;
    }
    (*item)->AddRef();
    return S_OK;
}

HRESULT CqxProjectItemUI::GetProjectItemUI(IqxProjectItemUI** itemUI) {
    if (!itemUI) {
        return E_POINTER;
    }
    *itemUI = this;
    (*itemUI)->AddRef();
    return S_OK;
}
