// Why a Tangent I/O item is in error: its resource is missing, or another item reserves it
// too. The messages are the module's strings with the item names filled in.
#include "attribute_bag/ItemResourceContext.h"
#include "com/CallGuard.h"
#include "com/PutBstr.h"
#include "host/ProjectItemQueries.h"
#include "host/StatusError.h"
#include "items/TIOInstanceItemUI.h"
#include "items/TIOStrings.h"

using qv::com::ComPtr;
using qv::com::GuardCall;
using qv::host::CheckStatus;
using qv::host::ResourceNode;

namespace {

constexpr std::u16string_view kSelfPlaceholder = u"<SelfProjectItemName>";
constexpr std::u16string_view kOffendingPlaceholder = u"<OffendingProjectItemName>";

// TEXT with every PLACEHOLDER replaced by VALUE; what VALUE brings in is not searched again.
std::u16string ReplaceAll(std::u16string text, std::u16string_view placeholder,
                          std::u16string_view value) {
    for (size_t at = text.find(placeholder); at != std::u16string::npos;
         at = text.find(placeholder, at + value.size()))
        text.replace(at, placeholder.size(), value);
    return text;
}

} // namespace

HRESULT TIOInstanceItemUI::GetErrorInformation(std::u16string* text, bool* missing,
                                               ComPtr<IwbProjectItem>* offending) {
    if (text != nullptr)
        text->clear();
    if (offending != nullptr)
        offending->Reset();
    const bool isMissing = resourceStatus_ == tio::status::kMissing;
    if (missing != nullptr)
        *missing = isMissing;
    if (HostItem() == nullptr)
        return E_UNEXPECTED;
    return GuardCall([&]() -> HRESULT {
        const std::u16string self = HostItemName();
        ItemResourceContext context;
        CheckStatus(context.Fill(HostItem(), true));
        const ResourceNode node = ResourceNodeOf(context.Root());
        std::u16string message;
        std::u16string other;
        if (isMissing) {
            // A missing resource is an error whether or not its text is asked for.
            const HRESULT physical = CheckStatus(IsPhysical());
            message = tio::ModuleString(physical == S_OK ? tio::kStrMissingPhysicalMessage
                                                         : tio::kStrMissingMessage);
        } else {
            auto holders =
                node ? node.ReservingItems(HostItem()) : std::vector<ComPtr<IwbProjectItem>>{};
            if (holders.empty())
                return S_FALSE;
            other = qv::host::ItemName(*holders.front().Get());
            if (offending != nullptr)
                *offending = std::move(holders.front());
            message = tio::ModuleString(tio::kStrConflictMessage);
        }
        if (text != nullptr)
            *text = ReplaceAll(ReplaceAll(std::move(message), kSelfPlaceholder, self),
                               kOffendingPlaceholder, other);
        return S_OK;
    });
}

HRESULT TIOInstanceItemUI::GetErrorText(BSTR* text) {
    if (text == nullptr)
        return E_POINTER;
    *text = nullptr;
    std::u16string message;
    const HRESULT hr = GetErrorInformation(&message, nullptr, nullptr);
    return FAILED(hr) ? hr : qv::com::PutBstr(message, text);
}

HRESULT TIOInstanceItemUI::GetErrorCategory(BSTR* text, BSTR* title, int32_t* category) {
    if (text == nullptr || title == nullptr)
        return E_POINTER;
    *text = nullptr;
    *title = nullptr;
    std::u16string message;
    bool missing = false;
    const HRESULT hr = GetErrorInformation(&message, &missing, nullptr);
    if (FAILED(hr))
        return hr;
    const HRESULT physical = IsPhysical();
    if (FAILED(physical))
        return physical;
    int32_t found = 3;
    if (hr == S_OK)
        found = !missing ? 2 : (physical == S_OK ? 1 : 0);
    static constexpr uint32_t kTitles[] = {tio::kStrCategoryMissing,
                                           tio::kStrCategoryMissingPhysical,
                                           tio::kStrCategoryConflict, tio::kStrCategoryNone};
    // Without an error the text says that there is nothing to explain.
    if (found == 3)
        message = tio::ModuleString(physical == S_OK ? tio::kStrNoErrorInfoPhysical
                                                     : tio::kStrNoErrorInfo);
    if (const HRESULT put = qv::com::PutBstr(message, text); FAILED(put))
        return put;
    if (const HRESULT put = qv::com::PutBstr(tio::ModuleString(kTitles[found]), title);
        FAILED(put)) {
        SysFreeString(*text);
        *text = nullptr;
        return put;
    }
    if (category != nullptr)
        *category = found;
    return S_OK;
}
