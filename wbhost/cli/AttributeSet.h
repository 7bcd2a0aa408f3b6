// Attribute-set texts as the new-item wizard program hands them to the module, and a reader
// that lists what a saved item's set says.
#pragma once

#include <optional>
#include <string>
#include <utility>
#include <vector>

namespace wbhost::cli {

// One attribute of a set: its path ("name" for the root set's own, "/A/B/name" below it).
using SetAttribute = std::pair<std::u16string, std::u16string>;

// The attribute-set text that asks for one new item called NAME (folders first, separated by
// "/") using the resource at the path RESOURCE: a set with the attributes "name" and "resource"
// and the attributes MORE (whose names must be neither of those), in name order.
std::u16string NewItemAttributeSet(std::u16string_view name, std::u16string_view resource,
                                   const std::vector<SetAttribute>& more = {});

// Every attribute of the attribute-set text TEXT, in document order; nullopt when TEXT is not a
// well-formed attribute-set document.
std::optional<std::vector<SetAttribute>> ReadAttributeSet(std::u16string_view text);

} // namespace wbhost::cli
