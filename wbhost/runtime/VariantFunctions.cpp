// The variant attribute functions of the host runtime. Attribute names are Pascal strings; one
// name holds one attribute, whatever its kind, and setting it replaces what was there.
#include "runtime/HostStrings.h"
#include "runtime/Runtime.h"
#include "runtime/VariantTable.h"

#include <new>
#include <optional>

namespace {

using wbhost::runtime::VariantAttribute;
using wbhost::runtime::VariantData;
using wbhost::runtime::VariantTable;

// The name in a Pascal string; nullopt for a null or empty name.
std::optional<std::string> AttributeName(const unsigned char* name) {
    if (name == nullptr || name[0] == 0) {
        return std::nullopt;
    }
    return std::string(reinterpret_cast<const char*>(name + 1), name[0]);
}

// The attribute NAME of VARIANT as a T; null when there is none of that kind.
template <class T> const T* Find(WBVariant variant, const std::string& name) {
    const auto& attributes = variant->data.attributes;
    const auto found = attributes.find(name);
    return found == attributes.end() ? nullptr : std::get_if<T>(&found->second);
}

// Runs BODY for a live VARIANT and a valid NAME; kWBArgErr otherwise, kWBMemFullErr when BODY
// runs out of memory.
template <class Body> WBErr WithAttribute(WBVariant variant, const unsigned char* name, Body body) {
    try {
        const auto text = AttributeName(name);
        if (!text || !VariantTable::Instance().IsLive(variant)) {
            return kWBArgErr;
        }
        return body(*text);
    } catch (const std::bad_alloc&) {
        return kWBMemFullErr;
    }
}

} // namespace

WBVariant WbVariantCreate(void) {
    return VariantTable::Instance().Create();
}

WBErr WbVariantDestroy(WBVariant variant) {
    return VariantTable::Instance().Destroy(variant) ? kWBNoErr : kWBArgErr;
}

WBErr WbVariantPStrGetStringAttr(WBVariant variant, const unsigned char* name, WBHandle* value) {
    if (value == nullptr) {
        return kWBArgErr;
    }
    return WithAttribute(variant, name, [&](const std::string& key) -> WBErr {
        const std::string* text = Find<std::string>(variant, key);
        if (!text) {
            return kWBAttrMissing;
        }
        return wbhost::runtime::StoreHostString(value, *text);
    });
}

WBErr WbVariantPStrSetStringAttr(WBVariant variant, const unsigned char* name, WBHandle value) {
    return WithAttribute(variant, name, [&](const std::string& key) -> WBErr {
        auto text = wbhost::runtime::ReadHostString(value);
        if (!text) {
            return kWBArgErr;
        }
        variant->data.attributes[key] = std::move(*text);
        return kWBNoErr;
    });
}

WBErr WbVariantPStrGetUI32Attr(WBVariant variant, const unsigned char* name, uint32_t* value) {
    if (value == nullptr) {
        return kWBArgErr;
    }
    return WithAttribute(variant, name, [&](const std::string& key) -> WBErr {
        const uint32_t* number = Find<uint32_t>(variant, key);
        if (!number) {
            return kWBAttrMissing;
        }
        *value = *number;
        return kWBNoErr;
    });
}

WBErr WbVariantPStrSetUI32Attr(WBVariant variant, const unsigned char* name, uint32_t value) {
    return WithAttribute(variant, name, [&](const std::string& key) -> WBErr {
        variant->data.attributes[key] = value;
        return kWBNoErr;
    });
}

WBErr WbVariantPStrGetWbVariantAttr(WBVariant variant, const unsigned char* name,
                                    WBVariant* value) {
    if (value == nullptr) {
        return kWBArgErr;
    }
    *value = nullptr;
    return WithAttribute(variant, name, [&](const std::string& key) -> WBErr {
        const auto* nested = Find<std::shared_ptr<const VariantData>>(variant, key);
        if (!nested) {
            return kWBAttrMissing;
        }
        *value = VariantTable::Instance().Create(**nested);
        return *value != nullptr ? kWBNoErr : kWBMemFullErr;
    });
}

WBErr WbVariantPStrSetWbVariantAttr(WBVariant variant, const unsigned char* name, WBVariant value) {
    return WithAttribute(variant, name, [&](const std::string& key) -> WBErr {
        // A variant holding itself would make a copy of itself that holds ... : it is copied
        // first, so the attribute keeps the state before the call.
        if (!VariantTable::Instance().IsLive(value)) {
            return kWBArgErr;
        }
        auto copy = std::make_shared<const VariantData>(value->data);
        variant->data.attributes[key] = std::move(copy);
        return kWBNoErr;
    });
}
