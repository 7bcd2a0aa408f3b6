// The hardware-item base of target items.
#include "items/BaseHWItemUI.h"

#include "com/CallGuard.h"
#include "host/HostFolder.h"
#include "host/StatusError.h"
#include "host/contracts/IwbProjectPropertyBag.h"
#include "kern/CodePage.h"
#include "kern/Collate.h"

namespace wbhw {

using qv::com::ComPtr;
using qv::com::GuardCall;

namespace {

// Names hold none of these, besides the control characters the name check refuses.
constexpr std::u16string_view kInvalidNameChars = u"\\'\"<>|";
constexpr uint32_t kOptionBit2 = 0x4;
constexpr std::u16string_view kDeferredPropertyDispatch = u"QV.WB.WBHW.DeferredPropertyDispatch";

std::u16string InvalidNameCharacters() {
    std::u16string chars(kInvalidNameChars);
    for (char16_t c = 1; c < 0x20; ++c)
        chars += c;
    chars += u'\x7F';
    return chars;
}

} // namespace

BaseHWItemUI::BaseHWItemUI() {
    Enable();
}

HRESULT BaseHWItemUI::Initialize() {
    return GuardCall([&] {
        SetOptionBits(kOptionBit2);
        const HRESULT hr = CqxProjectItemUI::Initialize();
        SetInvalidNameChars(InvalidNameCharacters());
        // Help is looked up below the host's own folder; a host that names none leaves help
        // without a folder rather than refusing the item.
        const auto hostFolder = qv::host::AskHostFolder();
        helpFolder_ = hostFolder ? qv::kern::AnsiToWide(*hostFolder) + u"/help" : std::u16string();
        return hr;
    });
}

HRESULT BaseHWItemUI::Bind(IwbProjectItem* item) {
    if (const HRESULT hr = CqxProjectItemUI::Bind(item); FAILED(hr))
        return hr;
    return GuardCall([&]() -> HRESULT {
        SetIconName(InitialIconName());
        if (StoredVersion() < version_)
            callbackFlags_ |= wbproj::callback::kUpgradeVersion;
        if (const HRESULT hr = Refresh(); FAILED(hr))
            return hr;
        return RefreshResources();
    });
}

HRESULT BaseHWItemUI::Remove() {
    beingRemoved_ = true;
    if (const HRESULT hr = NotifyOwner(); FAILED(hr))
        return hr;
    if (const HRESULT hr = Detach(); FAILED(hr))
        return hr;
    return CqxProjectItemUI::Remove();
}

HRESULT BaseHWItemUI::UpdateOverlays() {
    const HRESULT valid = IsValid();
    if (FAILED(valid))
        return valid;
    return GuardCall([&] {
        HandOverlay({u"wbhw/InvalidConfig.png", valid != S_OK});
        return CqxProjectItemUI::UpdateOverlays();
    });
}

HRESULT BaseHWItemUI::OnProjectCallback(IUnknown* callback, int32_t applies) {
    if (callback == nullptr || applies == 0)
        return S_OK;
    HRESULT hr = S_OK;
    if (callbackFlags_ & wbproj::callback::kPendingWork) {
        hr = RunPendingWork();
        if (hr == S_OK)
            hr = RefreshResources();
        callbackFlags_ &= ~wbproj::callback::kPendingWork;
    }
    if (callbackFlags_ & wbproj::callback::kUpgradeVersion) {
        hr = UpgradeIfOlder();
        callbackFlags_ &= ~wbproj::callback::kUpgradeVersion;
    }
    return hr;
}

HRESULT BaseHWItemUI::GetPendingCallbacks(uint32_t* bits) {
    if (bits == nullptr)
        return E_POINTER;
    *bits = callbackFlags_;
    return S_OK;
}

HRESULT BaseHWItemUI::DispatchNotifications(uint32_t count, const char16_t* const* names) {
    if (count != 0 && names == nullptr)
        return E_POINTER;
    return GuardCall([&] {
        const std::u16string own = NotificationName();
        HRESULT last = S_OK;
        for (uint32_t i = 0; i < count; ++i) {
            const std::u16string_view name = names[i] != nullptr ? names[i] : u"";
            if (!own.empty() && qv::kern::EqualsNoCase(name, own))
                last = RefreshResources();
            else if (qv::kern::EqualsNoCase(name, kDeferredPropertyDispatch))
                last = DispatchDeferredMethods();
            else
                continue;
            if (FAILED(last))
                return last;
        }
        return last;
    });
}

bool BaseHWItemUI::HelpOnNode(const qv::host::ResourceNode& node, NodeHelp& help,
                              bool wantContext) {
    help = NodeHelp();
    const qv::host::ResourceNode child = node.Find(u"Help");
    if (!child)
        return false;
    help.path = child.Attribute(u"Path").value_or(u"");
    help.topic = child.Attribute(u"Topic").value_or(u"");
    if (wantContext)
        help.localizedContext = child.Attribute(u"LocalizedContext").value_or(u"");
    return true;
}

uint32_t BaseHWItemUI::StoredVersion() {
    const std::u16string name = VersionPropertyName();
    if (name.empty() || HostItem() == nullptr)
        return 0;
    ComPtr<IwbProjectPropertyBag> bag;
    qv::host::CheckStatus(HostItem()->GetPropertyBag(bag.Put()));
    int32_t stored = 0;
    return qv::host::CheckStatus(bag->GetInt(name.c_str(), &stored)) == S_OK
               ? static_cast<uint32_t>(stored)
               : 0;
}

HRESULT BaseHWItemUI::UpgradeIfOlder() {
    return GuardCall([&]() -> HRESULT {
        const uint32_t stored = StoredVersion();
        if (stored >= version_)
            return S_OK;
        if (const HRESULT hr = Upgrade(stored); FAILED(hr))
            return hr;
        ComPtr<IwbProjectPropertyBag> bag;
        qv::host::CheckStatus(HostItem()->GetPropertyBag(bag.Put()));
        return bag->SetInt(VersionPropertyName().c_str(), static_cast<int32_t>(version_), 0);
    });
}

} // namespace wbhw
