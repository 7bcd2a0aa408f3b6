// The project's item tree as the command line prints it.
#pragma once

#include "project/Project.h"

#include <iosfwd>
#include <string>

namespace wbhost::cli {

// The readable name of an item type: "project", "target", "folder", "Tangent I/O item", or the
// type's identifier for types this host does not know.
std::string ItemTypeName(const GUID& type);

// Writes ITEM and everything below it to OUT, one line per item (type, quoted name, identifier,
// "hidden" when its shown flag is clear, a target's description file), each followed by the
// properties worth seeing: the item's attribute set as its attributes, its resource status in
// words, other properties as they are. DEPTH is the indentation level of ITEM.
void PrintItemTree(const project::ProjectItem& item, std::ostream& out, int depth = 0);

// The words for a resource status: "bound", "missing", "held by another item", or the number.
std::string ResourceStatusText(int32_t status);

} // namespace wbhost::cli
