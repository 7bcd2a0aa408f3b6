// Items of a target found by their place: folder names and the item's name joined by "/" (see
// PlaceParts), each compared without regard to case, as the project tree finds them.
#pragma once

#include "project/ProjectItem.h"

#include <string_view>

namespace wbhost::cli {

// The child of PARENT called NAME (without regard to case), or null.
project::ProjectItem* ChildNamed(const project::ProjectItem& parent, std::u16string_view name);

// The item at PLACE below TARGET; null when a part names no item or PLACE is malformed (the
// target itself is never answered).
project::ProjectItem* ItemAt(project::ProjectItem& target, std::u16string_view place);

} // namespace wbhost::cli
