// Unique names: what the unique-name program computes for a proposed name and the names taken.
#pragma once

#include <string>
#include <vector>

namespace wbhost::runner {

// PROPOSED itself when no name in TAKEN equals it (ignoring case, as names compare); else its
// stem (PROPOSED without trailing digits, or PROPOSED when that leaves nothing) with the smallest
// number from 1 appended that gives a name not taken. An empty PROPOSED is treated as a stem.
std::u16string UniqueName(const std::u16string& proposed, const std::vector<std::u16string>& taken);

} // namespace wbhost::runner
