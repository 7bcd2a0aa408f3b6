// The variant attribute functions of the host runtime. Attribute names are Pascal strings; one
// name holds one attribute, whatever its kind, and setting it replaces what was there.
#include "runtime/HandleTable.h"
#include "runtime/HostStrings.h"
#include "runtime/Runtime.h"
#include "runtime/VariantTable.h"

#include <cstring>
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

// The variant VARIANT stands for: a live variant itself, or, when VARIANT is the address of a
// variant slot inside a live host block (the elements of a host array of variants, which start
// zero-filled), the variant in that slot, made there first when the slot is empty and CREATE is
// set. Null for anything else.
WBVariant Resolve(WBVariant variant, bool create) {
    VariantTable& variants = VariantTable::Instance();
    if (variants.IsLive(variant)) {
        return variant;
    }
    if (variant == nullptr ||
        !wbhost::runtime::HandleTable::Instance().Contains(variant, sizeof(WBVariant))) {
        return nullptr;
    }
    WBVariant held = nullptr;
    std::memcpy(&held, static_cast<const void*>(variant), sizeof held);
    if (held == nullptr && create) {
        held = variants.Create();
        std::memcpy(static_cast<void*>(variant), &held, sizeof held);
    }
    return variants.IsLive(held) ? held : nullptr;
}

// Runs BODY for a valid NAME with VARIANT resolved (see Resolve); kWBArgErr otherwise,
// kWBMemFullErr when BODY runs out of memory.
template <class Body>
WBErr WithAttribute(WBVariant& variant, const unsigned char* name, bool create, Body body) {
    try {
        const auto text = AttributeName(name);
        variant = text ? Resolve(variant, create) : nullptr;
        if (!variant) {
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
    const WBVariant held = Resolve(variant, false);
    if (!held || !VariantTable::Instance().Destroy(held)) {
        return kWBArgErr;
    }
    if (held != variant) { // a slot is left empty, not holding a freed variant
        std::memset(static_cast<void*>(variant), 0, sizeof held);
    }
    return kWBNoErr;
}

WBErr WbVariantPStrGetStringAttr(WBVariant variant, const unsigned char* name, WBHandle* value) {
    if (value == nullptr) {
        return kWBArgErr;
    }
    return WithAttribute(variant, name, false, [&](const std::string& key) -> WBErr {
        const std::string* text = Find<std::string>(variant, key);
        if (!text) {
            return kWBAttrMissing;
        }
        return wbhost::runtime::StoreHostString(value, *text);
    });
}

WBErr WbVariantPStrSetStringAttr(WBVariant variant, const unsigned char* name, WBHandle value) {
    return WithAttribute(variant, name, true, [&](const std::string& key) -> WBErr {
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
    return WithAttribute(variant, name, false, [&](const std::string& key) -> WBErr {
        const uint32_t* number = Find<uint32_t>(variant, key);
        if (!number) {
            return kWBAttrMissing;
        }
        *value = *number;
        return kWBNoErr;
    });
}

WBErr WbVariantPStrSetUI32Attr(WBVariant variant, const unsigned char* name, uint32_t value) {
    return WithAttribute(variant, name, true, [&](const std::string& key) -> WBErr {
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
    return WithAttribute(variant, name, false, [&](const std::string& key) -> WBErr {
        const auto* nested = Find<std::shared_ptr<const VariantData>>(variant, key);
        if (!nested) {
            return kWBAttrMissing;
        }
        *value = VariantTable::Instance().Create(**nested);
        return *value != nullptr ? kWBNoErr : kWBMemFullErr;
    });
}

WBErr WbVariantPStrSetWbVariantAttr(WBVariant variant, const unsigned char* name, WBVariant value) {
    return WithAttribute(variant, name, true, [&](const std::string& key) -> WBErr {
        // A variant holding itself would make a copy of itself that holds ... : it is copied
        // first, so the attribute keeps the state before the call.
        const WBVariant source = Resolve(value, false);
        if (!source) {
            return kWBArgErr;
        }
        auto copy = std::make_shared<const VariantData>(source->data);
        variant->data.attributes[key] = std::move(copy);
        return kWBNoErr;
    });
}
