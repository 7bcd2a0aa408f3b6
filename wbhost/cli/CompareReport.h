// What `wbhost compare` prints: the answer, and with --explain the entries that decided it.
#pragma once

#include "resource_tree/CompareExplanation.h"

#include <cstdint>
#include <iosfwd>

namespace wbhost::cli {

// "match", "not satisfied" or "tolerated difference" for a comparison's ANSWER.
const char* AnswerText(uint32_t answer);

// The exit status that tells ANSWER (ExitStatus.h).
int AnswerStatus(uint32_t answer);

// Writes to OUT, one indented line each, what decided WHY's answer: for "not satisfied" the
// required entry the offered description lacks or contradicts, with both texts; for "tolerated
// difference" every entry that made it so. Nothing for a match.
void WriteExplanation(const wbhw::CompareExplanation& why, std::ostream& out);

} // namespace wbhost::cli
