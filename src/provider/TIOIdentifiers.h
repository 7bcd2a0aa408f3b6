// The identifiers the provider answers and registers.
#pragma once

#include "com/ComGuid.h"

namespace tio {
// The framework's generic item, as created by this provider.
inline constexpr GUID kGenericItemType = qv::com::ParseGuid("8DF12EF0-9B63-4346-99D9-34B3172FFFBA");
// The Tangent I/O item.
inline constexpr GUID kIOItemType = qv::com::ParseGuid("A117026A-AD51-4C63-8341-085C842E9D22");
// The create-new wizard of Tangent I/O items.
inline constexpr GUID kWizardType = qv::com::ParseGuid("8FC35A9F-C4B7-4CF9-A2BA-6FC5C6E55647");
// The provider's class identifier.
inline constexpr CLSID kProviderClassId =
    qv::com::ParseGuid("5274E96F-E9DF-4BF8-B8C8-B79325CC50A1");
} // namespace tio
