// A tiny stand-in for a host runtime library, built several times with different answers so that
// tests can load distinct runtime modules exporting the same names.
#include <cstdint>
#include <cstring>

#define FAKE_EXPORT extern "C" __attribute__((visibility("default")))

namespace {

struct Counters {
    int32_t opens = 0;
    int32_t closes = 0;
    int32_t starts = 0;
    int32_t openByNames = 0;
};

Counters counters;
int connectionToken = 0;

int32_t Open(void** connection, int32_t mode, int32_t flags) {
    ++counters.opens;
    *connection = &connectionToken;
    return mode == 2 && flags == 0 ? 0 : 1;
}

int32_t Close(void* connection) {
    ++counters.closes;
    return connection == &connectionToken ? 0 : 1;
}

int32_t Start(void* connection) {
    ++counters.starts;
    return connection == &connectionToken ? 0 : 1;
}

int32_t OpenByName(void** connection, int32_t mode, int32_t flags, const char* application) {
    ++counters.openByNames;
    *connection = &connectionToken;
    return mode == 2 && flags == 0 && application != nullptr && application[0] != '\0' ? 0 : 1;
}

// Revision, then functions 1 to 109 (only 1, 2, 3 and 109 are filled).
const void* table[110] = {};

} // namespace

FAKE_EXPORT const char gWBRTVersion[] = FAKE_VERSION;

FAKE_EXPORT int32_t FakeAnswer(void) {
    return FAKE_ANSWER;
}

FAKE_EXPORT const void* const* GetCInterfaceFunctionTable(void) {
    table[0] = reinterpret_cast<const void*>(static_cast<uintptr_t>(FAKE_REVISION));
    table[1] = reinterpret_cast<const void*>(&Open);
    table[2] = reinterpret_cast<const void*>(&Close);
    table[3] = reinterpret_cast<const void*>(&Start);
    table[109] = reinterpret_cast<const void*>(&OpenByName);
    return table;
}

// Uses the C library, so the fake depends on it like any real runtime does.
FAKE_EXPORT size_t FakeLength(const char* text) {
    return std::strlen(text);
}

// Opens, closes, starts and opens-by-name seen so far, for the tests.
FAKE_EXPORT void FakeCounters(int32_t* out) {
    out[0] = counters.opens;
    out[1] = counters.closes;
    out[2] = counters.starts;
    out[3] = counters.openByNames;
}
