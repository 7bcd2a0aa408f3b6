// The host behaviours that program files stand for.
#pragma once

#include "runner/ProgramSession.h"

#include <optional>
#include <string>

namespace wbhost::runner {

// Whether BEHAVIOUR is one this host implements.
bool IsKnownBehaviour(const std::string& behaviour);

// Runs BEHAVIOUR on INPUTS: computed behaviours (unique names) compute their outputs; dialog
// behaviours answer what ANSWERS hold, and where they hold nothing, what a user who closes the
// dialog would leave (cancelled, nothing chosen). Answers override computed outputs too, so a
// test can make any program fail. Nullopt for an unknown behaviour.
std::optional<Terminals> RunBehaviour(const std::string& behaviour, const Terminals& inputs,
                                      const Terminals& answers);

} // namespace wbhost::runner
