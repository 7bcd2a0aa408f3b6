// The resource-node handle.
#include "host/ResourceNode.h"

#include "com/TaskMem.h"
#include "host/StatusError.h"

namespace qv::host {

using qv::com::BstrToString;
using qv::com::ComPtr;
using qv::com::UniqueBstr;

namespace {

// The text a host call hands out in *TEXT, freed here; the call's failure is thrown.
template <class Call> std::u16string TextOf(Call&& call) {
    BSTR text = nullptr;
    const HRESULT hr = call(&text);
    const UniqueBstr held(text);
    CheckStatus(hr);
    return BstrToString(text);
}

// Takes over a CoTaskMemAlloc array of COUNT references, each held by what ADOPT makes of it.
template <class Interface, class Adopt>
auto TakeReferences(Interface** references, uint32_t count, Adopt adopt) {
    std::vector<decltype(adopt(references[0]))> list;
    try {
        list.reserve(count);
    } catch (...) {
        for (uint32_t i = 0; i < count; ++i)
            references[i]->Release();
        CoTaskMemFree(references);
        throw;
    }
    for (uint32_t i = 0; i < count; ++i)
        list.push_back(adopt(references[i]));
    CoTaskMemFree(references);
    return list;
}

std::vector<ResourceNode> TakeNodes(IwbhwResourceTreeNode** nodes, uint32_t count) {
    return TakeReferences(nodes, count, &ResourceNode::Adopt);
}

} // namespace

ResourceNode::ResourceNode(IwbhwResourceTreeNode* node)
    : node_(ComPtr<IwbhwResourceTreeNode>::Share(node)) {}

ResourceNode ResourceNode::Adopt(IwbhwResourceTreeNode* node) {
    ResourceNode handle;
    handle.node_ = ComPtr<IwbhwResourceTreeNode>::Adopt(node);
    return handle;
}

ResourceNode ResourceNode::From(IUnknown* object) {
    return Adopt(qv::com::QueryAs<IwbhwResourceTreeNode>(object).Detach());
}

bool ResourceNode::SameAs(const ResourceNode& other) const {
    const auto mine = node_.As<IUnknown>();
    const auto theirs = other.node_.As<IUnknown>();
    return mine.Get() == theirs.Get();
}

std::u16string ResourceNode::Name() const {
    return TextOf([&](BSTR* text) { return node_->GetName(text); });
}

std::u16string ResourceNode::Path() const {
    return TextOf([&](BSTR* text) { return node_->GetPath(text); });
}

std::u16string ResourceNode::ElementType() const {
    return TextOf([&](BSTR* text) { return node_->GetElementType(text); });
}

std::u16string ResourceNode::Value() const {
    return TextOf([&](BSTR* text) { return node_->GetValue(text); });
}

std::optional<std::u16string> ResourceNode::Attribute(std::u16string_view name) const {
    const std::u16string key(name);
    BSTR text = nullptr;
    const HRESULT hr = node_->GetAttribute(key.c_str(), &text);
    const UniqueBstr held(text);
    if (CheckStatus(hr) != S_OK)
        return std::nullopt;
    return BstrToString(text);
}

std::vector<std::pair<std::u16string, std::u16string>> ResourceNode::Attributes() const {
    std::vector<std::pair<std::u16string, std::u16string>> list;
    for (uint32_t i = 0;; ++i) {
        BSTR name = nullptr;
        BSTR value = nullptr;
        const HRESULT hr = node_->GetAttributeAt(i, &name, &value);
        const UniqueBstr heldName(name);
        const UniqueBstr heldValue(value);
        if (CheckStatus(hr) != S_OK)
            return list;
        list.emplace_back(BstrToString(name), BstrToString(value));
    }
}

void ResourceNode::SetAttribute(std::u16string_view name, std::u16string_view value) const {
    const std::u16string key(name);
    const std::u16string text(value);
    CheckStatus(node_->SetAttribute(key.c_str(), text.c_str()));
}

ResourceNode ResourceNode::Parent() const {
    IwbhwResourceTreeNode* parent = nullptr;
    const HRESULT hr = node_->GetParent(&parent);
    ResourceNode held = Adopt(parent);
    CheckStatus(hr);
    return held;
}

std::vector<ResourceNode> ResourceNode::Children() const {
    uint32_t count = 0;
    IwbhwResourceTreeNode** nodes = nullptr;
    CheckStatus(node_->GetChildren(&count, &nodes));
    return nodes != nullptr ? TakeNodes(nodes, count) : std::vector<ResourceNode>{};
}

std::vector<ResourceNode> ResourceNode::ChildrenOfType(std::u16string_view type) const {
    const std::u16string key(type);
    uint32_t count = 0;
    IwbhwResourceTreeNode** nodes = nullptr;
    CheckStatus(node_->GetChildrenOfType(key.c_str(), &count, &nodes));
    return nodes != nullptr ? TakeNodes(nodes, count) : std::vector<ResourceNode>{};
}

ResourceNode ResourceNode::Find(std::u16string_view path, uint32_t* matched) const {
    const std::u16string key(path);
    IwbhwResourceTreeNode* found = nullptr;
    const HRESULT hr = node_->FindNode(key.c_str(), matched, &found);
    ResourceNode held = Adopt(found);
    return CheckStatus(hr) == S_OK ? held : ResourceNode();
}

void ResourceNode::AddObserver(IwbhwResourceTreeNodeObserver* observer, uint32_t mask,
                               uint32_t kind) const {
    CheckStatus(node_->AddObserver(observer, mask, kind));
}

void ResourceNode::RemoveObserver(IwbhwResourceTreeNodeObserver* observer, uint32_t kind,
                                  bool wholeSubtree) const {
    CheckStatus(node_->RemoveObserver(observer, kind, wholeSubtree ? 1 : 0));
}

HRESULT ResourceNode::Reserve(IwbProjectItem* item, uint32_t mode) const {
    return CheckStatus(node_->Reserve(item, mode));
}

HRESULT ResourceNode::QueryReservation(IwbProjectItem* item) const {
    return CheckStatus(node_->QueryReservation(item));
}

HRESULT ResourceNode::ReleaseReservation(IwbProjectItem* item) const {
    return CheckStatus(node_->ReleaseReservation(item));
}

uint32_t ResourceNode::SaveNotificationState() const {
    uint32_t state = 0;
    CheckStatus(node_->SaveNotificationState(&state));
    return state;
}

void ResourceNode::RestoreNotificationState(uint32_t state) const noexcept {
    node_->RestoreNotificationState(state);
}

std::vector<ComPtr<IwbProjectItem>> ResourceNode::ReservingItems(IwbProjectItem* except) const {
    uint32_t count = 0;
    IwbProjectItem** items = nullptr;
    CheckStatus(node_->GetReservingItems(except, &count, &items));
    if (items == nullptr)
        return {};
    return TakeReferences(items, count, &ComPtr<IwbProjectItem>::Adopt);
}

} // namespace qv::host
