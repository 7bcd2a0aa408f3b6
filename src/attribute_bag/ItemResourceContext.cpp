// Finding the owner of an item's resource tree.
#include "attribute_bag/ItemResourceContext.h"

#include "host/StatusError.h"
#include "host/contracts/IwbItemStatusQuery.h"
#include "host/contracts/IwbProjectItemUIMap.h"

using qv::com::ComPtr;

namespace {

// True when ITEM's object says that it stands outside any resource context.
bool DeclinesContext(IwbProjectItem& item) {
    ComPtr<IUnknown> object;
    if (FAILED(item.GetObject(object.Put())) || !object)
        return false;
    const auto query = object.As<IwbItemStatusQuery>();
    return query && query->QueryStatus() == S_OK;
}

} // namespace

HRESULT ItemResourceContext::Fill(IwbProjectItem* item, bool allowMissingOwner) {
    if (item == nullptr)
        return E_POINTER;
    *this = ItemResourceContext();
    item_ = ComPtr<IwbProjectItem>::Share(item);
    if (DeclinesContext(*item))
        return E_FAIL;
    ComPtr<IwbProjectItemUIMap> map;
    if (const HRESULT hr = item->GetItemUIMap(map.Put()); FAILED(hr))
        return hr;
    if (!map)
        return E_FAIL;
    ComPtr<IwbProjectItem> at = item_;
    while (at) {
        QxItemInfoRecord record;
        if (const HRESULT hr = at->GetInfoRecord(&record); FAILED(hr))
            return hr;
        ComPtr<IUnknown> object;
        if (const HRESULT hr = map->GetItemUI(&record, object.Put()); FAILED(hr))
            return hr;
        if (!object)
            return E_FAIL; // every item on the way has an object in a sound project
        if (auto provider = object.As<IwbhwResourceTreeProvider>()) {
            owner_ = at;
            ownerObject_ = std::move(object);
            provider_ = std::move(provider);
            return S_OK;
        }
        ComPtr<IwbProjectItem> parent;
        if (const HRESULT hr = at->GetParent(parent.Put()); FAILED(hr))
            return hr;
        at = std::move(parent);
    }
    return allowMissingOwner ? S_FALSE : E_FAIL;
}

const qv::host::ResourceNode& ItemResourceContext::Root() {
    if (!root_ && provider_) {
        IwbhwResourceTreeNode* root = nullptr;
        const HRESULT hr = provider_->GetResourceTreeRoot(&root);
        root_ = qv::host::ResourceNode::Adopt(root);
        qv::host::CheckStatus(hr);
    }
    return root_;
}
