// The attributes of one XML element, keyed by name without regard to case.
#include "resource_tree/XmlAttributes.h"

#include "kern/Collate.h"
#include "resource_tree/ExPatHandler.h"

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

XmlAttributes::Entry& XmlAttributes::Spare() {
    if (entries_.size() == used_)
        entries_.emplace_back();
    return entries_[used_];
}

bool XmlAttributes::PlaceSpare() {
    const auto first = entries_.begin();
    const auto last = first + static_cast<std::ptrdiff_t>(used_);
    const auto at = LowerBound(first, last, last->first);
    if (at != last && qv::kern::EqualsNoCase(at->first, last->first))
        return false;
    // Swapping strings moves no characters.
    std::rotate(at, last, last + 1);
    ++used_;
    return true;
}

bool XmlAttributes::Insert(std::u16string name, std::u16string value) {
    Entry& spare = Spare();
    spare.first = std::move(name);
    spare.second = std::move(value);
    return PlaceSpare();
}

bool XmlAttributes::InsertUtf8(std::string_view name, std::string_view value) {
    Entry& spare = Spare();
    spare.first.clear();
    AppendUtf8AsUtf16(name, spare.first);
    spare.second.clear();
    AppendUtf8AsUtf16(value, spare.second);
    return PlaceSpare();
}

const std::u16string* XmlAttributes::Find(std::u16string_view name) const noexcept {
    const auto at = LowerBound(begin(), end(), name);
    if (at == end() || !qv::kern::EqualsNoCase(at->first, name))
        return nullptr;
    return &at->second;
}

std::u16string_view XmlAttributes::Get(std::u16string_view name) const noexcept {
    const std::u16string* value = Find(name);
    return value != nullptr ? std::u16string_view(*value) : std::u16string_view();
}

void XmlAttributes::Erase(std::u16string_view name) noexcept {
    const auto first = entries_.begin();
    const auto last = first + static_cast<std::ptrdiff_t>(used_);
    const auto at = LowerBound(first, last, name);
    if (at == last || !qv::kern::EqualsNoCase(at->first, name))
        return;
    // The erased entry becomes the first spare one.
    std::rotate(at, at + 1, last);
    --used_;
}

} // namespace wbhw
