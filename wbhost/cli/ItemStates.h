// What the Tangent I/O items of a target report of themselves, asked of their objects (the
// module's items) where they answer and read from their saved properties otherwise: the state
// that `project list --json` and every `edit` show.
#pragma once

#include "project/ProjectItem.h"

#include <cstdint>
#include <iosfwd>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace wbhost::cli {

struct ItemState {
    const project::ProjectItem* item = nullptr;
    std::u16string path;     // the folders below the target and the item's name, joined by "/"
    std::u16string resource; // the resource path the item keeps; empty when it has none
    // 0 bound, 1 missing, 2 conflict; empty while the item has not reported one.
    std::optional<int32_t> status;
    bool hidden = false;           // the item's shown flag is clear
    int32_t featureSetVersion = 0; // how often its resource's signatures changed
    // What code built against the item depends on; empty when the item has no object that
    // tells it.
    std::optional<std::u16string> compileConfiguration;
    // Why the item is in error, as its object explains it; empty when it is not (or has no
    // object to ask).
    std::u16string error;
    // The item stands for a physical resource ("QV.WB.TIO.Physical").
    bool physical = false;
};

// The Tangent I/O items anywhere below TARGET, in tree order.
std::vector<ItemState> CollectItemStates(const project::ProjectItem& target);

// The word for a resource status in the JSON listing: "bound", "missing", "conflict"; empty
// for other numbers.
std::string_view StatusWord(int32_t status);

// One line per Tangent I/O item below TARGET: its path, status, resource, feature-set version
// and "hidden" when it is not shown.
void PrintItemStates(const project::ProjectItem& target, std::ostream& out);

} // namespace wbhost::cli
