// The methods and properties a resource offers: what the feature-set version counts and the
// compile configuration spells out.
#pragma once

#include "host/ResourceNode.h"

#include <string_view>
#include <vector>

namespace tio {

inline constexpr std::u16string_view kSignature = u"Signature";
inline constexpr std::u16string_view kLastSignature = u"TIOLastSignature";

struct ResourceMembers {
    qv::host::ResourceNode methodSet;   // the resource's "MethodSet" child, or empty
    qv::host::ResourceNode propertySet; // its "PropertySet" child, or empty
    // The Method children of the one, then the Property children of the other, in order.
    std::vector<qv::host::ResourceNode> members;
};

// The members of RESOURCE; failing queries throw.
ResourceMembers CollectMembers(const qv::host::ResourceNode& resource);

} // namespace tio
