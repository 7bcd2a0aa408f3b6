// Items found by their place below a target.
#include "cli/ItemPlace.h"

#include "cli/NewItemChecks.h"
#include "kern/Collate.h"

namespace wbhost::cli {

project::ProjectItem* ChildNamed(const project::ProjectItem& parent, std::u16string_view name) {
    for (const auto& child : parent.Children()) {
        if (qv::kern::EqualsNoCase(child->Name(), name))
            return child.Get();
    }
    return nullptr;
}

project::ProjectItem* ItemAt(project::ProjectItem& target, std::u16string_view place) {
    const std::vector<std::u16string> parts = PlaceParts(place);
    project::ProjectItem* item = parts.empty() ? nullptr : &target;
    for (const std::u16string& part : parts) {
        item = ChildNamed(*item, part);
        if (item == nullptr)
            return nullptr;
    }
    return item;
}

} // namespace wbhost::cli
