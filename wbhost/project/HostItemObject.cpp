// The host's objects of its own items.
#include "project/HostItemObject.h"

namespace wbhost::project {

HRESULT HostItemObject::GetProjectItem(IwbProjectItem** item) {
    if (item == nullptr)
        return E_POINTER;
    *item = item_;
    if (item_ == nullptr)
        return S_FALSE;
    item_->AddRef();
    return S_OK;
}

HRESULT HostItemObject::GetProjectItemUI(IqxProjectItemUI** itemUI) {
    if (itemUI == nullptr)
        return E_POINTER;
    *itemUI = this;
    (*itemUI)->AddRef();
    return S_OK;
}

HRESULT HostItemObject::ValidateNewName(const char16_t* name) {
    return name != nullptr && *name != u'\0' ? S_OK : S_FALSE;
}

HRESULT HostItemObject::GetOverlays(uint32_t* count, BSTR** images) {
    if (count == nullptr || images == nullptr)
        return E_POINTER;
    *count = 0;
    *images = nullptr;
    return S_OK;
}

} // namespace wbhost::project
