// The module entry the host calls first: it hands out the Tangent I/O provider.
#include "exports/Export.h"
#include "provider/ProviderEntry.h"

#include <cstdint>

// MODE 0: the shared provider (created on first use); any other MODE: a new private provider.
// PROVIDER receives the provider interface with a reference; E_POINTER when it is null.
WBT_EXPORT HRESULT qxGetProvider(int32_t mode, void** provider) {
    return tio::GetProvider(mode, provider);
}
