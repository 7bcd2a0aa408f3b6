// The COM object of a host resource-tree node.
#include "resources/HostResourceNode.h"

#include "com/TaskMem.h"
#include "kern/Collate.h"
#include "resource_tree/ListText.h"
#include "resource_tree/ResTreeWriter.h"

#include <new>
#include <optional>

namespace wbhost::resources {
namespace {

using wbhw::ResTreeNode;

std::u16string_view View(const char16_t* text) {
    return text != nullptr ? std::u16string_view(text) : std::u16string_view();
}

// A new BSTR of TEXT in *OUT; E_OUTOFMEMORY when it cannot be had.
HRESULT PutText(std::u16string_view text, BSTR* out) {
    *out = qv::com::AllocBstr(text);
    return *out != nullptr ? S_OK : E_OUTOFMEMORY;
}

// What an attribute reads: a localized text is its chosen text, which ends at the NUL that
// separates it from the language list kept beside it.
std::u16string_view AttributeText(const wbhw::ResTreeEntry& entry) {
    const std::u16string_view text = *entry.Text();
    if (entry.Kind() == wbhw::EntryKind::LocalizedText)
        return text.substr(0, text.find(u'\0'));
    return text;
}

// Hands out ITEMS as a CoTaskMemAlloc array, each with a reference of its own.
template <class I> HRESULT PutArray(const std::vector<I*>& items, uint32_t* count, I*** out) {
    const HRESULT hr = qv::com::CopyToTaskMem(items, out, count);
    if (SUCCEEDED(hr)) {
        for (I* item : items)
            item->AddRef();
    }
    return hr;
}

// The property that NAME (the rest of a path after the part that named nodes) stands for; none
// when it is no single piece of a path.
std::optional<std::u16string> PropertyName(std::u16string_view name) {
    if (!name.empty() && name.front() == u'/')
        name.remove_prefix(1);
    std::vector<std::u16string> pieces = wbhw::SplitListText(name, u'/', false);
    if (pieces.size() != 1 || pieces.front().empty() || pieces.front() == u"." ||
        pieces.front() == u"..")
        return std::nullopt;
    return std::move(pieces.front());
}

} // namespace

HostResourceNode::HostResourceNode(std::shared_ptr<ResourceTree> tree,
                                   std::shared_ptr<NodeState> state)
    : tree_(std::move(tree)), state_(std::move(state)) {}

HostResourceNode::~HostResourceNode() {
    tree_->ForgetObject(*state_, this);
}

template <class Body> HRESULT HostResourceNode::WithNode(Body&& body) {
    try {
        const std::lock_guard guard(tree_->Mutex());
        if (state_->node == nullptr)
            return E_FAIL;
        return body(*state_->node);
    } catch (const std::bad_alloc&) {
        return E_OUTOFMEMORY;
    } catch (...) {
        return E_FAIL;
    }
}

std::vector<std::u16string> SupportedProtocols(ResTreeNode& node) {
    const wbhw::WString* list = node.TextAt(u"Protocols");
    if (list == nullptr)
        return {};
    std::vector<std::u16string> protocols;
    for (std::u16string& piece : wbhw::SplitListText(*list, u',', true)) {
        if (!piece.empty())
            protocols.push_back(std::move(piece));
    }
    return protocols;
}

HRESULT HostResourceNode::GetName(BSTR* name) {
    if (name == nullptr)
        return E_POINTER;
    *name = nullptr;
    return WithNode([&](ResTreeNode& node) { return PutText(node.Name(), name); });
}

HRESULT HostResourceNode::GetPath(BSTR* path) {
    if (path == nullptr)
        return E_POINTER;
    *path = nullptr;
    return WithNode([&](ResTreeNode& node) { return PutText(node.Path(), path); });
}

HRESULT HostResourceNode::GetElementType(BSTR* type) {
    if (type == nullptr)
        return E_POINTER;
    *type = nullptr;
    return WithNode([&](ResTreeNode& node) { return PutText(node.Type(), type); });
}

HRESULT HostResourceNode::GetAttribute(const char16_t* name, BSTR* value) {
    if (value == nullptr)
        return E_POINTER;
    *value = nullptr;
    return WithNode([&](ResTreeNode& node) {
        const auto found = node.FindLoading(View(name));
        if (found == node.End() || !wbhw::IsTextKind(found->Kind()))
            return S_FALSE;
        return PutText(AttributeText(*found), value);
    });
}

HRESULT HostResourceNode::GetAttributeAt(uint32_t index, BSTR* name, BSTR* value) {
    if (name == nullptr || value == nullptr)
        return E_POINTER;
    *name = *value = nullptr;
    return WithNode([&](ResTreeNode& node) {
        uint32_t seen = 0;
        for (auto entry = node.Begin(); entry != node.End(); ++entry) {
            if (!wbhw::IsTextKind(entry->Kind()) || seen++ != index)
                continue;
            const HRESULT hr = PutText(entry->Name(), name);
            if (FAILED(hr))
                return hr;
            return PutText(AttributeText(*entry), value);
        }
        return S_FALSE;
    });
}

HRESULT HostResourceNode::SetAttribute(const char16_t* name, const char16_t* value) {
    if (name == nullptr)
        return E_POINTER;
    return WithNode(
        [&](ResTreeNode& node) { return tree_->SetAttribute(node, View(name), View(value)); });
}

HRESULT HostResourceNode::GetParent(IwbhwResourceTreeNode** parent) {
    if (parent == nullptr)
        return E_POINTER;
    *parent = nullptr;
    return WithNode([&](ResTreeNode& node) {
        return node.Parent() == nullptr ? S_FALSE : tree_->NodeObject(node.Parent(), parent);
    });
}

HRESULT HostResourceNode::Children(const char16_t* type, uint32_t* count,
                                   IwbhwResourceTreeNode*** children) {
    if (count == nullptr || children == nullptr)
        return E_POINTER;
    *count = 0;
    *children = nullptr;
    return WithNode([&](ResTreeNode& node) {
        std::vector<qv::com::ComPtr<IwbhwResourceTreeNode>> held;
        for (auto entry = node.Begin(); entry != node.End(); ++entry) {
            ResTreeNode* child = entry->Child();
            if (child == nullptr ||
                (type != nullptr && !qv::kern::EqualsNoCase(child->Type(), type)))
                continue;
            held.emplace_back();
            const HRESULT hr = tree_->NodeObject(child, held.back().Put());
            if (FAILED(hr))
                return hr;
        }
        std::vector<IwbhwResourceTreeNode*> raw;
        for (const auto& p : held)
            raw.push_back(p.Get());
        return PutArray(raw, count, children);
    });
}

HRESULT HostResourceNode::GetChildren(uint32_t* count, IwbhwResourceTreeNode*** children) {
    return Children(nullptr, count, children);
}

HRESULT HostResourceNode::GetChildrenOfType(const char16_t* type, uint32_t* count,
                                            IwbhwResourceTreeNode*** children) {
    if (type == nullptr)
        return E_POINTER;
    return Children(type, count, children);
}

HRESULT HostResourceNode::FindNode(const char16_t* path, uint32_t* matched,
                                   IwbhwResourceTreeNode** node) {
    if (node == nullptr)
        return E_POINTER;
    *node = nullptr;
    return WithNode([&](ResTreeNode& from) {
        ResTreeNode* found = tree_->Find(View(path), &from, matched);
        return found == nullptr ? S_FALSE : tree_->NodeObject(found, node);
    });
}

HRESULT HostResourceNode::FindNode(const char16_t* path, uint32_t* matched, uint32_t /*reserved*/,
                                   IwbhwResourceTreeAccess** node) {
    if (node == nullptr)
        return E_POINTER;
    *node = nullptr;
    return WithNode([&](ResTreeNode& from) {
        const NodeLookup found = tree_->Lookup(View(path), &from);
        if (matched != nullptr)
            *matched = found.matched;
        // Where the path leaves the tree is handed out only to a caller that asked how far it
        // went; one that did not would take the node for the one the path names.
        ResTreeNode* answer =
            found.node != nullptr || matched == nullptr ? found.node : found.deepest;
        if (answer != nullptr) {
            qv::com::ComPtr<IwbhwResourceTreeNode> object;
            const HRESULT hr = tree_->NodeObject(answer, object.Put());
            if (FAILED(hr))
                return hr;
            // Every node object offers both interfaces; this one is the same object's other face.
            *node = static_cast<HostResourceNode*>(object.Get());
            (*node)->AddRef();
        }
        return found.node != nullptr ? S_OK : S_FALSE;
    });
}

HRESULT HostResourceNode::AddObserver(IwbhwResourceTreeNodeObserver* observer, uint32_t mask,
                                      uint32_t kind) {
    return WithNode(
        [&](ResTreeNode& node) { return tree_->AddObserver(node, observer, mask, kind); });
}

HRESULT HostResourceNode::RemoveObserver(IwbhwResourceTreeNodeObserver* observer, uint32_t kind,
                                         int32_t wholeSubtree) {
    return WithNode([&](ResTreeNode& node) {
        return tree_->RemoveObserver(node, observer, kind, wholeSubtree != 0);
    });
}

HRESULT HostResourceNode::SaveNotificationState(uint32_t* state) {
    if (state == nullptr)
        return E_POINTER;
    return WithNode([&](ResTreeNode& node) {
        *state = tree_->SaveNotificationState(node);
        return S_OK;
    });
}

HRESULT HostResourceNode::RestoreNotificationState(uint32_t state) {
    return WithNode([&](ResTreeNode& node) {
        tree_->RestoreNotificationState(node, state);
        return S_OK;
    });
}

HRESULT HostResourceNode::GetValue(BSTR* value) {
    if (value == nullptr)
        return E_POINTER;
    *value = nullptr;
    return WithNode([&](ResTreeNode& node) {
        const auto found = node.FindLoading(u"Value");
        const bool text = found != node.End() && wbhw::IsTextKind(found->Kind());
        return PutText(text ? AttributeText(*found) : std::u16string_view(), value);
    });
}

HRESULT HostResourceNode::Reserve(IwbProjectItem* item, uint32_t mode) {
    return WithNode([&](ResTreeNode& node) { return tree_->Reserve(node, item, mode); });
}

HRESULT HostResourceNode::QueryReservation(IwbProjectItem* item) {
    return WithNode([&](ResTreeNode& node) { return tree_->QueryReservation(node, item); });
}

HRESULT HostResourceNode::ReleaseReservation(IwbProjectItem* item) {
    return WithNode([&](ResTreeNode& node) { return tree_->ReleaseReservation(node, item); });
}

HRESULT HostResourceNode::GetReservingItems(IwbProjectItem* except, uint32_t* count,
                                            IwbProjectItem*** items) {
    if (count == nullptr || items == nullptr)
        return E_POINTER;
    *count = 0;
    *items = nullptr;
    return WithNode([&](ResTreeNode& node) {
        return PutArray(tree_->ReservingItems(node, except), count, items);
    });
}

HRESULT HostResourceNode::Dump(BSTR* text) {
    if (text == nullptr)
        return E_POINTER;
    *text = nullptr;
    return WithNode([&](ResTreeNode& node) { return PutText(wbhw::WriteResTree(node).xml, text); });
}

HRESULT HostResourceNode::GetSupportedProtocols(uint32_t* count, BSTR** protocols) {
    if (count == nullptr || protocols == nullptr)
        return E_POINTER;
    *count = 0;
    *protocols = nullptr;
    return WithNode([&](ResTreeNode& node) {
        std::vector<qv::com::UniqueBstr> texts;
        for (const std::u16string& protocol : SupportedProtocols(node)) {
            texts.emplace_back(qv::com::AllocBstr(protocol));
            if (!texts.back())
                return E_OUTOFMEMORY;
        }
        std::vector<BSTR> raw;
        for (const auto& t : texts)
            raw.push_back(t.get());
        const HRESULT hr = qv::com::CopyToTaskMem(raw, protocols, count);
        if (SUCCEEDED(hr)) {
            for (auto& t : texts)
                (void)t.release(); // now owned by the caller's array
        }
        return hr;
    });
}

HRESULT HostResourceNode::SetProperty(const char16_t* name, const char16_t* value) {
    const std::optional<std::u16string> property = PropertyName(View(name));
    if (!property)
        return S_FALSE;
    return SetAttribute(property->c_str(), value);
}

HRESULT HostResourceNode::InsertSubTree(const char16_t* xml) {
    return WithNode([&](ResTreeNode& node) { return tree_->InsertSubTree(node, View(xml)); });
}

HRESULT HostResourceNode::RemoveSubTree(const char16_t* name) {
    if (name == nullptr)
        return E_POINTER;
    return WithNode([&](ResTreeNode& node) { return tree_->RemoveChild(node, View(name)); });
}

HRESULT HostResourceNode::IsReserved(const char16_t* protocol, int32_t /*flag*/,
                                     uint32_t* reserved) {
    if (reserved == nullptr)
        return E_POINTER;
    *reserved = 0;
    return WithNode([&](ResTreeNode& node) {
        if (protocol != nullptr && *protocol != u'\0') {
            bool supported = false;
            for (const auto& p : SupportedProtocols(node))
                supported = supported || qv::kern::EqualsNoCase(p, protocol);
            if (!supported)
                return S_OK;
        }
        *reserved = tree_->ReservingItems(node, nullptr).empty() ? 0 : 1;
        return S_OK;
    });
}

} // namespace wbhost::resources
