// FPGA host descriptions and whether a node of a target admits a host.
#include "resource_tree/HostDefinition.h"

#include "com/CallGuard.h"
#include "resource_tree/ListText.h"

#include <initializer_list>
#include <optional>
#include <vector>

namespace wbhw {

using qv::host::ResourceNode;

namespace {

// The "FPGAHost" children of the node that the relative paths of STEPS lead to from TREE, one
// after the other; nothing when a step finds no node or a query fails.
std::optional<std::vector<ResourceNode>>
HostsBelow(const ResourceNode& tree, std::initializer_list<std::u16string_view> steps) noexcept {
    std::vector<ResourceNode> hosts;
    const HRESULT listed = qv::com::GuardCall([&] {
        ResourceNode at = tree;
        for (const std::u16string_view step : steps)
            at = at ? at.Find(step) : ResourceNode();
        if (!at)
            return S_FALSE;
        hosts = at.ChildrenOfType(u"FPGAHost");
        return S_OK;
    });
    if (listed != S_OK)
        return std::nullopt;
    return hosts;
}

} // namespace

HRESULT ReadHostDefinition(const ResourceNode& host, HostDefinition& definition) noexcept {
    return qv::com::GuardCall([&] {
        for (const auto& [name, value] : host.Attributes()) {
            auto& values = definition[name];
            for (std::u16string& piece : SplitListText(value, u',', true))
                values.insert(std::move(piece));
        }
        return S_OK;
    });
}

HRESULT FindHostDefinition(const ResourceNode& tree, std::u16string_view guid,
                           HostDefinition& definition) noexcept {
    const auto hosts = HostsBelow(tree, {u"FPGAHostSet"});
    if (!hosts)
        return S_FALSE;
    for (const ResourceNode& host : *hosts) {
        std::optional<std::u16string> id;
        if (const HRESULT hr = qv::com::GuardCall([&] {
                id = host.Attribute(u"GUID");
                return S_OK;
            });
            FAILED(hr))
            return hr;
        if (id && qv::kern::EqualsNoCase(*id, guid))
            return ReadHostDefinition(host, definition);
    }
    return S_FALSE;
}

bool IsHostSupported(const HostDefinition& required, const ResourceNode& tree,
                     std::u16string_view path) noexcept {
    const auto hosts = HostsBelow(tree, {path, u"SupportedFPGAHostList"});
    if (!hosts)
        return true;
    for (const ResourceNode& host : *hosts) {
        HostDefinition offered;
        if (ReadHostDefinition(host, offered) != S_OK)
            return true;
        try {
            if (Satisfies(required, offered))
                return true;
        } catch (...) {
            return true;
        }
    }
    return false;
}

bool Satisfies(const HostDefinition& required, const HostDefinition& offered) {
    for (const auto& [name, values] : offered) {
        const auto wanted = required.find(name);
        if (wanted == required.end() || wanted->second.empty())
            return false;
        if (wanted->second.count(u"All") != 0)
            continue;
        bool shared = false;
        for (const std::u16string& value : values)
            shared = shared || wanted->second.count(value) != 0;
        if (!shared)
            return false;
    }
    return true;
}

} // namespace wbhw
