// The fixed registry of node types and their bases, which decides what counts as a list type.
#pragma once

#include <string_view>

namespace wbhw {

// True when TYPE names a list type: a registered type whose name, or a base's name
// (recursively), ends with "List"; an unregistered type when its name ends with "List".
// Names are compared without regard to case.
bool IsListType(std::u16string_view type) noexcept;

// True when TEXT ends with SUFFIX, ignoring case.
bool EndsWithNoCase(std::u16string_view text, std::u16string_view suffix) noexcept;

} // namespace wbhw
