// Overflow-checked arithmetic for buffer sizes.
#pragma once

#include "kern/exception/Exception.h"

#include <cstdint>

namespace qv::kern {

// The product of two unsigned 32-bit counts (element count times element size); raises
// OutOfRange when it does not fit in 32 bits.
inline uint32_t SafeMultiply(uint32_t a, uint32_t b) {
    uint32_t product = 0;
    if (__builtin_mul_overflow(a, b, &product))
        QV_THROW(exception::OutOfRange());
    return product;
}

} // namespace qv::kern
