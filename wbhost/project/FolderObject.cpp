// The host's objects of folders and the project root.
#include "project/FolderObject.h"

namespace wbhost::project {

HRESULT FolderObject::GetProjectItem(IwbProjectItem** item) {
    if (item == nullptr)
        return E_POINTER;
    *item = item_;
    if (item_ == nullptr)
        return S_FALSE;
    item_->AddRef();
    return S_OK;
}

} // namespace wbhost::project
