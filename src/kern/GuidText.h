// GUIDs as text: "{XXXXXXXX-XXXX-XXXX-XXXX-XXXXXXXXXXXX}", 38 characters.
#pragma once

#include "kern/Guid.h"

#include <string>
#include <string_view>

namespace qv::kern {

// The 38-character text form with upper-case hexadecimal digits.
std::u16string GuidToString(const Guid& guid);
// The same text, narrow.
std::string GuidToNarrowString(const Guid& guid);

// Reads the 38-character text form (digits of either case). Any other length, a missing brace
// or hyphen, or a character that is not a hexadecimal digit raises BadGuidString.
Guid StringToGuid(std::u16string_view text);
// The same for narrow text.
Guid StringToGuid(std::string_view text);

} // namespace qv::kern
