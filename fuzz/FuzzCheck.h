// The one assertion of the fuzz targets: stop at once, so that libFuzzer keeps the input that
// broke an invariant as a crash. Unlike assert it stays on in the optimised fuzz builds.
#pragma once

#include <cstdlib>

namespace wbt::fuzz {

inline void Check(bool condition) {
    if (!condition) {
        std::abort();
    }
}

} // namespace wbt::fuzz
