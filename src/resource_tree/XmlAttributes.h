// The attributes of one XML element, keyed by name without regard to case.
#pragma once

#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace wbhw {

// A small sorted map from attribute name to value. Elements carry few attributes, so a sorted
// vector beats a node-based map; names that differ only in case are one key (the first wins,
// as in a map that is filled in document order).
class XmlAttributes {
public:
    using Entry = std::pair<std::u16string, std::u16string>;
    using const_iterator = std::vector<Entry>::const_iterator;

    // Adds NAME=VALUE unless NAME is already present (ignoring case); answers whether it was added.
    bool Insert(std::u16string name, std::u16string value);
    // The value of NAME (ignoring case), or null when absent.
    const std::u16string* Find(std::u16string_view name) const noexcept;
    // The value of NAME, or the empty text when absent.
    std::u16string_view Get(std::u16string_view name) const noexcept;
    bool Contains(std::u16string_view name) const noexcept { return Find(name) != nullptr; }
    // Removes NAME if present.
    void Erase(std::u16string_view name) noexcept;

    bool empty() const noexcept { return entries_.empty(); }
    size_t size() const noexcept { return entries_.size(); }
    void clear() noexcept { entries_.clear(); }
    // Iteration runs in case-insensitive name order.
    const_iterator begin() const noexcept { return entries_.begin(); }
    const_iterator end() const noexcept { return entries_.end(); }

private:
    std::vector<Entry> entries_;
};

} // namespace wbhw
