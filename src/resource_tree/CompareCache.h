// The cache of recent comparison answers: exact pairs of texts, most recent first.
#pragma once

#include <cstddef>
#include <cstdint>
#include <deque>
#include <optional>
#include <string>

namespace wbhw {

// Holds at most `capacity` distinct (first, second) pairs with their answers, the most recently
// computed first; inserting one more drops the oldest. Keys match only when both texts are equal
// exactly. Each key keeps a hash of its texts, compared first, so a lookup costs one hash of the
// asked pair instead of up to `capacity` comparisons of long texts with long common prefixes.
// Not locked: its owner serialises access.
class CompareCache {
public:
    // A pair of texts with its hash.
    struct Key {
        Key(std::u16string first, std::u16string second);
        std::u16string first;
        std::u16string second;
        size_t hash;
    };

    explicit CompareCache(size_t capacity) : capacity_(capacity) {}

    // The cached answer for KEY; nothing when the pair is not cached. The order does not change.
    std::optional<uint32_t> Find(const Key& key) const;
    // Puts KEY at the front with RESULT, dropping the oldest pair beyond the capacity.
    void Insert(Key key, uint32_t result);
    // Drops every pair.
    void Clear() noexcept { entries_.clear(); }
    // The number of cached pairs.
    size_t size() const noexcept { return entries_.size(); }

private:
    struct Entry {
        Key key;
        uint32_t result;
    };
    size_t capacity_;
    std::deque<Entry> entries_;
};

} // namespace wbhw
