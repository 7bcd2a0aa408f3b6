// A small table from the spellings of tags and attribute names to what the loader made of them.
#pragma once

#include <cstdint>
#include <cstring>
#include <string>
#include <string_view>
#include <vector>

namespace wbhw {

// The length and the first and last four units tell a document's spellings apart well enough;
// hashing every unit costs more than the rare extra probe. The units are read as two words and
// mixed with a few multiplications: a lookup runs for every element and attribute of a load and
// every entry of a comparison. (Numbered names such as "DIO17" share their head, so the mix must
// carry the tail's bits down to the low ones that pick the slot.)
inline size_t HashSpelling(std::u16string_view text) noexcept {
    const size_t n = text.size();
    uint64_t head = 0;
    uint64_t tail = 0;
    if (n >= 4) {
        std::memcpy(&head, text.data(), sizeof head);
        std::memcpy(&tail, text.data() + n - 4, sizeof tail);
    } else {
        for (size_t i = 0; i < n; ++i)
            head = (head << 16) | text[i];
    }
    uint64_t hash = head * 0x9e3779b97f4a7c15ull ^ (tail + n) * 0xc2b2ae3d27d4eb4full;
    hash = (hash ^ (hash >> 29)) * 0xbf58476d1ce4e5b9ull;
    return static_cast<size_t>(hash ^ (hash >> 32));
}

// Spellings are a few units long: a plain loop beats a call of memcmp.
inline bool SameSpelling(std::u16string_view key, std::u16string_view text) noexcept {
    if (key.size() != text.size())
        return false;
    for (size_t i = 0; i < text.size(); ++i) {
        if (key[i] != text[i])
            return false;
    }
    return true;
}

// What the loader made of each spelling of a tag or an attribute name. A document repeats a
// handful of short spellings thousands of times, so this is an open-addressed table with a cheap
// hash: the standard map's hash is built for long keys and its prime-sized buckets divide on every
// lookup, which together cost more than the work they save.
template <class Value> class SpellingTable {
public:
    // The value kept for TEXT; null when the spelling was not seen yet.
    const Value* Find(std::u16string_view text) const noexcept {
        if (slots_.empty())
            return nullptr;
        for (size_t i = HashSpelling(text) & Mask();; i = (i + 1) & Mask()) {
            const Slot& slot = slots_[i];
            if (!slot.used)
                return nullptr;
            if (SameSpelling(slot.key, text))
                return &slot.value;
        }
    }
    // Keeps VALUE for TEXT (not present yet) and answers the kept value.
    const Value& Add(std::u16string_view text, const Value& value) {
        if (2 * (count_ + 1) > slots_.size())
            Grow();
        ++count_;
        return Place(std::u16string(text), value);
    }

private:
    struct Slot {
        std::u16string key;
        Value value{};
        bool used = false;
    };

    size_t Mask() const noexcept { return slots_.size() - 1; }
    const Value& Place(std::u16string key, const Value& value) {
        size_t i = HashSpelling(key) & Mask();
        while (slots_[i].used)
            i = (i + 1) & Mask();
        slots_[i] = Slot{std::move(key), value, true};
        return slots_[i].value;
    }
    void Grow() {
        std::vector<Slot> old(slots_.empty() ? 32 : 2 * slots_.size());
        old.swap(slots_);
        for (Slot& slot : old) {
            if (slot.used)
                Place(std::move(slot.key), slot.value);
        }
    }

    std::vector<Slot> slots_; // a power of two in size, at most half used
    size_t count_ = 0;
};

} // namespace wbhw
