// Choosing and loading the run-time library behind a connection of a given kind.
#pragma once

#include "host/binding/EngineSearch.h"
#include "kern/osdep/DynamicModule.h"

#include <optional>
#include <string>

namespace qv::host::rt {

// Kinds of connection: an installed run-time engine, an installed FF run-time engine, or a
// process (a named executable, or this one).
enum ConnectionKind : int { kRunTimeEngine = 0, kFFRunTimeEngine = 1, kProcessRuntime = 2 };

// The version text the module exports as "gWBRTVersion" (a zero-terminated text at the symbol);
// nullopt when it exports none.
std::optional<std::string> RuntimeVersionOf(void* module);

// Loads the runtime for `kind`. Kinds 0 and 1: this process when its own "gWBRTVersion" equals
// `name` (the version), else the library found by the run-time engine search; with a `directory`,
// the library in that directory, unless this process carries the same "gWBRTVersion", which is
// then used instead. Kind 2: the executable or library `name`, or without a name this process.
// Empty when nothing could be loaded.
kern::osdep::DynamicModule LoadRuntime(int kind, const std::string& name,
                                       const std::string& directory,
                                       const EngineSearchEnvironment& environment);

} // namespace qv::host::rt
