// The cache of recent comparison answers.
#include "resource_tree/CompareCache.h"

#include <algorithm>
#include <functional>

namespace wbhw {

CompareCache::Probe::Probe(std::string_view a, std::string_view b, std::string_view page)
    : first(a), second(b), codePage(page) {
    const auto mix = [](size_t h, std::string_view text) {
        return h ^
               (std::hash<std::string_view>{}(text) + 0x9E3779B97F4A7C15ull + (h << 6) + (h >> 2));
    };
    hash = mix(mix(std::hash<std::string_view>{}(first), second), codePage);
}

bool CompareCache::Holds(const Key& key, const Probe& probe) noexcept {
    return key.hash == probe.hash && key.first == probe.first && key.second == probe.second &&
           key.codePage == probe.codePage;
}

std::optional<uint32_t> CompareCache::Find(const Probe& probe) const {
    for (const Entry& entry : entries_) {
        if (Holds(entry.key, probe))
            return entry.result;
    }
    return std::nullopt;
}

void CompareCache::Insert(Key key, uint32_t result) {
    if (key.Bytes() > budget_)
        return;
    // Two callers may compute the same pair at once; the pair is kept once, as the newest.
    const auto same = std::find_if(entries_.begin(), entries_.end(),
                                   [&key](const Entry& entry) { return entry.key == key; });
    if (same != entries_.end()) {
        bytes_ -= same->key.Bytes();
        entries_.erase(same);
    }
    bytes_ += key.Bytes();
    entries_.push_front(Entry{std::move(key), result});
    while (entries_.size() > capacity_ || bytes_ > budget_) {
        bytes_ -= entries_.back().key.Bytes();
        entries_.pop_back();
    }
}

} // namespace wbhw
