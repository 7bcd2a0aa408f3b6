// The module's string resources: user-visible texts identified by number.
#pragma once

#include <cstdint>
#include <string>

namespace tio {

// The identifiers of the module's strings.
enum StringId : uint32_t {
    kStrSelectResourceMenu = 2,     // context-menu entry of the select-resource dialog
    kStrHelpContext = 5,            // localized help context when the resource gives none
    kStrExplainErrorMenu = 6,       // context-menu entry of the explain-error dialog
    kStrConflictMessage = 7,        // resource held by another item (both name placeholders)
    kStrMissingMessage = 8,         // resource missing, item not physical
    kStrMissingPhysicalMessage = 9, // resource missing, physical item
    kStrCategoryConflict = 13,
    kStrCategoryMissing = 14,
    kStrCategoryMissingPhysical = 15,
    kStrNoErrorInfo = 16,         // no error information, item not physical
    kStrNoErrorInfoPhysical = 17, // no error information, physical item
    kStrCategoryNone = 18,
    kStrCheckTargetEntry = 30, // the I/O name control's check-target entry
    kStrNoResourcesEntry = 31, // placeholder when a target offers no matching resources
};

// Loads string ID into TEXT; false (TEXT unchanged) when the module has no such string.
bool LoadModuleString(uint32_t id, std::u16string& text);
// String ID, or an empty text when the module has none.
std::u16string ModuleString(uint32_t id);

} // namespace tio
