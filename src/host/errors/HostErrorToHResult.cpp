// Host errors as COM-style statuses for the exported functions.
#include "host/errors/HostErrorToHResult.h"

namespace qv::host::errors {

int32_t HostErrorToHResult(int32_t hostError) noexcept {
    switch (hostError) {
    case 0:
        return 0;
    case 1:
        return static_cast<int32_t>(0x80070057u);
    case 2:
        return static_cast<int32_t>(0x8007000Eu);
    case 7:
        return static_cast<int32_t>(0x80030002u);
    case 53:
        return static_cast<int32_t>(0x80004001u);
    default:
        return static_cast<int32_t>(0x80004005u);
    }
}

} // namespace qv::host::errors
