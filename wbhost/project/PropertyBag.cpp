// The host's property bag.
#include "project/PropertyBag.h"

#include "com/CallGuard.h"

#include <string_view>

namespace wbhost::project {

namespace {
HRESULT CheckName(const char16_t* name) {
    if (name == nullptr)
        return E_POINTER;
    return *name == u'\0' ? E_INVALIDARG : S_OK;
}
} // namespace

HRESULT PropertyBag::Lookup(const char16_t* name, Property::Kind kind,
                            const Property** found) const {
    if (const HRESULT hr = CheckName(name); FAILED(hr))
        return hr;
    const auto it = properties_.find(name);
    if (it == properties_.end())
        return S_FALSE;
    // A read of another kind is the caller's mistake; answering "absent" would let it
    // overwrite the stored value without noticing.
    if (it->second.kind != kind)
        return E_INVALIDARG;
    *found = &it->second;
    return S_OK;
}

HRESULT PropertyBag::GetString(const char16_t* name, BSTR* value) {
    if (value == nullptr)
        return E_POINTER;
    *value = nullptr;
    return qv::com::GuardCall([&]() -> HRESULT {
        const Property* found = nullptr;
        const HRESULT hr = Lookup(name, Property::Kind::String, &found);
        if (hr != S_OK)
            return hr;
        // An empty text is still a present property: hand out an empty BSTR, not null.
        *value = qv::com::AllocBstr(found->text);
        return *value ? S_OK : E_OUTOFMEMORY;
    });
}

HRESULT PropertyBag::GetInt(const char16_t* name, int32_t* value) {
    if (value == nullptr)
        return E_POINTER;
    *value = 0;
    const Property* found = nullptr;
    const HRESULT hr = Lookup(name, Property::Kind::Int, &found);
    if (hr == S_OK)
        *value = found->number;
    return hr;
}

HRESULT PropertyBag::GetBool(const char16_t* name, int32_t* value) {
    if (value == nullptr)
        return E_POINTER;
    *value = 0;
    const Property* found = nullptr;
    const HRESULT hr = Lookup(name, Property::Kind::Bool, &found);
    if (hr == S_OK)
        *value = found->number;
    return hr;
}

HRESULT PropertyBag::Store(const char16_t* name, Property property) {
    if (const HRESULT hr = CheckName(name); FAILED(hr))
        return hr;
    if (FAILED(writeFailure_))
        return writeFailure_;
    return qv::com::GuardCall([&]() -> HRESULT {
        properties_[name] = std::move(property);
        return S_OK;
    });
}

HRESULT PropertyBag::SetString(const char16_t* name, const char16_t* value, uint32_t) {
    Property property;
    property.text = value ? std::u16string(value) : std::u16string();
    return Store(name, std::move(property));
}

HRESULT PropertyBag::SetInt(const char16_t* name, int32_t value, uint32_t) {
    return Store(name, Property{Property::Kind::Int, {}, value});
}

HRESULT PropertyBag::SetBool(const char16_t* name, int32_t value, uint32_t) {
    return Store(name, Property{Property::Kind::Bool, {}, value != 0 ? 1 : 0});
}

void PropertyBag::Put(std::u16string name, Property property) {
    properties_[std::move(name)] = std::move(property);
}

} // namespace wbhost::project
