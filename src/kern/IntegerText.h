// Unsigned 32-bit integers as text in bases 2 to 36, both ways.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace qv::kern {

// Writes value in base (2 to 36) with the digits 0-9 and upper-case A-Z, no sign and no prefix
// ("0" for zero). Any other base raises UnableToConvert.
std::u16string IntegerToString(uint32_t value, uint32_t base);

// Reads an unsigned 32-bit number in base (2 to 36) from text. Leading white space (space, tab,
// CR, LF, VT, FF) and one sign are skipped; *minus (when not null) tells whether the sign was
// "-". Digits are 0-9 and ASCII letters of either case; the first other character, or one whose
// value is not below the base, ends the number. Raises UnableToConvert for a bad base and for a
// value above 0xFFFFFFFF. Empty text or text ending early: strict raises UnableToConvert,
// otherwise the value read so far (0 when none) is returned.
uint32_t StringToInteger(std::u16string_view text, uint32_t base, bool* minus, bool strict);

} // namespace qv::kern
