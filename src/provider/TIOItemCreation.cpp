// The item-creation routine.
#include "provider/TIOItemCreation.h"

#include "attribute_bag/ItemResourceContext.h"
#include "attribute_bag/TIOAttrBag.h"
#include "com/CallGuard.h"
#include "host/ProjectItemQueries.h"
#include "host/StatusError.h"
#include "host/contracts/IwbTargetItemChange.h"
#include "items/TIOInstanceItemUI.h"
#include "items/TIOItemProperties.h"
#include "kern/Collate.h"
#include "provider/TIOIdentifiers.h"
#include "resource_tree/ListText.h"

#include <algorithm>

namespace tio {

namespace {

using qv::com::ComPtr;
using qv::host::CheckStatus;

constexpr std::u16string_view kName = u"name";
constexpr std::u16string_view kHiddenTrue = u"true";

// Suspends the change handling of a target for as long as it lives and puts the previous setting
// back when it goes, whichever way the creations end.
class ChangeHandlingPause {
public:
    explicit ChangeHandlingPause(IUnknown* owner)
        : change_(qv::com::QueryAs<IwbTargetItemChange>(owner)) {
        if (change_ && FAILED(change_->SuspendChangeHandling(1, &previous_)))
            change_.Reset();
    }
    ~ChangeHandlingPause() {
        if (change_)
            change_->RestoreChangeHandling(previous_);
    }
    ChangeHandlingPause(const ChangeHandlingPause&) = delete;
    ChangeHandlingPause& operator=(const ChangeHandlingPause&) = delete;

private:
    ComPtr<IwbTargetItemChange> change_;
    int32_t previous_ = 0;
};

// The child of AT called NAME, or empty.
ComPtr<IwbProjectItem> ChildNamed(IwbProjectItem& at, const std::u16string& name) {
    ComPtr<IwbProjectItem> child;
    CheckStatus(at.FindChild(name.c_str(), child.Put()));
    return child;
}

// The folder NAME below AT, made when absent.
ComPtr<IwbProjectItem> FolderBelow(IwbProjectItem& at, const std::u16string& name) {
    if (ComPtr<IwbProjectItem> existing = ChildNamed(at, name)) {
        if (!IsEqualGUID(qv::host::ItemType(*existing.Get()), wbproj::kFolderType))
            QV_THROW(qv::host::StatusError(kNameTaken));
        return existing;
    }
    ComPtr<IwbProjectItem> made;
    CheckStatus(at.CreateChild(wbproj::kFolderType, name.c_str(), made.Put()));
    if (!made)
        QV_THROW(qv::host::StatusError(E_FAIL));
    return made;
}

// The Tangent I/O item object the host made for ITEM; null when it made another kind.
TIOInstanceItemUI* IOItemObject(IwbProjectItem& item) {
    ComPtr<IUnknown> object;
    CheckStatus(item.GetObject(object.Put()));
    const auto own = qv::com::QueryAs<IwbTIOItemUIPrivate>(object.Get());
    return own ? dynamic_cast<TIOInstanceItemUI*>(own.Get()) : nullptr;
}

// Clears the shown bit of ITEM when the resource at PATH in its tree says "HiddenTIO" "true".
void HideWhenResourceSays(IwbProjectItem& item, const std::u16string& path) {
    ItemResourceContext context;
    CheckStatus(context.Fill(&item));
    // An empty path names no resource (to the tree it would name the root).
    const qv::host::ResourceNode node =
        path.empty() || !context.Root() ? qv::host::ResourceNode() : context.Root().Find(path);
    if (!node)
        return;
    const auto hidden = node.Attribute(kHiddenProperty);
    if (!hidden || !qv::kern::EqualsNoCase(*hidden, kHiddenTrue))
        return;
    uint32_t flags = 0;
    CheckStatus(item.GetFlags(&flags));
    CheckStatus(item.SetFlags(flags & ~wbproj::kShownFlag));
}

HRESULT CreateItem(IwbProjectItem& parent, std::u16string_view text) {
    TIOAttrBag bag;
    TIOAttrBag* set = nullptr;
    if (TIOAttrBag::ReadXml(text, bag, &set) != 0 || set == nullptr)
        return E_FAIL;
    const std::vector<std::u16string> parts =
        wbhw::SplitListText(set->GetValue(kName), u'/', false);
    if (parts.empty() ||
        std::any_of(parts.begin(), parts.end(), [](const auto& p) { return p.empty(); }))
        return E_INVALIDARG;
    ComPtr<IwbProjectItem> at = ComPtr<IwbProjectItem>::Share(&parent);
    for (size_t i = 0; i + 1 < parts.size(); ++i)
        at = FolderBelow(*at.Get(), parts[i]);
    // Two items of one name below one folder could not be told apart by their place.
    if (ChildNamed(*at.Get(), parts.back()))
        return kNameTaken;
    ComPtr<IwbProjectItem> item;
    CheckStatus(at->CreateChild(kIOItemType, parts.back().c_str(), item.Put()));
    TIOInstanceItemUI* const object = item ? IOItemObject(*item.Get()) : nullptr;
    if (object == nullptr)
        return E_NOINTERFACE;
    std::u16string stored;
    bag.WriteXml(stored);
    CheckStatus(object->LoadCreatedBag(stored));
    HideWhenResourceSays(*item.Get(), set->GetValue(kResource));
    return S_OK;
}

} // namespace

HRESULT CreateItemFromText(const CreationContext& context, size_t index) {
    if (context.parent == nullptr)
        return E_POINTER;
    if (index >= context.texts.size())
        return E_FAIL;
    return qv::com::GuardCall([&] { return CreateItem(*context.parent, context.texts[index]); });
}

HRESULT CreateItemsFromTexts(const CreationContext& context, IUnknown* changeOwner) {
    return qv::com::GuardCall([&] {
        const ChangeHandlingPause pause(changeOwner);
        for (size_t i = 0; i < context.texts.size(); ++i) {
            if (const HRESULT hr = CreateItemFromText(context, i); FAILED(hr))
                return hr;
        }
        return S_OK;
    });
}

} // namespace tio
