// The cache of recent comparison answers.
#include "resource_tree/CompareCache.h"

#include <functional>
#include <string_view>

namespace wbhw {

CompareCache::Key::Key(std::u16string a, std::u16string b)
    : first(std::move(a)), second(std::move(b)) {
    const size_t h1 = std::hash<std::u16string_view>{}(first);
    const size_t h2 = std::hash<std::u16string_view>{}(second);
    hash = h1 ^ (h2 + 0x9E3779B97F4A7C15ull + (h1 << 6) + (h1 >> 2));
}

std::optional<uint32_t> CompareCache::Find(const Key& key) const {
    for (const Entry& entry : entries_) {
        if (entry.key.hash == key.hash && entry.key.first == key.first &&
            entry.key.second == key.second)
            return entry.result;
    }
    return std::nullopt;
}

void CompareCache::Insert(Key key, uint32_t result) {
    entries_.push_front(Entry{std::move(key), result});
    while (entries_.size() > capacity_)
        entries_.pop_back();
}

} // namespace wbhw
