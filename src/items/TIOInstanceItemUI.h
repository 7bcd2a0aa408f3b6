// The Tangent I/O item: a named use of one FPGA I/O resource of the item's target. It keeps an
// attribute bag whose "resource" names the resource, saves the bag in its host item's
// properties, reserves and watches the resource node, and reports a resource status.
#pragma once

#include "attribute_bag/TIOAttrBag.h"
#include "framework/IqxPersistableItem3.h"
#include "host/ResourceNode.h"
#include "host/contracts/IwbProjectPropertyBag.h"
#include "host/contracts/IwbhwResourceTreeNodeObserver.h"
#include "items/BaseHWItemUI.h"
#include "items/TIOItemInterfaces.h"

#include <memory>
#include <optional>
#include <string>

class ItemResourceContext;

// Resource statuses, also stored in "tioResourceStatus".
namespace tio::status {
inline constexpr int32_t kBound = 0;    // the node exists and is reserved for the item
inline constexpr int32_t kMissing = 1;  // no tree, no resource chosen, or no node at the path
inline constexpr int32_t kConflict = 2; // the node exists but another item holds it
} // namespace tio::status

class TIOInstanceItemUI : public TIOAttrBag::ChangeObserver,
                          public IwbhwResourceItemUI2,
                          public IwbTIOItemUIPrivate,
                          public IwbhwResourceTreeNodeObserver,
                          public IwbTIOGAttributeSet,
                          public IwbTIOInstanceItemUI,
                          public IwbTIOItemError,
                          public IwbTIOItemScope,
                          public wbhw::BaseHWItemUI,
                          public IqxPersistableItem3 {
public:
    using Interfaces =
        wbhw::BaseHWItemUI::Interfaces::Append<IwbhwResourceItemUI2, IwbTIOItemUIPrivate,
                                               IwbhwResourceTreeNodeObserver, IwbTIOGAttributeSet,
                                               IwbTIOInstanceItemUI, IwbTIOItemError,
                                               IwbTIOItemScope, IqxPersistableItem3>;

    // 0 bound, 1 missing, 2 held by another item.
    int32_t resourceStatus() const { return resourceStatus_; }
    // The item's attribute bag; null until the item is loaded.
    const TIOAttrBag* attributeBag() const { return attrBag_.get(); }
    // Gives a newly created item its attribute bag: stores TEXT (attribute-bag XML) in
    // "tioAttrBag" and loads the item from it, binding it to the resource it names.
    HRESULT LoadCreatedBag(std::u16string_view text);

    // IqxItemUI / IqxBindable / IqxProjectItemUI
    HRESULT Bind(IwbProjectItem* item) override;
    HRESULT GetIconName(BSTR* name) override;
    HRESULT IsValid() override;
    // IqxProjectItemUI: accepts NAME (trimmed) when it is the current name in another case, or
    // holds no invalid character and no other resource item of the name scope carries it.
    HRESULT ValidateNewName(const char16_t* name) override;

    // The name scope of ITEM: the nearest ancestor whose object is an item scope, else the
    // target that owns its resource tree. SCOPE receives it with a reference.
    HRESULT FindNameScope(IwbProjectItem* item, IwbProjectItem** scope);
    // S_OK when a resource item below SCOPE is called NAME (case aside), S_FALSE when none is.
    HRESULT IsNameInUse(IwbProjectItem* scope, std::u16string_view name);
    // Whether the item is in error: S_OK when it is, S_FALSE when not. TEXT (optional) receives
    // the message with the item names filled in, MISSING (optional) whether the resource is
    // missing, OFFENDING (optional) the other item that reserves the resource.
    HRESULT GetErrorInformation(std::u16string* text, bool* missing,
                                qv::com::ComPtr<IwbProjectItem>* offending);

    // TIOAttrBag::ChangeObserver: writes the bag into "tioAttrBag" when its text changed.
    int32_t OnAttrBagChanged(TIOAttrBag& set, bool wasDirty, bool forced) override;

    // IwbhwResourceTreeNodeObserver
    HRESULT OnNodeEvent(IUnknown* node, uint32_t events, uint32_t kind) override;

    // IwbCompileConfiguration
    HRESULT GetCompileConfiguration(BSTR* text) override;

    // IwbhwResourceItemUI2
    HRESULT GetResource(BSTR* path, int32_t* exists, int32_t* reserved) override;
    HRESULT GetResourcePath(BSTR* path) override;
    HRESULT Rebind() override;
    HRESULT SetResource(const char16_t* path) override;

    // IwbTIOItemUIPrivate
    HRESULT SetAttributes(uint32_t count, const char16_t* const* texts) override;
    HRESULT GetDecoratedName(BSTR* name, int32_t* fromResource) override;
    HRESULT GenerateUniqueName(const char16_t* proposed, BSTR* unique) override;

    // IwbTIOGAttributeSet
    HRESULT GetAttribute(const char16_t* path, BSTR* value) override;
    HRESULT GetAttributeNames(const char16_t* options, uint32_t* count, BSTR** names) override;

    // IwbTIOInstanceItemUI
    HRESULT SetPhysical(int32_t physical) override;
    HRESULT IsPhysical() override;
    HRESULT ResourceOK() override;
    HRESULT GetResourceStatus(int32_t* status) override;

    // IwbTIOItemError
    HRESULT HasError() override;
    HRESULT GetErrorText(BSTR* text) override;
    HRESULT GetErrorCategory(BSTR* text, BSTR* title, int32_t* category) override;

    // IwbProjectItemObserver: a move to another target lets go of the old target's tree and
    // binds in the new one; a move within a target changes nothing.
    HRESULT OnProjectItemEvents(uint32_t count, const WbProjectItemEvent* events) override;

    // IwbTIOItemScope
    HRESULT GetScope(uint32_t* count, GUID** types, BSTR** names) override;

    // IqxPersistableItem3: everything lives in the property bag, so there is nothing to do.
    HRESULT IsDirty() override { return S_FALSE; }
    HRESULT SaveState(IUnknown*) override { return E_NOTIMPL; }
    HRESULT WantsState() override { return S_FALSE; }
    HRESULT LoadState(IUnknown*) override { return E_NOTIMPL; }

    // The project tree's requests: the commands of the context menu, the properties dialog,
    // help, removal and cut, and drag and drop.
    HRESULT ExecuteCommand(const GUID& command) override;
    HRESULT ShowProperties() override;
    HRESULT GetHelp(BSTR* path, BSTR* topic, BSTR* localizedContext) override;
    // The module's own page on basic I/O, shown as help of kind 5.
    HRESULT GetDefaultHelp(BSTR* file, BSTR* topic, uint32_t* kind) override;
    // A physical item may be neither removed nor cut (S_FALSE).
    HRESULT QueryCanRemove() override;
    HRESULT QueryCanCut() override;
    // S_OK when the item may go under TARGET: a target (or a place below one) that owns a
    // resource tree, and for a physical item only its own target.
    HRESULT DropAllowed(IUnknown* dragged, IwbProjectItem* target) override;
    // Runs the drop program when FOURTH is 0 and EFFECTS allows it; see the effects below.
    HRESULT Drop(int32_t first, int32_t second, int32_t third, int32_t fourth, uint32_t effects,
                 uint32_t* effect) override;
    // Binds to the resource where the drop put the item.
    HRESULT Dropped() override;

protected:
    TIOInstanceItemUI();
    ~TIOInstanceItemUI() override;

    std::u16string InitialIconName() const override;
    HRESULT NotifyOwner() override;
    HRESULT Detach() override;
    // The select-resource entry (unless the target's tree takes it away or the item is
    // physical) and, while the item is in error, the explain-error entry.
    void AddMenuEntries(std::vector<CqxMenuEntry>& entries) override;

private:
    // Reads the bag from "tioAttrBag" (an empty one when absent) and binds to its resource.
    HRESULT Load();
    // Undoes the watches and reservation of the node at the last bound path, brings the working
    // set in line with its resource's definitions and reserves and watches the resource again.
    // CONTEXT null: found from the item. KIND and EVENTS: the notification that asked for it.
    HRESULT BindToResource(ItemResourceContext* context, uint32_t kind, uint32_t events);
    // Records STATUS, refreshes the item, applies the hidden rule (RESOURCE: the node at the
    // working set's path, empty when there is none) and stores the status.
    void SetStatus(int32_t status, const qv::host::ResourceNode& resource);
    // Hides the item when its resource says "HiddenTIO" (remembered in the property) or the
    // property says so already.
    void ApplyHiddenRule(const qv::host::ResourceNode& resource);

    // Notifications, by registration kind.
    void OnResourceEvent(const qv::host::ResourceNode& node, uint32_t events);
    HRESULT OnWatchEvent(const qv::host::ResourceNode& node, uint32_t events);
    void OnSignatureEvent(const qv::host::ResourceNode& node, uint32_t events);

    // Removes every watch of the item from the tree at ROOT and releases the reservation of the
    // node at the working set's path there (nothing for an empty ROOT).
    void LetGoOfTree(const qv::host::ResourceNode& root);

    // Watches on the resource node's attribute definitions (kind 3).
    void ObserveDefinitions(const qv::host::ResourceNode& resource, uint32_t events);
    void StopDefinitions(const qv::host::ResourceNode& resource);
    // Watches on its methods and properties (kind 4), recording their signatures.
    void ObserveSignatures(const qv::host::ResourceNode& resource);
    void StopSignatures(const qv::host::ResourceNode& resource);
    void IncrementFeatureSetVersion();
    // Watches for the resource at the working set's path to appear below WATCHED (kind 2).
    void WatchForResource(const qv::host::ResourceNode& watched);

    // The dialogs behind the commands, and the drop program.
    HRESULT RunSelectResourceDialog();
    HRESULT RunExplainErrorDialog();
    void RunDropProgram(int32_t first, int32_t second, int32_t third);
    // The name the item takes when the select-resource dialog moves it from the resource at
    // OLDPATH to the one at NEWPATH: the new resource's name, unique in the item's scope, when
    // the item was named after the old one; nothing when it keeps its name.
    std::optional<std::u16string> FollowingName(const qv::host::ResourceNode& root,
                                                std::u16string_view oldPath,
                                                std::u16string_view newPath);
    // The target that owns the item's resource tree, filling CONTEXT; throws E_FAIL when none.
    IwbProjectItem* OwningTarget(ItemResourceContext& context) const;
    // The identifier of the host item's information record, as text.
    std::u16string ItemIdentifierText() const;
    // The item's place for the drop program: "NAME.{TYPE}>>" per item above it, then its own.
    std::u16string DropChainText();
    // S_OK when the item may go (removal, cut), S_FALSE for a physical item.
    HRESULT CanGo();

    // Appends the compile configuration to OUT (what was built stays when a query throws).
    void BuildCompileConfiguration(std::u16string& out);
    // The root of the item's resource tree, or empty when the item has no tree (yet).
    qv::host::ResourceNode TreeRoot();
    // The node at the working set's "resource" path, or empty.
    qv::host::ResourceNode ResourceNodeOf(const qv::host::ResourceNode& root) const;
    // The working set's "resource" path ("" before the item is loaded).
    std::u16string ResourcePathValue() const;
    qv::com::ComPtr<IwbProjectPropertyBag> Properties() const;
    // The host item's name.
    std::u16string HostItemName() const;
    // PROPOSED when no resource item of the item's name scope carries it (case aside), else
    // what the host's unique-name program makes of it next to the names there. Failing host
    // calls throw StatusError.
    std::u16string UniqueNameInScope(std::u16string_view proposed);
    IwbhwResourceTreeNodeObserver* AsObserver() { return this; }
    IUnknown* Self();

    std::unique_ptr<TIOAttrBag> attrBag_;
    TIOAttrBag* workingSet_ = nullptr;
    std::u16string resourcePath_;
    int32_t resourceStatus_ = tio::status::kMissing;
    bool iconResolved_ = false;
};
