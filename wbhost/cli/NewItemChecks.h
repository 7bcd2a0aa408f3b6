// What the command line checks before it asks the module for new Tangent I/O items, so that a
// request it would refuse halfway is refused before anything is created.
#pragma once

#include "kern/Collate.h"
#include "project/Project.h"

#include <set>
#include <string>
#include <vector>

namespace wbhost::cli {

using NameSet = std::set<std::u16string, qv::kern::LessNoCase>;

// TEXT in double quotes, as UTF-8, for messages.
std::string Quoted(std::u16string_view text);

// The folder names and the item name of the place NAME ("Folder/Sub/Name"; a "/" after an odd
// number of backslashes belongs to the name, as the module reads it); empty when NAME or one of
// its parts is empty.
std::vector<std::u16string> PlaceParts(std::u16string_view name);

// The names of the Tangent I/O items anywhere below TARGET (names are unique in a whole target).
NameSet IOItemNames(const project::ProjectItem& target);

// Why no Tangent I/O item can be made at PARTS below TARGET, whose I/O items are called IONAMES:
// a folder part naming an item that is no folder, the name taken below its folder, or an I/O
// item of that name elsewhere in the target; empty when it can.
std::string PlaceConflict(const project::ProjectItem& target,
                          const std::vector<std::u16string>& parts, const NameSet& ioNames);

// The path of the resource node PATH names in TARGET's tree, as the tree writes it; empty when
// there is no such node (or PATH names the root).
std::u16string ResourceNodePath(project::Project& project, project::ProjectItem& target,
                                std::u16string_view path);

} // namespace wbhost::cli
