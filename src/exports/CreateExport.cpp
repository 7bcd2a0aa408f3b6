// The exported bulk creation of Tangent I/O items under a target or folder.
#include "attribute_bag/ItemResourceContext.h"
#include "com/ComPtr.h"
#include "exports/Export.h"
#include "exports/ResTreeFrame.h"
#include "framework/IqxItem.h"
#include "framework/IqxProjectItemUI.h"
#include "host/HostStringArray.h"
#include "provider/TIOItemCreation.h"

#include <cstdint>
#include <new>
#include <string>
#include <vector>

namespace {

using qv::com::ComPtr;

// The host project item behind the item object at REFNUM, through its project-tree side.
HRESULT ParentItem(const WBRefNum* refnum, ComPtr<IwbProjectItem>& item) {
    ComPtr<IqxItem> framework;
    HRESULT hr =
        qv::host::rt::QueryInterfaceForWBRefNum(refnum, &IqxItem::iid, framework.PutVoid());
    if (FAILED(hr))
        return hr;
    if (!framework)
        return E_NOINTERFACE;
    ComPtr<IqxProjectItemUI> itemUI;
    if (hr = framework->GetProjectItemUI(itemUI.Put()); FAILED(hr))
        return hr;
    if (!itemUI)
        return E_NOINTERFACE;
    if (hr = itemUI->GetProjectItem(item.Put()); FAILED(hr))
        return hr;
    return item ? S_OK : E_FAIL;
}

// Every definition as wide text; false when there is no memory for them.
bool ReadDefinitions(qv::host::HostStringArray definitions, std::vector<std::u16string>& texts) {
    const std::vector<std::string> bytes = qv::host::ReadHostStringArray(definitions);
    try {
        texts.reserve(bytes.size());
        for (const std::string& each : bytes)
            texts.push_back(qv::kern::AnsiToWide(each));
    } catch (const std::bad_alloc&) {
        return false;
    }
    return true;
}

} // namespace

// Creates one Tangent I/O item per attribute-set text of DEFINITIONS below the target or folder
// whose item object the refnum at REFNUM names, in order, with the target's change handling
// suspended meanwhile (and restored however the creations end). E_FAIL when DEFINITIONS is null
// or empty; the first failing creation's status, items before it staying, otherwise.
WBT_EXPORT int32_t TIO_CreateMultiple(const WBRefNum* refnum,
                                      qv::host::HostStringArray* definitions) noexcept {
    if (definitions == nullptr || qv::host::HostStringArrayCount(*definitions) == 0)
        return E_FAIL;
    return qv::exports::AnswerStatus([&]() -> int32_t {
        ComPtr<IwbProjectItem> parent;
        if (const HRESULT hr = ParentItem(refnum, parent); FAILED(hr))
            return hr;
        std::vector<std::u16string> texts;
        if (!ReadDefinitions(*definitions, texts))
            return E_FAIL;
        // The target the items will belong to, also when they go below one of its folders.
        ItemResourceContext context;
        const HRESULT filled = context.Fill(parent.Get(), true);
        IUnknown* const owner = filled == S_OK ? context.OwnerObject() : nullptr;
        return tio::CreateItemsFromTexts({parent.Get(), texts}, owner);
    });
}
