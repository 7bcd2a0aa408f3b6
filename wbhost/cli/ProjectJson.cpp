// The project as `wbhost project list --json` prints it.
#include "cli/ProjectJson.h"

#include "cli/HostText.h"
#include "cli/ItemStates.h"
#include "kern/GuidText.h"

#include <nlohmann/json.hpp>
#include <ostream>

namespace wbhost::cli {
namespace {

using nlohmann::json;

json ItemJson(const ItemState& state) {
    json item = {{"path", ToUtf8(state.path)},
                 {"id", qv::kern::GuidToNarrowString(state.item->Id())},
                 {"resource", ToUtf8(state.resource)},
                 {"status", nullptr},
                 {"statusText", "not reported"},
                 {"hidden", state.hidden},
                 {"featureSetVersion", state.featureSetVersion},
                 {"error", ToUtf8(state.error)},
                 {"physical", state.physical}};
    if (state.compileConfiguration)
        item["compileConfiguration"] = ToUtf8(*state.compileConfiguration);
    if (state.status) {
        const std::string_view word = StatusWord(*state.status);
        item["status"] = *state.status;
        item["statusText"] =
            word.empty() ? "status " + std::to_string(*state.status) : std::string(word);
    }
    return item;
}

json TargetJson(const project::ProjectItem& target) {
    json items = json::array();
    for (const ItemState& state : CollectItemStates(target))
        items.push_back(ItemJson(state));
    return {{"name", ToUtf8(target.Name())},
            {"id", qv::kern::GuidToNarrowString(target.Id())},
            {"description", target.DescriptionFile()},
            {"items", std::move(items)}};
}

} // namespace

void WriteProjectJson(project::Project& project, std::ostream& out) {
    json targets = json::array();
    for (const auto& target : project.Targets())
        targets.push_back(TargetJson(*target.Get()));
    const json document = {{"project", ToUtf8(project.Root().Name())},
                           {"targets", std::move(targets)}};
    // Names come from files and users; a byte that is not UTF-8 must not abort the listing.
    out << document.dump(2, ' ', false, json::error_handler_t::replace) << "\n";
}

} // namespace wbhost::cli
