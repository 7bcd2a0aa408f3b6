// The framework's item base: the main item interface, binding to the host item, and the
// provider check, over hooks that concrete items override.
#pragma once

#include "com/ComPtr.h"
#include "com/InterfaceList.h"
#include "framework/IqxBindable.h"
#include "framework/IqxItemUI.h"
#include "framework/IqxProjectItemValidator.h"
#include "framework/IqxProvider.h"
#include "host/contracts/IwbProjectItem.h"

#include <string>
#include <vector>

// A context-menu entry as items build it; handed out as QxMenuEntry.
struct CqxMenuEntry {
    std::u16string text;
    uint32_t flags = 0;
    uint32_t kind = 0;
    uint32_t group = 0;
    uint32_t position = 0;
    GUID command = GUID_NULL;
};

class CqxItemUI : public IqxItemUI, public IqxBindable, public IqxProjectItemValidator {
public:
    using Interfaces = qv::com::InterfaceList<IqxItemUI, IqxBindable, IqxProjectItemValidator>;

    // IqxItemUI
    HRESULT Initialize() override;
    HRESULT GetIconName(BSTR* name) override;
    HRESULT GetOptionWord(uint32_t* options) override;
    HRESULT GetContextMenu(uint32_t* count, QxMenuEntry** entries) override;
    HRESULT ExecuteCommand(const GUID& command) override;
    HRESULT IsValid() override;
    HRESULT Remove() override;
    HRESULT GetHelp(BSTR* path, BSTR* topic, BSTR* localizedContext) override;
    HRESULT GetDefaultHelp(BSTR* file, BSTR* topic, uint32_t* kind) override;
    // IqxBindable: keeps ITEM as the host item.
    HRESULT Bind(IwbProjectItem* item) override;
    // IqxProjectItemValidator: agrees when PROVIDER is the object that created this item.
    HRESULT ValidateAgainst(IUnknown* provider) override;

    // Records the provider that created the item (a reference is kept); null is ignored.
    void AttachProvider(IqxProvider* provider);

protected:
    CqxItemUI() = default;
    virtual ~CqxItemUI() = default;

    // The host item given to Bind (no reference added); null before.
    IwbProjectItem* HostItem() const { return hostItem_.Get(); }
    // The creating provider (no reference added); null when none was attached.
    IqxProvider* Provider() const { return provider_.Get(); }

    // Sets BITS in the option word.
    void SetOptionBits(uint32_t bits) { options_ |= bits; }
    uint32_t OptionWord() const { return options_; }
    // The icon file name the framework shows.
    void SetIconName(std::u16string name) { iconName_ = std::move(name); }
    const std::u16string& IconName() const { return iconName_; }
    // The characters the framework refuses in names (ValidateNewName).
    void SetInvalidNameChars(std::u16string chars) { invalidNameChars_ = std::move(chars); }
    const std::u16string& InvalidNameChars() const { return invalidNameChars_; }

    // Appends the item's context-menu entries; the base has none.
    virtual void AddMenuEntries(std::vector<CqxMenuEntry>& entries);

private:
    qv::com::ComPtr<IwbProjectItem> hostItem_;
    qv::com::ComPtr<IqxProvider> provider_;
    uint32_t options_ = 0;
    std::u16string iconName_;
    std::u16string invalidNameChars_;
};
