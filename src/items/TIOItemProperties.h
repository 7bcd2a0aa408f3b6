// What a Tangent I/O item stores and how it watches its resource: property and attribute
// names, registration kinds and their event masks.
#pragma once

#include <cstdint>
#include <string_view>

namespace tio {

// Properties of the host item.
inline constexpr const char16_t* kAttrBagProperty = u"tioAttrBag";
inline constexpr const char16_t* kStatusProperty = u"tioResourceStatus";
inline constexpr const char16_t* kFeatureSetVersionProperty = u"tioFeatureSetVersion";
inline constexpr const char16_t* kHiddenProperty = u"HiddenTIO";
inline constexpr const char16_t* kPhysicalProperty = u"QV.WB.TIO.Physical";

// The attribute of the working set that holds the resource path.
inline constexpr std::u16string_view kResource = u"resource";
// The icon an item shows when neither its resource nor the tree names one.
inline constexpr std::u16string_view kDefaultIcon = u"NonFile.png";
// Reservation mode of I/O items.
inline constexpr uint32_t kReserveMode = 3;

// Registration kinds, handed back with each notification.
namespace kind {
inline constexpr uint32_t kResource = 1;    // the bound resource node
inline constexpr uint32_t kWatch = 2;       // where a missing resource is expected
inline constexpr uint32_t kDefinitions = 3; // the resource's attribute definitions
inline constexpr uint32_t kSignatures = 4;  // its method and property sets and members
inline constexpr uint32_t kAny = 0xFFFFFFFFu;
} // namespace kind

// Event masks of the registrations.
inline constexpr uint32_t kResourceMask = 0x463;      // gone, renamed, moved, reservation, leaving
inline constexpr uint32_t kWatchMask = 0x301;         // gone, child added, child renamed
inline constexpr uint32_t kDefinitionSetMask = 0x9F;  // the "AttributeSet" node
inline constexpr uint32_t kDefinitionMask = 0x9E;     // the nodes below it
inline constexpr uint32_t kNoDefinitionsMask = 0x100; // the resource itself, without definitions
inline constexpr uint32_t kMemberSetMask = 0x380;     // "MethodSet" and "PropertySet"
inline constexpr uint32_t kMemberMask = 0x4;          // each method and property

} // namespace tio
