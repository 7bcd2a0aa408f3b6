// The Tangent I/O item: loading, saving, binding to the resource and the resource status.
#include "items/TIOInstanceItemUI.h"

#include "attribute_bag/ItemResourceContext.h"
#include "attribute_bag/ResourceSync.h"
#include "com/CallGuard.h"
#include "host/StatusError.h"
#include "host/contracts/IwbTargetItemChange.h"
#include "items/TIOItemProperties.h"
#include "kern/Collate.h"

using qv::com::ComPtr;
using qv::com::GuardCall;
using qv::host::CheckStatus;
using qv::host::ResourceNode;
namespace event = wbhw::node_event;

TIOInstanceItemUI::TIOInstanceItemUI() {
    SetBeingRemoved(false);
}

// The working set points into the bag; the bag goes with the item.
TIOInstanceItemUI::~TIOInstanceItemUI() = default;

IUnknown* TIOInstanceItemUI::Self() {
    return static_cast<IUnknown*>(static_cast<IqxItemUI*>(this));
}

std::u16string TIOInstanceItemUI::InitialIconName() const {
    return std::u16string(tio::kDefaultIcon);
}

ComPtr<IwbProjectPropertyBag> TIOInstanceItemUI::Properties() const {
    if (HostItem() == nullptr)
        QV_THROW(qv::host::StatusError(E_UNEXPECTED));
    ComPtr<IwbProjectPropertyBag> bag;
    CheckStatus(HostItem()->GetPropertyBag(bag.Put()));
    if (!bag)
        QV_THROW(qv::host::StatusError(E_FAIL));
    return bag;
}

std::u16string TIOInstanceItemUI::ResourcePathValue() const {
    return workingSet_ != nullptr ? workingSet_->GetValue(tio::kResource) : std::u16string();
}

ResourceNode TIOInstanceItemUI::TreeRoot() {
    ItemResourceContext context;
    if (HostItem() == nullptr || context.Fill(HostItem()) != S_OK)
        return {};
    return context.Root();
}

ResourceNode TIOInstanceItemUI::ResourceNodeOf(const ResourceNode& root) const {
    const std::u16string path = ResourcePathValue();
    // An empty path names no resource (to the tree it would name the root).
    return root && !path.empty() ? root.Find(path) : ResourceNode();
}

HRESULT TIOInstanceItemUI::Bind(IwbProjectItem* item) {
    if (const HRESULT hr = BaseHWItemUI::Bind(item); FAILED(hr))
        return hr;
    if (const HRESULT hr = Load(); FAILED(hr))
        return hr;
    return GuardCall([&] {
        ApplyHiddenRule(ResourceNodeOf(TreeRoot()));
        return S_OK;
    });
}

HRESULT TIOInstanceItemUI::Load() {
    return GuardCall([&]() -> HRESULT {
        const auto properties = Properties();
        // Until a bag has been read whole, the item has no working set: it then never writes
        // "tioAttrBag", so a stored text it cannot read is kept as it was.
        workingSet_ = nullptr;
        attrBag_ = std::make_unique<TIOAttrBag>();
        BSTR stored = nullptr;
        const HRESULT read = properties->GetString(tio::kAttrBagProperty, &stored);
        const qv::com::UniqueBstr held(stored);
        CheckStatus(read);
        TIOAttrBag* working = attrBag_.get();
        if (read == S_OK) {
            const HRESULT parsed =
                TIOAttrBag::ReadXml(qv::com::BstrToString(stored), *attrBag_, &working);
            if (FAILED(parsed) || working == nullptr)
                return FAILED(parsed) ? parsed : E_FAIL;
        }
        workingSet_ = working;
        if (!workingSet_->FindVisible(tio::kResource))
            workingSet_->SetValue(tio::kResource, u"");
        resourcePath_ = workingSet_->GetValue(tio::kResource);
        workingSet_->SetObserver(this);
        if (const HRESULT hr = BindToResource(nullptr, 0, 0); FAILED(hr))
            return hr;
        return workingSet_->Root().NotifyChanges(false);
    });
}

int32_t TIOInstanceItemUI::OnAttrBagChanged(TIOAttrBag&, bool, bool) {
    if (workingSet_ == nullptr)
        return S_OK;
    return GuardCall([&]() -> HRESULT {
        std::u16string text;
        workingSet_->WriteXml(text);
        const auto properties = Properties();
        BSTR stored = nullptr;
        const HRESULT read = properties->GetString(tio::kAttrBagProperty, &stored);
        const qv::com::UniqueBstr held(stored);
        if (read == S_OK && qv::com::BstrToString(stored) == text)
            return S_OK;
        CheckStatus(properties->SetString(tio::kAttrBagProperty, text.c_str(), 1));
        return NotifyOwner();
    });
}

HRESULT TIOInstanceItemUI::NotifyOwner() {
    return GuardCall([&]() -> HRESULT {
        ItemResourceContext context;
        if (HostItem() == nullptr || context.Fill(HostItem(), true) != S_OK)
            return S_OK;
        const auto change = qv::com::QueryAs<IwbTargetItemChange>(context.OwnerObject());
        return change ? change->ItemChanged(Self()) : S_OK;
    });
}

HRESULT TIOInstanceItemUI::BindToResource(ItemResourceContext* given, uint32_t kind,
                                          uint32_t events) {
    if (workingSet_ == nullptr)
        return E_UNEXPECTED;
    return GuardCall([&]() -> HRESULT {
        ItemResourceContext filled;
        if (given == nullptr) {
            if (HostItem() == nullptr)
                return E_UNEXPECTED;
            if (const HRESULT hr = filled.Fill(HostItem()); hr != S_OK)
                return FAILED(hr) ? hr : E_FAIL;
        }
        ItemResourceContext& context = given != nullptr ? *given : filled;
        const ResourceNode root = context.Root();
        int32_t status = tio::status::kMissing;
        ResourceNode node;
        if (root) {
            const ResourceNode old =
                resourcePath_.empty() ? ResourceNode() : root.Find(resourcePath_);
            if (old) {
                old.RemoveObserver(AsObserver(), tio::kind::kResource);
                StopSignatures(old);
                StopDefinitions(old);
                old.ReleaseReservation(HostItem());
            }
            const bool dropDefinitions = kind == tio::kind::kResource && (events & 0x1) != 0;
            CheckStatus(SyncFromResource(context, *workingSet_, dropDefinitions, &node));
            if (node) {
                status = node.Reserve(HostItem(), tio::kReserveMode) == S_FALSE
                             ? tio::status::kConflict
                             : tio::status::kBound;
                ObserveDefinitions(node, kind == tio::kind::kDefinitions ? events : 0);
                ObserveSignatures(node);
                node.AddObserver(AsObserver(), tio::kResourceMask, tio::kind::kResource);
            } else if (old) {
                WatchForResource(old);
            } else {
                // Nothing was bound before either (a project reopened while its resource is
                // gone): watch where the resource would appear, so the item binds once it does.
                WatchForResource(ResourceNode());
            }
        }
        SetStatus(status, node);
        resourcePath_ = workingSet_->GetValue(tio::kResource);
        return workingSet_->Root().NotifyChanges(false);
    });
}

void TIOInstanceItemUI::WatchForResource(const ResourceNode& watched) {
    ResourceNode node = watched;
    if (!node) {
        const ResourceNode root = TreeRoot();
        const std::u16string path = ResourcePathValue();
        if (!root || path.empty())
            return;
        uint32_t matched = 0;
        if (root.Find(path, &matched))
            return;
        node = root.Find(path.substr(0, matched));
    }
    if (node)
        node.AddObserver(AsObserver(), tio::kWatchMask, tio::kind::kWatch);
}

void TIOInstanceItemUI::SetStatus(int32_t status, const ResourceNode& resource) {
    resourceStatus_ = status;
    iconResolved_ = false;
    CheckStatus(HostItem()->Refresh(wbproj::kUpdateStatus));
    ApplyHiddenRule(resource);
    CheckStatus(Properties()->SetInt(tio::kStatusProperty, status, 0));
}

void TIOInstanceItemUI::ApplyHiddenRule(const ResourceNode& resource) {
    const auto properties = Properties();
    auto hide = [&] {
        uint32_t flags = 0;
        CheckStatus(HostItem()->GetFlags(&flags));
        if (flags & wbproj::kShownFlag)
            CheckStatus(HostItem()->SetFlags(flags & ~wbproj::kShownFlag));
    };
    if (resource) {
        const auto hidden = resource.Attribute(tio::kHiddenProperty);
        if (hidden && qv::kern::EqualsNoCase(*hidden, u"true")) {
            hide();
            CheckStatus(properties->SetBool(tio::kHiddenProperty, 1, 1));
        }
    }
    int32_t remembered = 0;
    if (CheckStatus(properties->GetBool(tio::kHiddenProperty, &remembered)) == S_OK && remembered)
        hide();
}

void TIOInstanceItemUI::LetGoOfTree(const ResourceNode& root) {
    if (!root)
        return;
    root.RemoveObserver(AsObserver(), tio::kind::kAny, true);
    if (const ResourceNode node = ResourceNodeOf(root))
        node.ReleaseReservation(HostItem());
}

HRESULT TIOInstanceItemUI::Detach() {
    return GuardCall([&] {
        LetGoOfTree(TreeRoot());
        return S_OK;
    });
}

HRESULT TIOInstanceItemUI::IsValid() {
    return resourceStatus_ == tio::status::kBound ? S_OK : S_FALSE;
}
