// The run-time engine's C-interface function table that this host exports from its executable,
// as a host process does: modules open the default application reference over it and run the
// host's library programs through it. The table only connects; the programs themselves come from
// whoever holds the host's program session (SetEngineProgramOpener).
#pragma once

#include "host/refs/ProgramCalls.h"
#include "runtime/Runtime.h"

#include <functional>
#include <memory>
#include <string>
#include <string_view>

WBRT_EXPORT GetCInterfaceFunctionTableFn GetCInterfaceFunctionTable;

namespace wbhost::runtime {

// The revision the table reports: recent enough to answer numeric classes and run freely.
inline constexpr uint32_t kEngineTableRevision = 40;

// A program opened through the table.
class EngineProgram {
public:
    virtual ~EngineProgram() = default;
    // The program's terminals (owned by the program, valid while it is open).
    virtual WBErr Prepare(int32_t* count, WBTerminal** terminals) = 0;
    // Runs the program on its terminals' values and leaves its outputs in them.
    virtual WBErr Run() = 0;
};

// Opens the program file at PATH (a file-system path); a host error when it cannot.
using EngineProgramOpener =
    std::function<WBErr(const std::string& path, std::unique_ptr<EngineProgram>& program)>;

// Lets the holder of the program session open programs (empty: none, every open answers
// kWBFileNotFound).
void SetEngineProgramOpener(EngineProgramOpener opener);

// The file-system path a program path names: "<gxlib>:" stands for the host's program library
// (the folder "gxlib" in the host folder), and backslashes separate components as "/" does.
std::string ResolveProgramPath(std::string_view path);

} // namespace wbhost::runtime
