// The base of hardware items that belong to a target: initialisation (name rules, help folder),
// binding with its format-version check, the being-removed flag, the invalid-configuration
// overlay, help from resource nodes, deferred notifications and the host's deferred callbacks.
#pragma once

#include "framework/IwbCompileConfiguration.h"
#include "framework/IwbHWDeferredMethodDispatcher.h"
#include "framework/IwbProjectCallback.h"
#include "host/ResourceNode.h"
#include "items/BaseItemUI.h"

#include <string>

namespace wbhw {

// Help that a resource node carries in its "Help" child.
struct NodeHelp {
    std::u16string path;
    std::u16string topic;
    std::u16string localizedContext;
};

class BaseHWItemUI : public BaseItemUI,
                     public IwbProjectCallback,
                     public IwbCompileConfiguration,
                     public IwbHWDeferredMethodDispatcher,
                     public IwbHWDeferredNotifications {
public:
    using Interfaces =
        BaseItemUI::Interfaces::Append<IwbProjectCallback, IwbCompileConfiguration,
                                       IwbHWDeferredMethodDispatcher, IwbHWDeferredNotifications>;

    // Option bit 2, the framework's initialisation, the characters names may not hold (with
    // the control characters) and the help folder below the host's folder.
    HRESULT Initialize() override;
    // The framework's bind, the icon, the format-version check and the refreshes.
    HRESULT Bind(IwbProjectItem* item) override;
    // Marks the item as being removed, tells its owner and detaches, then the framework's removal.
    HRESULT Remove() override;
    // Hands the framework the "InvalidConfig.png" overlay (added while the item is not valid,
    // removed while it is), then applies the framework's overlays.
    HRESULT UpdateOverlays() override;

    HRESULT OnProjectCallback(IUnknown* callback, int32_t applies) override;
    HRESULT GetPendingCallbacks(uint32_t* bits) override;
    HRESULT DispatchNotifications(uint32_t count, const char16_t* const* names) override;
    // The base defers no method work.
    HRESULT DispatchDeferredMethods() override { return S_OK; }

    // The folder that help files are looked up in: the host's folder joined with "help".
    const std::u16string& HelpFolder() const noexcept { return helpFolder_; }
    bool BeingRemoved() const noexcept { return beingRemoved_; }

protected:
    BaseHWItemUI();

    // The "Help" child of NODE: path, topic and (with WANTCONTEXT) localized context, each
    // empty when absent. False when NODE has no "Help" child. Failing queries throw.
    static bool HelpOnNode(const qv::host::ResourceNode& node, NodeHelp& help,
                           bool wantContext = true);

    void SetBeingRemoved(bool removed) noexcept { beingRemoved_ = removed; }
    // The item's current format version; a stored older one asks for an upgrade callback.
    void SetFormatVersion(uint32_t version) noexcept { version_ = version; }

    // Item-specific texts and hooks; the base's are empty.
    virtual std::u16string NotificationName() const { return {}; }
    virtual std::u16string VersionPropertyName() const { return {}; }
    virtual std::u16string InitialIconName() const { return {}; }
    // Converts the item's stored state from STOREDVERSION to the current one.
    virtual HRESULT Upgrade(uint32_t /*storedVersion*/) { return S_OK; }
    // Tells the owning target that the item changed (or goes); the base tells nobody.
    virtual HRESULT NotifyOwner() { return S_OK; }
    // Lets go of the item's watches before it goes; the base has none.
    virtual HRESULT Detach() { return S_OK; }

private:
    // The stored format version (0 when absent or the item names no version property).
    uint32_t StoredVersion();
    HRESULT UpgradeIfOlder();

    uint32_t callbackFlags_ = 0;
    uint32_t version_ = 0;
    bool beingRemoved_ = false;
    std::u16string helpFolder_;
};

} // namespace wbhw
