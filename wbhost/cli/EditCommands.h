// The work behind `wbhost edit`: a target's resource tree changed through the resource
// service, as hardware changes would change it, with the project's items told and saved.
#pragma once

#include "cli/HostOptions.h"

#include <iosfwd>
#include <string>
#include <vector>

namespace wbhost::cli {

enum class EditKind { Rename, Remove, Insert, SetAttribute, RemoveAttribute, SetProperty };

struct EditRequest {
    std::string target; // the target's name
    EditKind kind = EditKind::Rename;
    std::string node; // the node changed, or the one inserted under ("" or "/": root)
    // The new name (rename), the resource-tree document file (insert), the attribute's name, or
    // the property's value (set-property, whose NODE is a path ending in the property's name).
    std::string argument;
    std::string value; // the attribute's new value (set-attribute)
};

// Fills REQUEST from ACTION and its ARGUMENTS (rename NODE NEWNAME, remove NODE, insert PARENT
// FILE, set-attribute NODE NAME VALUE, remove-attribute NODE NAME, set-property PATH VALUE). False
// with the usage in ERROR when the action is unknown or the count of arguments does not fit it.
bool ParseEdit(const std::string& action, const std::vector<std::string>& arguments,
               EditRequest& request, std::string& error);

// Applies REQUEST to the target's tree in the project PROJECTPATH (set-property through the
// module's property export, as a host program sets one: the last piece of the path that names no
// node is the property of the deepest node it names), then writes what the
// target's items now say to OUT and saves the project. The changed tree is kept beside the
// project file ("PROJECT.TARGET.xml", the target then refers to it), so reopening the project
// finds the tree its items followed; the original description is never rewritten. Fails,
// leaving every file as it was, when the project or target cannot be found, the node does not
// exist, the edit is refused (a sibling holds the new name, the root cannot be removed, the
// document does not load, the attribute is a child or is not there) or a file cannot be written.
int RunEdit(const HostOptions& options, const std::string& projectPath, const EditRequest& request,
            std::ostream& out, std::ostream& err);

// The file beside PROJECTPATH that keeps the changed tree of the target TARGETNAME: characters
// other than letters, digits, '-' and '_' become '_', so any target name gives one plain file
// name.
std::string EditedDescriptionPath(const std::string& projectPath, std::u16string_view targetName);

} // namespace wbhost::cli
