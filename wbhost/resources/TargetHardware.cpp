// The hardware object of a target.
#include "resources/TargetHardware.h"

#include "com/TaskMem.h"
#include "kern/Collate.h"
#include "resource_tree/ListText.h"
#include "resources/HostResourceNode.h"

#include <algorithm>
#include <new>

namespace wbhost::resources {
namespace {

bool Contains(const std::vector<std::u16string>& list, std::u16string_view wanted) {
    return std::any_of(list.begin(), list.end(),
                       [&](const std::u16string& p) { return qv::kern::EqualsNoCase(p, wanted); });
}

void CollectFitting(wbhw::ResTreeNode& node, std::u16string_view ioInterface,
                    const ProtocolFilter& filter, std::vector<std::u16string>& paths) {
    const wbhw::WString* fits = node.TextAt(u"IOInterface");
    const bool interfaceFits =
        ioInterface.empty() || (fits != nullptr && qv::kern::EqualsNoCase(*fits, ioInterface));
    const auto protocols = SupportedProtocols(node);
    if (interfaceFits && !protocols.empty() && filter.Passes(protocols))
        paths.push_back(node.Path());
    for (auto entry = node.Begin(); entry != node.End(); ++entry) {
        if (entry->Child() != nullptr)
            CollectFitting(*entry->Child(), ioInterface, filter, paths);
    }
}

} // namespace

ProtocolFilter ProtocolFilter::Parse(std::u16string_view text) {
    ProtocolFilter filter;
    std::vector<std::u16string>* current = nullptr;
    for (const std::u16string& piece : wbhw::SplitListText(text, u',', true)) {
        std::u16string_view value = piece;
        const size_t equals = piece.find(u'=');
        if (equals != std::u16string::npos) {
            const std::u16string_view key = wbhw::TrimBlanks(value.substr(0, equals));
            current = qv::kern::EqualsNoCase(key, u"include_protocols")   ? &filter.include
                      : qv::kern::EqualsNoCase(key, u"exclude_protocols") ? &filter.exclude
                                                                          : nullptr;
            value = wbhw::TrimBlanks(value.substr(equals + 1));
        }
        if (current != nullptr && !value.empty())
            current->emplace_back(value);
    }
    return filter;
}

bool ProtocolFilter::Passes(const std::vector<std::u16string>& supported) const {
    for (const auto& p : include) {
        if (!Contains(supported, p))
            return false;
    }
    for (const auto& p : exclude) {
        if (Contains(supported, p))
            return false;
    }
    return true;
}

HRESULT TargetHardware::ListResourceNames(const char16_t* ioInterface,
                                          const char16_t* protocolFilter, BSTR** names,
                                          uint32_t* count) {
    if (names == nullptr || count == nullptr)
        return E_POINTER;
    *names = nullptr;
    *count = 0;
    try {
        const ProtocolFilter filter = ProtocolFilter::Parse(
            protocolFilter != nullptr ? std::u16string_view(protocolFilter) : u"");
        std::vector<std::u16string> paths;
        {
            const std::lock_guard guard(tree_->Mutex());
            CollectFitting(tree_->Root(),
                           ioInterface != nullptr ? std::u16string_view(ioInterface) : u"", filter,
                           paths);
        }
        std::vector<qv::com::UniqueBstr> texts;
        for (const auto& path : paths) {
            texts.emplace_back(qv::com::AllocBstr(path));
            if (!texts.back())
                return E_OUTOFMEMORY;
        }
        std::vector<BSTR> raw;
        for (const auto& t : texts)
            raw.push_back(t.get());
        const HRESULT hr = qv::com::CopyToTaskMem(raw, names, count);
        if (SUCCEEDED(hr)) {
            for (auto& t : texts)
                (void)t.release(); // the caller's array owns them now
        }
        return hr;
    } catch (const std::bad_alloc&) {
        return E_OUTOFMEMORY;
    } catch (...) {
        return E_FAIL;
    }
}

HRESULT TargetHardware::GetResourceTreeRoot(IwbhwResourceTreeNode** root) {
    if (root == nullptr)
        return E_POINTER;
    return tree_->NodeObject(&tree_->Root(), root);
}

} // namespace wbhost::resources
