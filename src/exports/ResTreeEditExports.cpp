// The exported edits of host resource trees: parts inserted and removed, properties set.
#include "exports/Export.h"
#include "exports/ResTreeFrame.h"

#include <algorithm>
#include <cstdint>
#include <string>

namespace {

std::u16string WideText(qv::host::HostString text) {
    return qv::kern::AnsiToWide(qv::host::ReadHostString(text));
}

} // namespace

// Adds the resource-tree document XML beneath the node at PATH. A path naming no node changes
// nothing and answers 0 with *FOUND 0.
WBT_EXPORT int32_t TIO_InsertSubTree(const WBRefNum* refnum, qv::host::HostString path,
                                     qv::host::HostString xml, uint8_t* found) noexcept {
    return qv::exports::WithFoundNode(refnum, path, found, [&](IwbhwResourceTreeAccess& node) {
        const HRESULT hr = node.InsertSubTree(WideText(xml).c_str());
        return FAILED(hr) ? hr : S_OK;
    });
}

// Removes the part called NAME beneath the node at PATH.
WBT_EXPORT int32_t TIO_RemoveSubTree(const WBRefNum* refnum, qv::host::HostString path,
                                     qv::host::HostString name, uint8_t* found) noexcept {
    return qv::exports::WithFoundNode(refnum, path, found, [&](IwbhwResourceTreeAccess& node) {
        const HRESULT hr = node.RemoveSubTree(WideText(name).c_str());
        return FAILED(hr) ? hr : S_OK;
    });
}

// Sets a property named by the end of PATH: the service finds as much of PATH as names nodes and
// the rest names the property of the deepest of them. *FOUND tells whether the property was set;
// it is written only once the service has answered, so a failure leaves it as the caller had it.
WBT_EXPORT int32_t TIOResTree_SetProperty(const WBRefNum* refnum, qv::host::HostString path,
                                          qv::host::HostString value, uint8_t* found) noexcept {
    if (found == nullptr)
        return E_POINTER;
    return qv::exports::AnswerStatus([&]() -> int32_t {
        qv::com::ComPtr<IwbhwResourceTreeAccess> tree;
        HRESULT hr = qv::exports::QueryRefnum(refnum, tree);
        if (FAILED(hr))
            return hr;
        const std::u16string fullPath = WideText(path);
        const std::u16string text = WideText(value);
        uint32_t matched = 0;
        qv::com::ComPtr<IwbhwResourceTreeAccess> node;
        hr = tree->FindNode(fullPath.c_str(), &matched, 0, node.Put());
        if (FAILED(hr))
            return hr;
        if (!node) {
            // A service that hands back no node where the path leaves the tree: nothing to set.
            *found = 0;
            return S_OK;
        }
        const std::u16string name = fullPath.substr(std::min<size_t>(matched, fullPath.size()));
        hr = node->SetProperty(name.c_str(), text.c_str());
        if (FAILED(hr))
            return hr;
        *found = hr == S_FALSE ? 0 : 1;
        return S_OK;
    });
}
