// `wbhost item ... properties [--set NAME=VALUE]`: the item's properties dialog. Its program
// answers from the session; --set answers it as a user who changes one attribute and confirms.
#include "cli/HostText.h"
#include "cli/item/ItemRequests.h"
#include "framework/IqxProjectItemUI.h"
#include "resource_tree/XmlEscape.h"

#include <ostream>

namespace wbhost::cli {
namespace {

void AppendEscaped(std::u16string_view text, std::u16string& out) {
    for (const char16_t c : text)
        wbhw::AppendXmlEscaped(c, false, out);
}

// One attribute as the properties program hands it back: a cluster of two strings.
std::u16string AttributeCluster(std::u16string_view name, std::u16string_view value) {
    std::u16string out =
        u"<Cluster><Name></Name><NumElts>2</NumElts><String><Name>name</Name><Val>";
    AppendEscaped(name, out);
    out += u"</Val></String><String><Name>value</Name><Val>";
    AppendEscaped(value, out);
    out += u"</Val></String></Cluster>";
    return out;
}

ItemOutcome Properties(ItemActionContext& context) {
    if (const auto set = context.options.find("--set"); set != context.options.end()) {
        const size_t equals = set->second.find('=');
        if (equals == std::string::npos || equals == 0) {
            context.err << "wbhost: --set takes NAME=VALUE\n";
            return ItemOutcome::Refused;
        }
        const std::u16string name = FromUtf8(set->second.substr(0, equals));
        const std::u16string value = FromUtf8(set->second.substr(equals + 1));
        auto& programs = context.session.Programs();
        programs.SetAnswer("properties", 0, 0);
        programs.SetAnswer("properties", 1,
                           std::vector<std::u16string>{AttributeCluster(name, value)});
    }
    const auto object = ItemObjectAs<IqxProjectItemUI>(context, "show properties");
    if (!object)
        return ItemOutcome::Refused;
    const std::string before = SavedForm(context.project);
    if (const HRESULT hr = object->ShowProperties(); FAILED(hr))
        return RefuseWithStatus(context, "the properties dialog", hr);
    const bool changed = SavedForm(context.project) != before;
    context.out << "properties of \"" << ToUtf8(context.item.Name())
                << "\": " << (changed ? "applied" : "nothing changed") << "\n";
    return changed ? ItemOutcome::Changed : ItemOutcome::Unchanged;
}

const ItemActionRegistrar kProperties(
    {"properties",
     "",
     "show the item's properties dialog (answered from the session)",
     0,
     0,
     {{"--set", "NAME=VALUE", "answer the dialog: change attribute NAME to VALUE and confirm"}},
     Properties});

} // namespace
} // namespace wbhost::cli
