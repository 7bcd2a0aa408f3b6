// The dialogs of a Tangent I/O item, each a program the module ships: properties, resource
// selection and the explanation of the item's error.
#include "attribute_bag/ItemResourceContext.h"
#include "com/CallGuard.h"
#include "host/StatusError.h"
#include "host/contracts/IwbProjectItemUIMap.h"
#include "items/TIOInstanceItemUI.h"
#include "items/TIOItemCommands.h"
#include "items/TIOItemProperties.h"
#include "items/TIOProgramCall.h"
#include "items/TIOStrings.h"
#include "kern/Collate.h"
#include "kern/GuidText.h"

using qv::com::ComPtr;
using qv::com::GuardCall;
using qv::host::CheckStatus;
using qv::host::ResourceNode;
using qv::host::StatusError;

namespace {

// Terminals of the properties dialog.
namespace properties {
constexpr uint32_t kTarget = 11, kItem = 10, kAttributes = 9;
constexpr uint32_t kCancelled = 0, kNewAttributes = 1;
} // namespace properties

// Terminals of the select-resource dialog.
namespace select {
constexpr uint32_t kTarget = 11, kItem = 10, kResource = 9, kIdentifier = 8;
constexpr uint32_t kCancelled = 0, kNewResource = 1, kRename = 2;
} // namespace select

// Terminals of the explain-error dialog.
namespace explain {
constexpr uint32_t kMessage = 8, kMissing = 9;
constexpr uint32_t kShowOffending = 0;
} // namespace explain

// The name a resource suggests for an item: its display name, else its default item name,
// else its own name.
std::u16string SuggestedName(const ResourceNode& node) {
    if (auto display = node.Attribute(u"DisplayName"))
        return *display;
    if (auto defaultName = node.Attribute(u"TIODefaultName"))
        return *defaultName;
    return node.Name();
}

// Whether NAME is one the resource NODE gave the item rather than the user's own: it occurs in
// the node's display name or default item name (in its own name when it has neither).
bool NamedAfter(const ResourceNode& node, std::u16string_view name) {
    const auto display = node.Attribute(u"DisplayName");
    const auto defaultName = node.Attribute(u"TIODefaultName");
    if (!display && !defaultName)
        return node.Name().find(name) != std::u16string::npos;
    return (display && display->find(name) != std::u16string::npos) ||
           (defaultName && defaultName->find(name) != std::u16string::npos);
}

} // namespace

std::u16string TIOInstanceItemUI::ItemIdentifierText() const {
    QxItemInfoRecord record;
    CheckStatus(HostItem()->GetInfoRecord(&record));
    return qv::kern::GuidToString(record.id);
}

IwbProjectItem* TIOInstanceItemUI::OwningTarget(ItemResourceContext& context) const {
    if (HostItem() == nullptr)
        QV_THROW(StatusError(E_UNEXPECTED));
    const HRESULT filled = CheckStatus(context.Fill(HostItem()));
    if (filled != S_OK || context.Owner() == nullptr)
        QV_THROW(StatusError(E_FAIL));
    return context.Owner();
}

HRESULT TIOInstanceItemUI::ShowProperties() {
    if (workingSet_ == nullptr)
        return E_UNEXPECTED;
    return GuardCall([&]() -> HRESULT {
        ItemResourceContext context;
        IwbProjectItem* target = OwningTarget(context);
        const TIOAttrBag::NameSet hidden{std::u16string(tio::kResource)};
        std::vector<std::u16string> attributes;
        workingSet_->ExportClusterStrings(attributes, &hidden);

        std::vector<std::u16string> changed;
        {
            tio::ProgramCall call(tio::ProviderRoot(Provider()).Get(), tio::kPropertiesProgram);
            call.SetReference(properties::kTarget, target);
            call.SetReference(properties::kItem, HostItem());
            call.SetStrings(properties::kAttributes, attributes);
            call.Run();
            changed = call.Strings(properties::kNewAttributes);
            if (call.Boolean(properties::kCancelled))
                return S_OK;
        }
        // Every text is checked before the first is applied, so a dialog that hands back one
        // it cannot read changes nothing.
        TIOAttrBag check;
        CheckStatus(check.ImportClusterStrings(changed));
        CheckStatus(workingSet_->ImportClusterStrings(changed));
        // The dialog is not shown the resource; one that hands it back changed binds anew, so
        // the item never keeps a path it is not bound to.
        if (!qv::kern::EqualsNoCase(ResourcePathValue(), resourcePath_))
            return BindToResource(&context, 0, 0);
        return workingSet_->Root().NotifyChanges(false);
    });
}

HRESULT TIOInstanceItemUI::RunSelectResourceDialog() {
    if (workingSet_ == nullptr)
        return E_UNEXPECTED;
    return GuardCall([&]() -> HRESULT {
        ItemResourceContext context;
        IwbProjectItem* target = OwningTarget(context);
        const std::u16string oldPath = resourcePath_;
        std::u16string path;
        bool rename = false;
        {
            tio::ProgramCall call(tio::ProviderRoot(Provider()).Get(), tio::kSelectResourceProgram);
            call.SetReference(select::kTarget, target);
            call.SetReference(select::kItem, HostItem());
            call.SetString(select::kResource, oldPath);
            call.SetString(select::kIdentifier, ItemIdentifierText());
            call.Run();
            rename = call.Boolean(select::kRename);
            path = call.String(select::kNewResource);
            if (call.Boolean(select::kCancelled))
                return S_OK;
        }
        if (path.empty())
            return S_OK;
        // The new name is settled (and made unique) before anything changes, so a failing
        // unique-name program leaves the item as it was.
        const std::optional<std::u16string> newName =
            rename ? FollowingName(context.Root(), oldPath, path) : std::nullopt;
        if (!qv::kern::EqualsNoCase(path, oldPath)) {
            workingSet_->SetValue(tio::kResource, path);
            CheckStatus(BindToResource(&context, 0, 0));
        }
        if (newName) {
            CheckStatus(HostItem()->SetName(newName->c_str()));
            CheckStatus(HostItem()->Refresh(wbproj::kUpdateRenamed));
        }
        return S_OK;
    });
}

std::optional<std::u16string> TIOInstanceItemUI::FollowingName(const ResourceNode& root,
                                                               std::u16string_view oldPath,
                                                               std::u16string_view newPath) {
    if (!root || oldPath.empty())
        return std::nullopt;
    const ResourceNode oldNode = root.Find(oldPath);
    const ResourceNode newNode = root.Find(newPath);
    const std::u16string current = HostItemName();
    if (!oldNode || !newNode || !NamedAfter(oldNode, current))
        return std::nullopt;
    const std::u16string suggested = SuggestedName(newNode);
    // The item's own name is no other item's: one that already carries the suggestion keeps it.
    if (suggested.empty() || qv::kern::EqualsNoCase(suggested, current))
        return std::nullopt;
    return UniqueNameInScope(suggested);
}

HRESULT TIOInstanceItemUI::RunExplainErrorDialog() {
    return GuardCall([&]() -> HRESULT {
        std::u16string message;
        bool missing = false;
        ComPtr<IwbProjectItem> offending;
        if (FAILED(GetErrorInformation(&message, &missing, &offending))) {
            message =
                tio::ModuleString(CheckStatus(IsPhysical()) == S_OK ? tio::kStrNoErrorInfoPhysical
                                                                    : tio::kStrNoErrorInfo);
            missing = true;
            offending.Reset();
        }
        tio::ProgramCall call(tio::ProviderRoot(Provider()).Get(), tio::kExplainErrorProgram);
        call.SetString(explain::kMessage, message);
        call.SetInt32(explain::kMissing, missing ? 1 : 0);
        call.Run();
        if (call.Boolean(explain::kShowOffending) && offending) {
            CheckStatus(offending->Select());
            CheckStatus(offending->Show(1));
        }
        return S_OK;
    });
}
