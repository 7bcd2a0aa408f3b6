// The fixed registry of node types and their bases, which decides what counts as a list type.
#include "resource_tree/TypeRegistry.h"

#include "kern/Collate.h"

#include <array>

namespace wbhw {
namespace {

struct TypeDefinition {
    std::u16string_view name;
    std::array<std::u16string_view, 2> bases; // empty: none
};

// Every root used to own a copy of this table; it never changes, so one shared table answers
// the same questions without building a map for every tree.
constexpr std::array<TypeDefinition, 6> kTypes{{
    {u"Resource", {}},
    {u"IOResource", {u"Resource", {}}},
    {u"ResourceList", {}},
    {u"Target", {u"ResourceList", {}}},
    {u"Connector", {u"ResourceList", {}}},
    {u"Module", {u"Resource", u"ResourceList"}},
}};

const TypeDefinition* FindType(std::u16string_view name) noexcept {
    for (const TypeDefinition& type : kTypes) {
        if (qv::kern::EqualsNoCase(type.name, name))
            return &type;
    }
    return nullptr;
}

bool DefinitionIsList(const TypeDefinition& type, int depth) noexcept {
    if (EndsWithNoCase(type.name, u"List"))
        return true;
    if (depth > static_cast<int>(kTypes.size()))
        return false;
    for (const std::u16string_view base : type.bases) {
        if (base.empty())
            continue;
        const TypeDefinition* definition = FindType(base);
        if (definition != nullptr && DefinitionIsList(*definition, depth + 1))
            return true;
    }
    return false;
}

} // namespace

bool EndsWithNoCase(std::u16string_view text, std::u16string_view suffix) noexcept {
    return text.size() >= suffix.size() &&
           qv::kern::EqualsNoCase(text.substr(text.size() - suffix.size()), suffix);
}

bool IsListType(std::u16string_view type) noexcept {
    const TypeDefinition* definition = FindType(type);
    if (definition != nullptr)
        return DefinitionIsList(*definition, 0);
    return EndsWithNoCase(type, u"List");
}

} // namespace wbhw
