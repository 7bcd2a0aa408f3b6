// The program-reference functions of a run-time engine's C-interface function table, by slot.
// The engine (or the embedded host, for a process runtime) fills these slots of its table.
#pragma once

#include <cstddef>
#include <cstdint>

extern "C" {

// One terminal of an opened program: its data (owned by the engine, sized for its type), a
// flags word, and its type descriptor (byte 1 is the type code).
struct WBTerminal {
    void* data;
    uint32_t flags;
    uint32_t reserved;
    const uint8_t* type;
};
static_assert(sizeof(WBTerminal) == 24 && offsetof(WBTerminal, type) == 16, "terminal layout");

// Opens the program at PATH over CONNECTION; *PROGRAM receives its handle. Host error code.
typedef int32_t WBCIntOpenProgramFn(void* connection, const char* path, uint32_t options,
                                    uint32_t flags, void** program);
// Closes a program handle. Host error code.
typedef int32_t WBCIntCloseProgramFn(void* program);
// Prepares PROGRAM for running: *COUNT terminals in *TERMINALS (engine-owned, valid until the
// program is closed). Host error code.
typedef int32_t WBCIntPrepareProgramFn(void* program, int32_t* count, WBTerminal** terminals);
// Runs a prepared PROGRAM with its terminals, waiting for its end when WAIT is non-zero.
typedef int32_t WBCIntRunProgramFn(void* program, int32_t wait);
// The numeric class (0 to 15) of a type descriptor; tables of revision 19 and later.
typedef int32_t WBCIntNumericClassFn(const uint8_t* type);

} // extern "C"

namespace qv::host::refs {

// Slots of the functions above in the function table (counting from 1, after the revision).
inline constexpr size_t kOpenProgramSlot = 30;
inline constexpr size_t kCloseProgramSlot = 31;
inline constexpr size_t kPrepareProgramSlot = 32;
inline constexpr size_t kRunProgramSlot = 33;
inline constexpr size_t kNumericClassSlot = 34;
// The table revision from which the table answers numeric classes itself.
inline constexpr uint32_t kNumericClassRevision = 19;
// The table revision from which programs run without the application reference's consent.
inline constexpr uint32_t kFreeRunRevision = 23;

} // namespace qv::host::refs
