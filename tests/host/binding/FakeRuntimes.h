// The fake runtime libraries built beside the binding tests, and small helpers over them.
#pragma once

#include "kern/osdep/DynamicModule.h"

#include <cstdint>
#include <string>

namespace hostrt_test {

// Path of fake runtime number `n` (1 to 9, or 11 and 12, which share one build id); its
// FakeAnswer() answers n.
std::string FakePath(int n);
// Path of the fake whose soname is "libwbrt.so" (answer 100, revision 40, version "16.0").
std::string FakeWbrtPath();
// Path of the fake whose soname is "libwbffrt.so" (answer 200, revision 17).
std::string FakeWbffrtPath();

// The counters of a loaded fake: opens, closes, starts, opens by name.
struct FakeCounters {
    int32_t opens, closes, starts, openByNames;
};
FakeCounters CountersOf(void* module);

} // namespace hostrt_test
