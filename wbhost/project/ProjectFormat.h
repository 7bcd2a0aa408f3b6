// The project file's text form: one line per item and per property.
//
//   wbhost-project 1
//   item ID PARENT TYPE FLAGS NAME      PARENT is "-" for the root (the first item only)
//   target ID FILE                      the resource description of target item ID (bytes)
//   string ID NAME VALUE
//   int ID NAME DECIMAL
//   bool ID NAME 0|1
//   end
//
// Fields are separated by one space. IDs and types are GUIDs in braces, FLAGS eight hex digits.
// Texts are UTF-8 (each UTF-16 unit on its own, so any text round-trips) with "\\" for a
// backslash, "\s" for a space and "\xHH" for every byte below 0x20 and 0x7F; an empty text is
// "\e". Items come before their children and properties after their item. The closing "end"
// tells a complete file from a cut one.
#pragma once

#include "kern/Guid.h"
#include "project/PropertyBag.h"

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace wbhost::project {

struct SavedItem {
    GUID id{};
    GUID type{};
    uint32_t flags = 0;
    std::u16string name;
    size_t parent = kNoParent;   // index of the parent in SavedProject::items
    std::string descriptionFile; // targets only
    PropertyBag::Map properties;
    static constexpr size_t kNoParent = static_cast<size_t>(-1);
};

// The items of a project; the first is the root, every parent comes before its children.
struct SavedProject {
    std::vector<SavedItem> items;
};

// The file text of PROJECT.
std::string FormatProject(const SavedProject& project);
// Reads TEXT into PROJECT; false with a message naming the line in ERROR (may be null) when
// the text is not a complete, well-formed project file. PROJECT is replaced only on success.
bool ParseProject(std::string_view text, SavedProject& project, std::string* error);

// The escaped form of TEXT as a field (never empty, never holding a space or line break).
std::string EscapeField(std::u16string_view text);
// The text of FIELD; false when it holds a malformed escape or UTF-8.
bool UnescapeField(std::string_view field, std::u16string& text);
// The same for bytes kept as they are (file names): no UTF-8 involved.
std::string EscapeBytes(std::string_view bytes);
bool UnescapeBytes(std::string_view field, std::string& bytes);

} // namespace wbhost::project
