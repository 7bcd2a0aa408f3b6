// Host project items read as plain values.
#include "host/ProjectItemQueries.h"

#include "host/StatusError.h"

namespace qv::host {

std::u16string ItemName(IwbProjectItem& item) {
    BSTR name = nullptr;
    const HRESULT hr = item.GetName(&name);
    const qv::com::UniqueBstr held(name);
    CheckStatus(hr);
    return qv::com::BstrToString(name);
}

GUID ItemType(IwbProjectItem& item) {
    GUID type{};
    CheckStatus(item.GetTypeGuid(&type));
    return type;
}

qv::com::ComPtr<IwbProjectItem> ItemParent(IwbProjectItem& item) {
    qv::com::ComPtr<IwbProjectItem> parent;
    CheckStatus(item.GetParent(parent.Put()));
    return parent;
}

qv::com::ComPtr<IUnknown> ItemObject(IwbProjectItem& item) {
    qv::com::ComPtr<IUnknown> object;
    CheckStatus(item.GetObject(object.Put()));
    return object;
}

} // namespace qv::host
