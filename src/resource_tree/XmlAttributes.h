// The attributes of one XML element, keyed by name without regard to case.
#pragma once

#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace wbhw {

// A small sorted map from attribute name to value. Elements carry few attributes, so a sorted
// vector beats a node-based map; names that differ only in case are one key (the first wins,
// as in a map that is filled in document order). Clearing keeps the entries' strings for reuse:
// a loader fills one set per element, and reusing their buffers spares an allocation per
// attribute name and value.
class XmlAttributes {
public:
    using Entry = std::pair<std::u16string, std::u16string>;
    using const_iterator = std::vector<Entry>::const_iterator;

    // Adds NAME=VALUE unless NAME is already present (ignoring case); answers whether it was added.
    bool Insert(std::u16string name, std::u16string value);
    // The same for a name and value in UTF-8 (as Expat delivers them, well formed), converted
    // straight into reused storage.
    bool InsertUtf8(std::string_view name, std::string_view value);
    // The value of NAME (ignoring case), or null when absent.
    const std::u16string* Find(std::u16string_view name) const noexcept;
    // The value of NAME, or the empty text when absent.
    std::u16string_view Get(std::u16string_view name) const noexcept;
    bool Contains(std::u16string_view name) const noexcept { return Find(name) != nullptr; }
    // Removes NAME if present.
    void Erase(std::u16string_view name) noexcept;

    bool empty() const noexcept { return used_ == 0; }
    size_t size() const noexcept { return used_; }
    // Removes every attribute (their buffers stay for the next ones).
    void clear() noexcept { used_ = 0; }
    // Iteration runs in case-insensitive name order.
    const_iterator begin() const noexcept { return entries_.begin(); }
    const_iterator end() const noexcept {
        return entries_.begin() + static_cast<std::ptrdiff_t>(used_);
    }

private:
    // A free entry past the used ones, made when there is none.
    Entry& Spare();
    // Moves the spare entry (just filled) into its sorted place, unless its name is taken.
    bool PlaceSpare();

    std::vector<Entry> entries_; // the first used_ are the attributes, the rest spare buffers
    size_t used_ = 0;
};

} // namespace wbhw
