// The attributes of one XML element, keyed by name without regard to case.
#include "resource_tree/XmlAttributes.h"

#include "kern/Collate.h"

#include <algorithm>

namespace wbhw {
namespace {

// First entry whose name is not less than NAME.
template <class It> It LowerBound(It first, It last, std::u16string_view name) {
    return std::lower_bound(first, last, name, [](const auto& entry, std::u16string_view key) {
        return qv::kern::CompareNoCase(entry.first, key) < 0;
    });
}

} // namespace

bool XmlAttributes::Insert(std::u16string name, std::u16string value) {
    const auto at = LowerBound(entries_.begin(), entries_.end(), name);
    if (at != entries_.end() && qv::kern::EqualsNoCase(at->first, name))
        return false;
    entries_.emplace(at, std::move(name), std::move(value));
    return true;
}

const std::u16string* XmlAttributes::Find(std::u16string_view name) const noexcept {
    const auto at = LowerBound(entries_.begin(), entries_.end(), name);
    if (at == entries_.end() || !qv::kern::EqualsNoCase(at->first, name))
        return nullptr;
    return &at->second;
}

std::u16string_view XmlAttributes::Get(std::u16string_view name) const noexcept {
    const std::u16string* value = Find(name);
    return value != nullptr ? std::u16string_view(*value) : std::u16string_view();
}

void XmlAttributes::Erase(std::u16string_view name) noexcept {
    const auto at = LowerBound(entries_.begin(), entries_.end(), name);
    if (at != entries_.end() && qv::kern::EqualsNoCase(at->first, name))
        entries_.erase(at);
}

} // namespace wbhw
