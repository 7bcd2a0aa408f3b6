// FPGA host descriptions and whether a node of a target admits a host.
#include "resource_tree/HostDefinition.h"

#include "com/CallGuard.h"
#include "resource_tree/ListText.h"

namespace wbhw {

using qv::host::ResourceNode;

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
    std::vector<ResourceNode> hosts;
    const HRESULT listed = qv::com::GuardCall([&] {
        const ResourceNode set = tree ? tree.Find(u"FPGAHostSet") : ResourceNode();
        if (!set)
            return S_FALSE;
        hosts = set.ChildrenOfType(u"FPGAHost");
        return S_OK;
    });
    if (listed != S_OK)
        return S_FALSE;
    for (const ResourceNode& host : hosts) {
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
    std::vector<ResourceNode> hosts;
    const HRESULT listed = qv::com::GuardCall([&] {
        const ResourceNode node = tree ? tree.Find(path) : ResourceNode();
        const ResourceNode list = node ? node.Find(u"SupportedFPGAHostList") : ResourceNode();
        if (!list)
            return S_FALSE;
        hosts = list.ChildrenOfType(u"FPGAHost");
        return S_OK;
    });
    if (listed != S_OK)
        return true;
    for (const ResourceNode& host : hosts) {
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
