// The framework's project item base: the item base plus renames, properties, overlays and
// removal queries of the project tree.
#pragma once

#include "framework/CqxItemUI.h"
#include "framework/IqxItem.h"
#include "framework/IqxProjectItemUI.h"

// One overlay change an item hands the framework: show IMAGE (add) or take it away.
struct CqxOverlayRecord {
    std::u16string image;
    bool add = false;
};

class CqxProjectItemUI : public CqxItemUI, public IqxProjectItemUI, public IqxItem {
public:
    using Interfaces = CqxItemUI::Interfaces::Append<IqxProjectItemUI, IqxItem>;

    // Rejects a null name and names holding one of the invalid name characters.
    HRESULT ValidateNewName(const char16_t* name) override;
    // The base has no properties dialog: E_NOTIMPL.
    HRESULT ShowProperties() override;
    // Applies the overlay records handed over since the last update.
    HRESULT UpdateOverlays() override;
    HRESULT GetOverlays(uint32_t* count, BSTR** images) override;
    // The base lets every item be removed.
    HRESULT QueryCanRemove() override;
    // The host item given to Bind.
    HRESULT GetProjectItem(IwbProjectItem** item) override;
    // IqxItem: the item is its own project-tree side.
    HRESULT GetProjectItemUI(IqxProjectItemUI** itemUI) override;

protected:
    CqxProjectItemUI() = default;

    // Queues an overlay change, applied by the next UpdateOverlays.
    void HandOverlay(CqxOverlayRecord record) { pending_.push_back(std::move(record)); }
    // The overlay images shown, in the order they were added.
    const std::vector<std::u16string>& Overlays() const { return overlays_; }

private:
    std::vector<CqxOverlayRecord> pending_;
    std::vector<std::u16string> overlays_;
};
