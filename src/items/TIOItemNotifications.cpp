// How a Tangent I/O item follows its resource: node notifications, the watches on definitions
// and on methods and properties, and the feature-set version.
#include "attribute_bag/ItemResourceContext.h"
#include "com/CallGuard.h"
#include "host/StatusError.h"
#include "items/TIOInstanceItemUI.h"
#include "items/TIOItemProperties.h"
#include "items/TIOSignatures.h"
#include "kern/Collate.h"

using qv::host::CheckStatus;
using qv::host::ResourceNode;
namespace event = wbhw::node_event;

HRESULT TIOInstanceItemUI::OnNodeEvent(IUnknown* object, uint32_t events, uint32_t kind) {
    if (workingSet_ == nullptr)
        return S_OK;
    return qv::com::GuardCall([&]() -> HRESULT {
        const ResourceNode node = ResourceNode::From(object);
        if (!node)
            return E_NOINTERFACE;
        switch (kind) {
        case tio::kind::kResource:
            OnResourceEvent(node, events);
            return S_OK;
        case tio::kind::kWatch:
            return OnWatchEvent(node, events);
        case tio::kind::kDefinitions:
            return BindToResource(nullptr, kind, events);
        case tio::kind::kSignatures:
            OnSignatureEvent(node, events);
            return S_OK;
        default:
            return S_OK;
        }
    });
}

void TIOInstanceItemUI::OnResourceEvent(const ResourceNode& node, uint32_t events) {
    if (events & event::kAboutToBeRemoved) {
        StopDefinitions(node);
        return;
    }
    if (events & event::kDetached) {
        // The node goes with its subtree: watch where it was, so a new one binds the item.
        const ResourceNode parent = node.Parent();
        WatchForResource(parent);
        SetStatus(tio::status::kMissing, ResourceNode());
        return;
    }
    if (events & (event::kDisplayName | event::kFromAncestor)) {
        const std::u16string path = node.Path();
        workingSet_->SetValue(tio::kResource, path);
        resourcePath_ = path;
        CheckStatus(workingSet_->Root().NotifyChanges(false));
        CheckStatus(HostItem()->Refresh(wbproj::kUpdateRenamed));
    }
    if (events & event::kFromReservation) {
        HRESULT held = node.QueryReservation(HostItem());
        if (held == S_FALSE)
            held = node.Reserve(HostItem(), tio::kReserveMode);
        SetStatus(held == S_FALSE ? tio::status::kConflict : tio::status::kBound, node);
    }
}

HRESULT TIOInstanceItemUI::OnWatchEvent(const ResourceNode& node, uint32_t events) {
    ResourceNode watch;
    bool rebind = false;
    if (events & event::kDetached) {
        watch = node.Parent();
    } else {
        const ResourceNode root = TreeRoot();
        const std::u16string path = ResourcePathValue();
        uint32_t matched = 0;
        if (root && !path.empty() && root.Find(path, &matched))
            rebind = true;
        else if (root)
            watch = root.Find(path.substr(0, matched));
    }
    node.RemoveObserver(AsObserver(), tio::kind::kWatch);
    if (rebind)
        return BindToResource(nullptr, tio::kind::kWatch, events);
    WatchForResource(watch);
    SetStatus(tio::status::kMissing, ResourceNode());
    return S_OK;
}

void TIOInstanceItemUI::OnSignatureEvent(const ResourceNode& node, uint32_t events) {
    const ResourceNode resource = ResourceNodeOf(TreeRoot());
    if (!resource)
        return;
    if (events & tio::kMemberSetMask) {
        StopSignatures(resource);
        ObserveSignatures(resource);
        IncrementFeatureSetVersion();
        return;
    }
    if ((events & event::kValueChanged) == 0)
        return;
    const auto signature = node.Attribute(tio::kSignature);
    if (!signature)
        return;
    const auto last = node.Attribute(tio::kLastSignature);
    if (last && qv::kern::EqualsNoCase(*last, *signature))
        return;
    // Written silenced, so recording what was seen does not count as a change again.
    node.Silenced([&] { node.SetAttribute(tio::kLastSignature, *signature); });
    IncrementFeatureSetVersion();
}

void TIOInstanceItemUI::IncrementFeatureSetVersion() {
    const auto properties = Properties();
    int32_t version = 0;
    if (CheckStatus(properties->GetInt(tio::kFeatureSetVersionProperty, &version)) != S_OK)
        version = 0;
    CheckStatus(properties->SetInt(tio::kFeatureSetVersionProperty, version + 1, 0));
}

void TIOInstanceItemUI::ObserveSignatures(const ResourceNode& resource) {
    const tio::ResourceMembers members = tio::CollectMembers(resource);
    for (const ResourceNode& set : {members.methodSet, members.propertySet})
        if (set)
            set.AddObserver(AsObserver(), tio::kMemberSetMask, tio::kind::kSignatures);
    for (const ResourceNode& member : members.members) {
        member.AddObserver(AsObserver(), tio::kMemberMask, tio::kind::kSignatures);
        if (const auto signature = member.Attribute(tio::kSignature))
            member.SetAttribute(tio::kLastSignature, *signature);
    }
}

void TIOInstanceItemUI::StopSignatures(const ResourceNode& resource) {
    const tio::ResourceMembers members = tio::CollectMembers(resource);
    for (const ResourceNode& set : {members.methodSet, members.propertySet})
        if (set)
            set.RemoveObserver(AsObserver(), tio::kind::kSignatures);
    for (const ResourceNode& member : members.members)
        member.RemoveObserver(AsObserver(), tio::kind::kSignatures);
}

namespace {

// Calls VISIT for every node below NODE, leaving out nodes named "Node" with their subtrees.
template <class Visit> void ForDefinitionNodes(const ResourceNode& node, Visit&& visit) {
    for (const ResourceNode& child : node.Children()) {
        if (qv::kern::EqualsNoCase(child.Name(), u"Node"))
            continue;
        visit(child);
        ForDefinitionNodes(child, visit);
    }
}

} // namespace

void TIOInstanceItemUI::ObserveDefinitions(const ResourceNode& resource, uint32_t events) {
    const ResourceNode definitions =
        (events & 0x1) == 0 ? resource.Find(u"AttributeSet") : ResourceNode();
    if (!definitions) {
        resource.AddObserver(AsObserver(), tio::kNoDefinitionsMask, tio::kind::kDefinitions);
        return;
    }
    definitions.AddObserver(AsObserver(), tio::kDefinitionSetMask, tio::kind::kDefinitions);
    ForDefinitionNodes(definitions, [&](const ResourceNode& node) {
        node.AddObserver(AsObserver(), tio::kDefinitionMask, tio::kind::kDefinitions);
    });
}

void TIOInstanceItemUI::StopDefinitions(const ResourceNode& resource) {
    // The resource itself is let go too: a watch made while definitions were being dropped sits
    // there even when the node has an "AttributeSet" now.
    resource.RemoveObserver(AsObserver(), tio::kind::kDefinitions);
    const ResourceNode definitions = resource.Find(u"AttributeSet");
    if (!definitions)
        return;
    definitions.RemoveObserver(AsObserver(), tio::kind::kDefinitions);
    ForDefinitionNodes(definitions, [&](const ResourceNode& node) {
        node.RemoveObserver(AsObserver(), tio::kind::kDefinitions);
    });
}
