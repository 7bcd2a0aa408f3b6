// Named attributes of host variants, read through the host runtime. Attribute names cross as
// Pascal strings (a length byte, then the bytes).
#pragma once

#include "host/binding/runtime_api.h"

#include <array>
#include <optional>
#include <string>
#include <string_view>

namespace qv::host {

// NAME as a Pascal string (names longer than 255 bytes are cut: no attribute has such a name).
class PascalName {
public:
    explicit PascalName(std::string_view name);
    const unsigned char* get() const noexcept { return bytes_.data(); }

private:
    std::array<unsigned char, 256> bytes_{};
};

// A variant the host handed out for the caller to destroy; destroyed with the holder.
class OwnedVariant {
public:
    OwnedVariant() = default;
    ~OwnedVariant();
    OwnedVariant(const OwnedVariant&) = delete;
    OwnedVariant& operator=(const OwnedVariant&) = delete;

    WBVariant* Put() noexcept { return &variant_; }
    WBVariant get() const noexcept { return variant_; }

private:
    WBVariant variant_ = nullptr;
};

// The string attribute NAME of VARIANT (bytes in the host's code page); nothing when the host has
// none to give. The host string the host made for it is given back before this answers.
std::optional<std::string> VariantStringAttribute(WBVariant variant, std::string_view name);

// The variant attribute NAME of VARIANT into HELD; false when the host has none to give.
bool VariantAttribute(WBVariant variant, std::string_view name, OwnedVariant& held);

} // namespace qv::host
