// The host's variants: records of named attributes (texts, 32-bit numbers, nested variants),
// recorded so that a stale or foreign pointer is answered with a host error.
#pragma once

#include "host/binding/runtime_api.h"

#include <cstdint>
#include <map>
#include <memory>
#include <mutex>
#include <string>
#include <unordered_map>
#include <variant>

namespace wbhost::runtime {

struct VariantData;
// A nested variant is kept as an unchangeable copy: reading it hands out a variant of its own,
// so changing what was read never changes the holder.
using VariantAttribute = std::variant<std::string, uint32_t, std::shared_ptr<const VariantData>>;

struct VariantData {
    std::map<std::string, VariantAttribute> attributes;
};

} // namespace wbhost::runtime

struct WBVariantRec {
    wbhost::runtime::VariantData data;
};

namespace wbhost::runtime {

class VariantTable {
public:
    // The table of this process.
    static VariantTable& Instance();

    // A new variant holding DATA; null when out of memory.
    WBVariant Create(VariantData data = {});
    // Whether VARIANT is a live variant of this table.
    bool IsLive(WBVariant variant) const;
    // Releases a live variant; false for null or unknown ones.
    bool Destroy(WBVariant variant);
    // The number of live variants.
    size_t LiveCount() const;

private:
    mutable std::mutex lock_;
    std::unordered_map<WBVariant, std::unique_ptr<WBVariantRec>> variants_;
};

} // namespace wbhost::runtime
