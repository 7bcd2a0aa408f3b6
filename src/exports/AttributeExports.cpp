// The exported edits of Tangent I/O items' attributes: cluster texts applied to one item, or one
// text to each of several items.
#include "exports/Export.h"
#include "exports/ResTreeFrame.h"
#include "host/HostStringArray.h"
#include "items/TIOItemInterfaces.h"

#include <cstdint>
#include <cstring>
#include <string>
#include <vector>

namespace {

// The texts of the host string array at ARRAY (null or an absent handle: none), as wide texts.
std::vector<std::u16string> WideTexts(const qv::host::HostStringArray* array) {
    std::vector<std::u16string> texts;
    if (array == nullptr)
        return texts;
    for (const std::string& text : qv::host::ReadHostStringArray(*array))
        texts.push_back(qv::kern::AnsiToWide(text));
    return texts;
}

// The refnums of a host array of refnums: a signed 32-bit count, then the 32-bit numbers.
std::vector<WBRefNum> Refnums(const WBHandle* array) {
    if (array == nullptr || *array == nullptr || **array == nullptr)
        return {};
    const auto* block = static_cast<const unsigned char*>(**array);
    int32_t count = 0;
    std::memcpy(&count, block, sizeof count);
    std::vector<WBRefNum> refnums(count > 0 ? static_cast<size_t>(count) : 0);
    if (!refnums.empty())
        std::memcpy(refnums.data(), block + sizeof count, refnums.size() * sizeof(WBRefNum));
    return refnums;
}

// Applies TEXTS to the item behind the refnum at REFNUM.
HRESULT SetItemAttributes(const WBRefNum* refnum, const std::vector<std::u16string>& texts) {
    qv::com::ComPtr<IwbTIOItemUIPrivate> item;
    const HRESULT hr = qv::exports::QueryRefnum(refnum, item);
    if (FAILED(hr))
        return hr;
    std::vector<const char16_t*> pointers;
    pointers.reserve(texts.size());
    for (const std::u16string& text : texts)
        pointers.push_back(text.c_str());
    return item->SetAttributes(static_cast<uint32_t>(pointers.size()), pointers.data());
}

} // namespace

// Applies the cluster texts of *ATTRIBUTES (one attribute each) to the item behind the refnum at
// REFNUM, which then binds to its resource again; answers the item's status.
WBT_EXPORT int32_t TIO_SetAttributes(const WBRefNum* refnum,
                                     const qv::host::HostStringArray* attributes) noexcept {
    return qv::exports::AnswerStatus(
        [&]() -> int32_t { return SetItemAttributes(refnum, WideTexts(attributes)); });
}

// Applies text i of *ATTRIBUTES to the item of refnum i of *ITEMS, in order; the first failure
// stops the walk (items changed before it stay changed). An array with fewer refnums than texts
// answers E_INVALIDARG before any item is touched.
WBT_EXPORT int32_t TIO_SetAttributesOnMultiple(
    const WBHandle* items, const qv::host::HostStringArray* attributes) noexcept {
    return qv::exports::AnswerStatus([&]() -> int32_t {
        const std::vector<std::u16string> texts = WideTexts(attributes);
        if (texts.empty())
            return S_OK;
        // The caller's count is the only thing that says how far its block goes: reading refnums
        // past it would take whatever follows in memory for items.
        const std::vector<WBRefNum> refnums = Refnums(items);
        if (refnums.size() < texts.size())
            return E_INVALIDARG;
        HRESULT hr = S_OK;
        for (size_t i = 0; i < texts.size(); ++i) {
            hr = SetItemAttributes(&refnums[i], {texts[i]});
            if (FAILED(hr))
                return hr;
        }
        return hr;
    });
}
