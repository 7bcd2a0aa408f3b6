// TIOAttributeSet_GetResource: which resource a Tangent I/O item uses, the name to show for it,
// and whether it is usable.
#include "attribute_bag/ItemResourceContext.h"
#include "exports/Export.h"
#include "exports/ResTreeFrame.h"
#include "framework/IqxProjectItemUI.h"
#include "items/TIOItemInterfaces.h"
#include "resource_tree/ListText.h"

#include <cstdint>
#include <string>

namespace {

// What resourceStatus says: not worked out yet, bound, missing, held by another item.
constexpr int32_t kStatusUnknown = 3;
constexpr int32_t kStatusBound = 0;
constexpr int32_t kStatusMissing = 1;
constexpr int32_t kStatusHeldByAnother = 2;

// The name to show for the resource at PATH: the node's "NameDecoration", else its name without
// escapes; PATH itself when it names no node of the tree (or there is no tree).
std::u16string DisplayName(ItemResourceContext& context, const std::u16string& path) {
    if (path.empty() || context.Owner() == nullptr)
        return path;
    const qv::host::ResourceNode node = context.Root().Find(path);
    if (!node)
        return path;
    if (auto decoration = node.Attribute(u"NameDecoration"))
        return std::move(*decoration);
    return wbhw::UnescapeListText(node.Name(), u'/');
}

void WriteWide(qv::host::HostString text, const std::u16string& value) {
    qv::host::HostString out = text;
    qv::host::WriteHostString(out, qv::kern::WideToAnsi(value));
}

} // namespace

// The resource of the item behind the refnum at REFNUM in RESOURCE, its display name in
// DISPLAYNAME and in *RESOURCESTATUS 0 bound, 1 missing (or no resource), 2 held by another item.
// The texts are emptied and the status set to 3 first, so a refnum that is no item leaves them
// so. Null outputs answer E_POINTER (with *RESOURCESTATUS 3 when it is there).
WBT_EXPORT int32_t TIOAttributeSet_GetResource(const WBRefNum* refnum, void* /*unused*/,
                                               qv::host::HostString resource,
                                               qv::host::HostString displayName,
                                               int32_t* resourceStatus) noexcept {
    if (resourceStatus == nullptr)
        return E_POINTER;
    *resourceStatus = kStatusUnknown;
    // The texts are written by resizing the caller's handles: a handle made here would never
    // reach the caller.
    if (resource == nullptr || displayName == nullptr)
        return E_POINTER;
    return qv::exports::AnswerStatus([&]() -> int32_t {
        WriteWide(resource, {});
        WriteWide(displayName, {});
        qv::com::ComPtr<IqxProjectItemUI> itemUI;
        HRESULT hr = qv::exports::QueryRefnum(refnum, itemUI);
        if (FAILED(hr))
            return hr;
        ItemResourceContext context;
        qv::com::ComPtr<IwbProjectItem> hostItem;
        if (SUCCEEDED(itemUI->GetProjectItem(hostItem.Put())) && hostItem)
            context.Fill(hostItem.Get(), true); // an item outside every target still answers
        const auto item = itemUI.As<IwbhwResourceItemUI>();
        if (!item)
            return E_NOINTERFACE;
        BSTR path = nullptr;
        int32_t exists = 0;
        int32_t reserved = 0;
        hr = item->GetResource(&path, &exists, &reserved);
        const qv::com::UniqueBstr heldPath(path);
        if (FAILED(hr))
            return hr;
        const std::u16string resourcePath = qv::com::BstrToString(path);
        if (!resourcePath.empty())
            WriteWide(resource, resourcePath);
        const std::u16string shown = DisplayName(context, resourcePath);
        if (!shown.empty())
            WriteWide(displayName, shown);
        *resourceStatus = resourcePath.empty() || exists == 0 ? kStatusMissing
                          : reserved == 0                     ? kStatusHeldByAnother
                                                              : kStatusBound;
        return S_OK;
    });
}
