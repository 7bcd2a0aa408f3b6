// The registry behind a provider's item factory: item types with their information objects, and
// the display names of types.
#pragma once

#include "framework/CqxpItemInfo.h"

#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <string>
#include <vector>

class CqxItemTypeRegistry {
public:
    // Loads string resource ID into TEXT; false when there is no such string.
    using StringLoader = std::function<bool(uint32_t id, std::u16string& text)>;

    // Registers TYPE with INFO (null records a type whose information could not be allocated).
    // A second registration of TYPE replaces the first.
    void Insert(const GUID& type, std::unique_ptr<CqxpItemInfo> info);
    // Names TYPE by string resource ID (replacing any literal name).
    void SetTypeNameResource(const GUID& type, uint32_t id);
    // Names TYPE by a literal TEXT (replacing any resource name).
    void SetTypeNameLiteral(const GUID& type, std::u16string text);

    // Offers REQUEST to the registry. A request for GUID_NULL asks every information object in
    // key order; the first that accepts and creates successfully wins. Otherwise the named
    // type's object creates. When none succeeds, the last attempt's status is answered, or
    // CLASS_E_CLASSNOTAVAILABLE when nothing was attempted.
    HRESULT Create(const CqxItemRequest& request, IUnknown** item) const;
    // Appends every registered type in key order (GUID_NULL only when its information names no
    // parent type).
    void ListTypes(std::vector<GUID>& types) const;
    // Appends the parent type of every information object that names one, in key order.
    void ListParentTypes(std::vector<GUID>& types) const;
    // The display name of TYPE as a new BSTR: the literal name, or the string resource loaded by
    // LOAD. E_FAIL for an unnamed type or a string that does not load.
    HRESULT TypeName(const GUID& type, const StringLoader& load, BSTR* name) const;

    bool empty() const { return infos_.empty(); }

private:
    struct TypeNameEntry {
        uint32_t resourceId = 0;
        std::u16string literal;
        bool isLiteral = false;
    };
    std::map<GUID, std::unique_ptr<CqxpItemInfo>, qv::com::GuidLess> infos_;
    std::map<GUID, TypeNameEntry, qv::com::GuidLess> names_;
};
