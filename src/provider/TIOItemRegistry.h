// The module's item-type registry: the generic item, the Tangent I/O item and its wizard.
#pragma once

#include "framework/CqxItemTypeRegistry.h"

namespace tio {

// The registry, with the item types registered on first use (once per module).
CqxItemTypeRegistry& ItemRegistry();

} // namespace tio
