// An item's typed properties, as the host keeps and saves them.
#pragma once

#include "com/ComObject.h"
#include "host/contracts/IwbProjectPropertyBag.h"

#include <cstdint>
#include <map>
#include <string>

namespace wbhost::project {

// One stored property: its kind decides which reads answer it.
struct Property {
    enum class Kind : char { String = 's', Int = 'i', Bool = 'b' };
    Kind kind = Kind::String;
    std::u16string text; // String
    int32_t number = 0;  // Int, and Bool as 0 or 1
    bool operator==(const Property&) const = default;
};

class PropertyBag : public IwbProjectPropertyBag {
public:
    using Interfaces = qv::com::InterfaceList<IwbProjectPropertyBag>;
    // Names are kept exactly as written (case matters), in name order.
    using Map = std::map<std::u16string, Property>;
    virtual ~PropertyBag() = default;

    // Reads: E_POINTER for a null name or value, E_INVALIDARG for an empty name, 1 (and an
    // empty value) when absent, E_INVALIDARG when the property holds another kind.
    HRESULT GetString(const char16_t* name, BSTR* value) override;
    HRESULT GetInt(const char16_t* name, int32_t* value) override;
    HRESULT GetBool(const char16_t* name, int32_t* value) override;
    // Writes replace the property whatever kind it held; the flag word is not used by this
    // host. E_POINTER for a null name, E_INVALIDARG for an empty one.
    HRESULT SetString(const char16_t* name, const char16_t* value, uint32_t flags) override;
    HRESULT SetInt(const char16_t* name, int32_t value, uint32_t flags) override;
    HRESULT SetBool(const char16_t* name, int32_t value, uint32_t flags) override;

    // Host side: every property, for saving.
    const Map& Properties() const noexcept { return properties_; }
    // Host side: stores PROPERTY under NAME (as reopening a project does).
    void Put(std::u16string name, Property property);
    // Test hook: every write answers STATUS (a failure) and stores nothing, until S_OK is given.
    void FailWrites(HRESULT status) noexcept { writeFailure_ = status; }

private:
    // The property NAME of KIND: S_OK with it in FOUND, 1 when absent, a failure otherwise.
    HRESULT Lookup(const char16_t* name, Property::Kind kind, const Property** found) const;
    HRESULT Store(const char16_t* name, Property property);
    Map properties_;
    HRESULT writeFailure_ = S_OK;
};

} // namespace wbhost::project
