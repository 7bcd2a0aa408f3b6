// The cache of recent comparison answers: exact pairs of texts, most recent first, within a
// count and a byte budget.
#pragma once

#include <cstddef>
#include <cstdint>
#include <deque>
#include <optional>
#include <string>
#include <string_view>

namespace wbhw {

// Holds at most `capacity` distinct (first, second) pairs with their answers, the most recently
// computed first, and at most `byteBudget` bytes of their texts: inserting one more drops the
// oldest pairs until both limits hold, and a pair larger than the whole budget is not kept at
// all. Keys are the texts as the caller handed them (multibyte) with the name of the code page
// they are read in; they match only when both texts are equal byte for byte and the code page is
// the same (the environment may name another one meanwhile). Each key keeps a hash of its texts,
// compared first, so a lookup costs one hash of the asked pair instead of up to `capacity`
// comparisons of long texts with long common prefixes. Not locked: its owner serialises access.
class CompareCache {
public:
    // A pair of texts, viewed, with its hash.
    struct Probe {
        Probe(std::string_view first, std::string_view second, std::string_view codePage = {});
        // The bytes a key of this pair keeps.
        size_t Bytes() const noexcept { return first.size() + second.size(); }
        std::string_view first;
        std::string_view second;
        std::string_view codePage;
        size_t hash;
    };

    // The texts of a pair, copied, with the probe's hash: what Insert keeps. Made before taking
    // the owner's lock, so that copying long texts does not hold up other callers.
    struct Key {
        explicit Key(const Probe& probe)
            : first(probe.first), second(probe.second), codePage(probe.codePage), hash(probe.hash) {
        }
        size_t Bytes() const noexcept { return first.size() + second.size(); }
        bool operator==(const Key& other) const noexcept {
            return hash == other.hash && first == other.first && second == other.second &&
                   codePage == other.codePage;
        }
        std::string first;
        std::string second;
        std::string codePage;
        size_t hash;
    };

    CompareCache(size_t capacity, size_t byteBudget) : capacity_(capacity), budget_(byteBudget) {}

    // The cached answer for the pair; nothing when it is not cached. The order does not change.
    std::optional<uint32_t> Find(const Probe& probe) const;
    // True when a pair of PROBE's size may be kept at all (it fits the budget on its own).
    bool Admits(const Probe& probe) const noexcept { return probe.Bytes() <= budget_; }
    // Puts KEY at the front with RESULT (an equal pair already kept moves there), then drops the
    // oldest pairs beyond the capacity or the budget. A pair larger than the budget is skipped.
    void Insert(Key key, uint32_t result);
    // Drops every pair.
    void Clear() noexcept {
        entries_.clear();
        bytes_ = 0;
    }
    // The number of cached pairs.
    size_t size() const noexcept { return entries_.size(); }
    // The bytes of text the cached pairs keep.
    size_t bytes() const noexcept { return bytes_; }

private:
    struct Entry {
        Key key;
        uint32_t result;
    };
    static bool Holds(const Key& key, const Probe& probe) noexcept;

    size_t capacity_;
    size_t budget_;
    size_t bytes_ = 0;
    std::deque<Entry> entries_;
};

} // namespace wbhw
