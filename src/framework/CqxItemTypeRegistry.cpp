// The registry-driven item factory.
#include "framework/CqxItemTypeRegistry.h"

void CqxItemTypeRegistry::Insert(const GUID& type, std::unique_ptr<CqxpItemInfo> info) {
    infos_[type] = std::move(info);
}

void CqxItemTypeRegistry::SetTypeNameResource(const GUID& type, uint32_t id) {
    names_[type] = TypeNameEntry{id, {}, false};
}

void CqxItemTypeRegistry::SetTypeNameLiteral(const GUID& type, std::u16string text) {
    names_[type] = TypeNameEntry{0, std::move(text), true};
}

static HRESULT CreateWith(const CqxpItemInfo* info, const CqxItemRequest& request,
                          IUnknown** item) {
    // A type whose information could not be allocated cannot create anything.
    return info ? info->Create(request, item) : E_OUTOFMEMORY;
}

HRESULT CqxItemTypeRegistry::Create(const CqxItemRequest& request, IUnknown** item) const {
    if (!item) {
        return E_POINTER;
    }
    *item = nullptr;
    if (!IsEqualGUID(request.type, GUID_NULL)) {
        const auto found = infos_.find(request.type);
        return found == infos_.end() ? CLASS_E_CLASSNOTAVAILABLE
                                     : CreateWith(found->second.get(), request, item);
    }
    HRESULT last = CLASS_E_CLASSNOTAVAILABLE;
    for (const auto& [type, info] : infos_) {
        if (info && !info->Accepts(request)) {
            continue;
        }
        last = CreateWith(info.get(), request, item);
        if (SUCCEEDED(last)) {
            return last;
        }
    }
    return last;
}

void CqxItemTypeRegistry::ListTypes(std::vector<GUID>& types) const {
    for (const auto& [type, info] : infos_) {
        const bool hasParent = info && !IsEqualGUID(info->parentType(), GUID_NULL);
        if (!IsEqualGUID(type, GUID_NULL) || !hasParent) {
            types.push_back(type);
        }
    }
}

void CqxItemTypeRegistry::ListParentTypes(std::vector<GUID>& types) const {
    for (const auto& [type, info] : infos_) {
        if (info && !IsEqualGUID(info->parentType(), GUID_NULL)) {
            types.push_back(info->parentType());
        }
    }
}

HRESULT CqxItemTypeRegistry::TypeName(const GUID& type, const StringLoader& load,
                                      BSTR* name) const {
    if (!name) {
        return E_POINTER;
    }
    *name = nullptr;
    const auto found = names_.find(type);
    if (found == names_.end()) {
        return E_FAIL;
    }
    std::u16string text = found->second.literal;
    if (!found->second.isLiteral && (!load || !load(found->second.resourceId, text))) {
        return E_FAIL;
    }
    *name = qv::com::AllocBstr(text);
    return *name ? S_OK : E_OUTOFMEMORY;
}
