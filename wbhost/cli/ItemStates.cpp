// What the Tangent I/O items of a target report of themselves.
#include "cli/ItemStates.h"

#include "cli/AttributeSet.h"
#include "cli/HostText.h"
#include "com/Bstr.h"
#include "com/ComPtr.h"
#include "framework/IwbCompileConfiguration.h"
#include "items/TIOItemInterfaces.h"
#include "kern/Collate.h"
#include "provider/TIOIdentifiers.h"

#include <ostream>

namespace wbhost::cli {
namespace {

using project::Property;

// The property NAME of BAG when it holds KIND; null otherwise.
const Property* Find(const project::PropertyBag& bag, std::u16string_view name,
                     Property::Kind kind) {
    const auto found = bag.Properties().find(std::u16string(name));
    return found != bag.Properties().end() && found->second.kind == kind ? &found->second : nullptr;
}

// The "resource" attribute of the item's stored attribute set; empty when it has none.
std::u16string StoredResource(const project::PropertyBag& bag) {
    const Property* text = Find(bag, u"tioAttrBag", Property::Kind::String);
    const auto attributes = text != nullptr ? ReadAttributeSet(text->text) : std::nullopt;
    if (!attributes)
        return {};
    for (const auto& [name, value] : *attributes) {
        if (qv::kern::EqualsNoCase(name, u"resource"))
            return value;
    }
    return {};
}

// A text the item's object hands out through GET (a new BSTR); empty when it does not answer.
template <class Get> std::optional<std::u16string> AskText(Get&& get) {
    BSTR text = nullptr;
    if (FAILED(get(&text)))
        return std::nullopt;
    const qv::com::UniqueBstr owned(text);
    return qv::com::BstrToString(text);
}

// Overwrites what the saved properties said with what the item's object reports, where it does.
void AskObject(IUnknown* object, ItemState& state) {
    if (const auto item = qv::com::QueryAs<IwbTIOInstanceItemUI>(object)) {
        int32_t status = 1;
        if (SUCCEEDED(item->GetResourceStatus(&status)))
            state.status = status;
    }
    if (const auto resource = qv::com::QueryAs<IwbhwResourceItemUI>(object)) {
        if (auto path = AskText([&](BSTR* text) { return resource->GetResourcePath(text); }))
            state.resource = std::move(*path);
    }
    if (const auto error = qv::com::QueryAs<IwbTIOItemError>(object)) {
        if (auto text = AskText([&](BSTR* text) { return error->GetErrorText(text); }))
            state.error = std::move(*text);
    }
    if (const auto compile = qv::com::QueryAs<IwbCompileConfiguration>(object)) {
        state.compileConfiguration =
            AskText([&](BSTR* text) { return compile->GetCompileConfiguration(text); });
    }
}

ItemState StateOf(const project::ProjectItem& item, std::u16string path) {
    ItemState state;
    state.item = &item;
    state.path = std::move(path);
    const project::PropertyBag& bag = item.Bag();
    state.resource = StoredResource(bag);
    if (const Property* status = Find(bag, u"tioResourceStatus", Property::Kind::Int))
        state.status = status->number;
    state.hidden = (item.Flags() & wbproj::kShownFlag) == 0;
    if (const Property* version = Find(bag, u"tioFeatureSetVersion", Property::Kind::Int))
        state.featureSetVersion = version->number;
    if (const Property* physical = Find(bag, u"QV.WB.TIO.Physical", Property::Kind::Bool))
        state.physical = physical->number != 0;
    AskObject(item.Object(), state);
    return state;
}

void Collect(const project::ProjectItem& parent, const std::u16string& prefix,
             std::vector<ItemState>& states) {
    for (const auto& child : parent.Children()) {
        const std::u16string path = prefix + child->Name();
        if (IsEqualGUID(child->Type(), tio::kIOItemType))
            states.push_back(StateOf(*child.Get(), path));
        Collect(*child.Get(), path + u"/", states);
    }
}

} // namespace

std::vector<ItemState> CollectItemStates(const project::ProjectItem& target) {
    std::vector<ItemState> states;
    Collect(target, {}, states);
    return states;
}

std::string_view StatusWord(int32_t status) {
    switch (status) {
    case 0:
        return "bound";
    case 1:
        return "missing";
    case 2:
        return "conflict";
    default:
        return {};
    }
}

void PrintItemStates(const project::ProjectItem& target, std::ostream& out) {
    for (const ItemState& state : CollectItemStates(target)) {
        out << "  " << ToUtf8(state.path) << ": ";
        if (!state.status)
            out << "status not reported";
        else if (const std::string_view word = StatusWord(*state.status); !word.empty())
            out << word;
        else
            out << "status " << *state.status;
        out << ", resource \"" << ToUtf8(state.resource) << "\", feature set "
            << state.featureSetVersion << (state.hidden ? ", hidden" : "") << "\n";
    }
}

} // namespace wbhost::cli
