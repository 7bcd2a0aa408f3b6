// The item list that `project add-items` reads: one Tangent I/O item a line, as a person writes
// it for a board with hundreds of lines.
//
//   # comment (a line whose first non-blank character is "#"; blank lines are skipped too)
//   NAME<TAB>RESOURCE[<TAB>ATTRIBUTE=VALUE]...
//
// NAME is the item's place ("Folder/Name"), RESOURCE its resource's path in the target's tree.
#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace wbhost::cli {

// One item of the list (texts as UTF-8, as they were written).
struct ItemLine {
    size_t line = 0; // 1-based
    std::string name;
    std::string resource;
    std::vector<std::pair<std::string, std::string>> attributes; // in the order written
};

// Where and why a list was refused.
struct ItemListError {
    size_t line = 0;   // 1-based
    size_t column = 0; // 1-based byte column of the field at fault
    std::string message;
};

// Splits "ATTRIBUTE=VALUE" into its two parts; the reason it cannot when the attribute is empty,
// the "=" is missing or the attribute is one the place and resource are given by ("name",
// "resource", in any case).
std::optional<std::string> SplitAttributeText(std::string_view text,
                                              std::pair<std::string, std::string>& attribute);

// Reads the list TEXT into LINES; the first bad line's error instead (LINES then holds the items
// before it). A bad line: fewer than two fields, an empty name or resource, a malformed
// attribute, or text that is not UTF-8. A final line without line feed counts; a carriage return
// before a line feed is dropped.
std::optional<ItemListError> ParseItemList(std::string_view text, std::vector<ItemLine>& lines);

} // namespace wbhost::cli
