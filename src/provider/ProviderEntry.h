// The module entry behind the export qxGetProvider.
#pragma once

#include "com/HResult.h"

#include <cstdint>

namespace tio {

// Hands out the provider interface in *PROVIDER. MODE 0: the module's current provider, created
// (and made current) when there is none; any other MODE: a new private provider, after which the
// module has no current provider. E_POINTER for a null PROVIDER (nothing is created); a failed
// creation answers its status. Runs under the module-wide provider lock.
HRESULT GetProvider(int32_t mode, void** provider);

} // namespace tio
