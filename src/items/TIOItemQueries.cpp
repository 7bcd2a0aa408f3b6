// What a Tangent I/O item answers about itself: icon, resource, attributes, decorated name,
// physical flag, error and scope; and the edits of its resource and attributes.
#include "attribute_bag/ItemResourceContext.h"
#include "com/CallGuard.h"
#include "com/PutBstr.h"
#include "com/TaskMem.h"
#include "host/ProjectItemQueries.h"
#include "host/StatusError.h"
#include "items/TIOInstanceItemUI.h"
#include "items/TIOItemProperties.h"
#include "kern/Collate.h"
#include "resource_tree/ListText.h"

#include <vector>

using qv::com::AllocBstr;
using qv::com::ComPtr;
using qv::com::GuardCall;
using qv::com::PutBstr;
using qv::host::CheckStatus;
using qv::host::ResourceNode;

namespace {

// Hands TEXTS out as a CoTaskMemAlloc array of new BSTRs; nothing is handed out on failure.
HRESULT PutTexts(const std::vector<std::u16string>& texts, uint32_t* count, BSTR** out) {
    *count = 0;
    *out = nullptr;
    if (texts.empty())
        return S_OK;
    auto* array = static_cast<BSTR*>(CoTaskMemAlloc(texts.size() * sizeof(BSTR)));
    if (array == nullptr)
        return E_OUTOFMEMORY;
    for (size_t i = 0; i < texts.size(); ++i) {
        array[i] = AllocBstr(texts[i]);
        if (array[i] == nullptr) {
            for (size_t j = 0; j < i; ++j)
                SysFreeString(array[j]);
            CoTaskMemFree(array);
            return E_OUTOFMEMORY;
        }
    }
    *out = array;
    *count = static_cast<uint32_t>(texts.size());
    return S_OK;
}

// Whether OPTIONS ("key=value,..."; keys and values in any case) asks for KEY=true.
bool OptionIsTrue(std::u16string_view options, std::u16string_view key) {
    for (const std::u16string& pair : wbhw::SplitListText(options, u',', true)) {
        const size_t equals = pair.find(u'=');
        if (equals == std::u16string::npos)
            continue;
        const std::u16string_view name =
            wbhw::TrimBlanks(std::u16string_view(pair).substr(0, equals));
        const std::u16string_view value =
            wbhw::TrimBlanks(std::u16string_view(pair).substr(equals + 1));
        if (qv::kern::EqualsNoCase(name, key))
            return qv::kern::EqualsNoCase(value, u"true");
    }
    return false;
}

} // namespace

HRESULT TIOInstanceItemUI::GetIconName(BSTR* name) {
    if (name == nullptr)
        return E_POINTER;
    if (!iconResolved_) {
        const HRESULT hr = GuardCall([&] {
            std::u16string icon(tio::kDefaultIcon);
            const ResourceNode root = TreeRoot();
            const ResourceNode resource = ResourceNodeOf(root);
            if (auto named = resource ? resource.Attribute(u"TIOItemIconName") : std::nullopt)
                icon = *named;
            else if (auto rootNamed = root ? root.Attribute(u"TIOItemIconName") : std::nullopt)
                icon = *rootNamed;
            SetIconName(std::move(icon));
            iconResolved_ = true;
            return S_OK;
        });
        if (FAILED(hr))
            return hr;
    }
    return BaseHWItemUI::GetIconName(name);
}

HRESULT TIOInstanceItemUI::GetResource(BSTR* path, int32_t* exists, int32_t* reserved) {
    if (path == nullptr)
        return E_POINTER;
    *path = nullptr;
    if (exists != nullptr)
        *exists = 0;
    if (reserved != nullptr)
        *reserved = 0;
    return GuardCall([&]() -> HRESULT {
        const std::u16string resource = ResourcePathValue();
        if (const HRESULT hr = PutBstr(resource, path); FAILED(hr))
            return hr;
        if (resource.empty())
            return S_FALSE;
        if (exists == nullptr && reserved == nullptr)
            return S_OK;
        const ResourceNode node = ResourceNodeOf(TreeRoot());
        if (exists != nullptr)
            *exists = node ? 1 : 0;
        if (reserved != nullptr && node)
            *reserved = node.QueryReservation(HostItem()) == S_OK ? 1 : 0;
        return S_OK;
    });
}

HRESULT TIOInstanceItemUI::GetResourcePath(BSTR* path) {
    return GetResource(path, nullptr, nullptr);
}

HRESULT TIOInstanceItemUI::Rebind() {
    return BindToResource(nullptr, 0, 0);
}

HRESULT TIOInstanceItemUI::SetResource(const char16_t* path) {
    if (path == nullptr)
        return E_POINTER;
    if (workingSet_ == nullptr)
        return E_UNEXPECTED;
    const HRESULT hr = GuardCall([&] {
        workingSet_->SetValue(tio::kResource, path);
        return S_OK;
    });
    return FAILED(hr) ? hr : BindToResource(nullptr, 0, 0);
}

HRESULT TIOInstanceItemUI::SetAttributes(uint32_t count, const char16_t* const* texts) {
    if (count != 0 && texts == nullptr)
        return E_POINTER;
    if (workingSet_ == nullptr)
        return E_UNEXPECTED;
    const HRESULT imported = GuardCall([&] {
        std::vector<std::u16string> list;
        for (uint32_t i = 0; i < count; ++i)
            list.emplace_back(texts[i] != nullptr ? texts[i] : u"");
        return workingSet_->ImportClusterStrings(list);
    });
    // The texts before a bad one are applied already: the item binds to what it now holds in
    // any case, and a bad text is still reported once the binding went well.
    const HRESULT bound = BindToResource(nullptr, 0, 0);
    return FAILED(bound) ? bound : imported;
}

HRESULT TIOInstanceItemUI::GetDecoratedName(BSTR* name, int32_t* fromResource) {
    if (name == nullptr)
        return E_POINTER;
    *name = nullptr;
    if (fromResource != nullptr)
        *fromResource = 1;
    return GuardCall([&]() -> HRESULT {
        std::u16string decorated = ResourcePathValue();
        if (const ResourceNode node = ResourceNodeOf(TreeRoot())) {
            if (auto decoration = node.Attribute(u"NameDecoration")) {
                decorated = std::move(*decoration);
                if (fromResource != nullptr)
                    *fromResource = 0;
            } else {
                decorated = wbhw::UnescapeListText(node.Name(), u'/');
            }
        }
        return decorated.empty() ? S_OK : PutBstr(decorated, name);
    });
}

HRESULT TIOInstanceItemUI::GetAttribute(const char16_t* path, BSTR* value) {
    if (path == nullptr || value == nullptr)
        return E_POINTER;
    *value = nullptr;
    if (workingSet_ == nullptr)
        return S_FALSE;
    return GuardCall([&]() -> HRESULT {
        const std::u16string_view text(path);
        const size_t slash = text.rfind(u'/');
        TIOAttrBag* set = slash == std::u16string_view::npos
                              ? workingSet_
                              : workingSet_->ResolvePath(text.substr(0, slash + 1));
        const std::u16string_view attribute =
            slash == std::u16string_view::npos ? text : text.substr(slash + 1);
        const std::u16string* found = set != nullptr ? set->FindValue(attribute) : nullptr;
        return found != nullptr ? PutBstr(*found, value) : S_FALSE;
    });
}

HRESULT TIOInstanceItemUI::GetAttributeNames(const char16_t* options, uint32_t* count,
                                             BSTR** names) {
    if (count == nullptr || names == nullptr)
        return E_POINTER;
    *count = 0;
    *names = nullptr;
    if (workingSet_ == nullptr)
        return S_OK;
    return GuardCall([&] {
        const bool withPath = options != nullptr && OptionIsTrue(options, u"includePath");
        const std::u16string prefix = withPath ? workingSet_->GetPath() : std::u16string();
        std::vector<std::u16string> list;
        for (const auto& [name, value] : workingSet_->Attributes())
            list.push_back(prefix + name);
        return PutTexts(list, count, names);
    });
}

HRESULT TIOInstanceItemUI::SetPhysical(int32_t physical) {
    return GuardCall(
        [&] { return Properties()->SetBool(tio::kPhysicalProperty, physical != 0 ? 1 : 0, 1); });
}

HRESULT TIOInstanceItemUI::IsPhysical() {
    const HRESULT hr = GuardCall([&] {
        int32_t physical = 0;
        const HRESULT read = Properties()->GetBool(tio::kPhysicalProperty, &physical);
        return FAILED(read) ? read : (read == S_OK && physical != 0 ? S_OK : S_FALSE);
    });
    return FAILED(hr) ? E_FAIL : hr;
}

HRESULT TIOInstanceItemUI::ResourceOK() {
    return resourceStatus_ == tio::status::kBound ? S_OK : S_FALSE;
}

HRESULT TIOInstanceItemUI::GetResourceStatus(int32_t* status) {
    if (status == nullptr)
        return E_POINTER;
    *status = resourceStatus_;
    return S_OK;
}

HRESULT TIOInstanceItemUI::HasError() {
    return resourceStatus_ != tio::status::kBound ? S_OK : S_FALSE;
}

HRESULT TIOInstanceItemUI::GetScope(uint32_t* count, GUID** types, BSTR** names) {
    if (count == nullptr || types == nullptr || names == nullptr)
        return E_POINTER;
    *count = 0;
    *types = nullptr;
    *names = nullptr;
    if (HostItem() == nullptr)
        return E_UNEXPECTED;
    return GuardCall([&]() -> HRESULT {
        ItemResourceContext context;
        CheckStatus(context.Fill(HostItem(), true));
        // From the item's parent up to its target (or the project root when it has none); the
        // item itself closes the chains built from the list.
        std::vector<GUID> chainTypes;
        std::vector<std::u16string> chainNames;
        ComPtr<IwbProjectItem> start;
        CheckStatus(HostItem()->GetParent(start.Put()));
        for (ComPtr<IwbProjectItem> at = start; at;) {
            chainTypes.insert(chainTypes.begin(), qv::host::ItemType(*at.Get()));
            chainNames.insert(chainNames.begin(), qv::host::ItemName(*at.Get()));
            if (at.Get() == context.Owner())
                break;
            ComPtr<IwbProjectItem> parent;
            CheckStatus(at->GetParent(parent.Put()));
            at = std::move(parent);
        }
        uint32_t typeCount = 0;
        if (const HRESULT hr = qv::com::CopyToTaskMem(chainTypes, types, &typeCount); FAILED(hr))
            return hr;
        if (const HRESULT hr = PutTexts(chainNames, count, names); FAILED(hr)) {
            CoTaskMemFree(*types);
            *types = nullptr;
            return hr;
        }
        return S_OK;
    });
}
