// The string table, compiled in. Messages 7, 8 and 9 carry the name placeholders that error
// information replaces with the item names.
#include "items/TIOStrings.h"

#include <algorithm>
#include <array>
#include <string_view>

namespace tio {

namespace {

struct Entry {
    uint32_t id;
    std::u16string_view text;
};

// Sorted by identifier.
constexpr std::array kStrings{
    Entry{kStrSelectResourceMenu, u"Select Resource..."},
    Entry{kStrHelpContext, u"Tangent I/O"},
    Entry{kStrExplainErrorMenu, u"Explain Error..."},
    Entry{kStrConflictMessage,
          u"The I/O item \"<SelfProjectItemName>\" uses the same resource as the I/O item "
          u"\"<OffendingProjectItemName>\". Give one of the two items another resource."},
    Entry{kStrMissingMessage,
          u"The resource of the I/O item \"<SelfProjectItemName>\" does not exist on this "
          u"target. Select one of the resources the target offers."},
    Entry{kStrMissingPhysicalMessage,
          u"The physical I/O item \"<SelfProjectItemName>\" stands for a resource that this "
          u"target does not offer. Remove the item or move it to a target that offers it."},
    Entry{kStrCategoryConflict, u"Resource conflict"},
    Entry{kStrCategoryMissing, u"Missing resource"},
    Entry{kStrCategoryMissingPhysical, u"Missing physical resource"},
    Entry{kStrNoErrorInfo, u"No error information is available for this I/O item."},
    Entry{kStrNoErrorInfoPhysical,
          u"No error information is available for this physical I/O item."},
    Entry{kStrCategoryNone, u"No error"},
    Entry{kStrCheckTargetEntry, u"FPGA I/O resources of this target"},
    Entry{kStrNoResourcesEntry, u"<No matching I/O resources>"},
};

static_assert(std::is_sorted(kStrings.begin(), kStrings.end(),
                             [](const Entry& a, const Entry& b) { return a.id < b.id; }),
              "the table is searched by identifier");

} // namespace

bool LoadModuleString(uint32_t id, std::u16string& text) {
    const auto found = std::lower_bound(kStrings.begin(), kStrings.end(), id,
                                        [](const Entry& e, uint32_t key) { return e.id < key; });
    if (found == kStrings.end() || found->id != id) {
        return false;
    }
    text.assign(found->text);
    return true;
}

std::u16string ModuleString(uint32_t id) {
    std::u16string text;
    LoadModuleString(id, text);
    return text;
}

} // namespace tio
