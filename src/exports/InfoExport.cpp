// GetInfo: the module's information number for the host's call-library mechanism.
#include "exports/Export.h"

#include <cstdint>

// Answers 5, always; takes nothing and touches nothing.
WBT_EXPORT int32_t GetInfo() noexcept {
    return 5;
}
