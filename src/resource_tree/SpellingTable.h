// A small table from the spellings of tags and attribute names to what the loader made of them.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace wbhw {

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
        for (size_t i = Hash(text) & Mask();; i = (i + 1) & Mask()) {
            const Slot& slot = slots_[i];
            if (!slot.used)
                return nullptr;
            if (slot.key == text)
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

    static size_t Hash(std::u16string_view text) noexcept {
        uint64_t hash = 0xcbf29ce484222325ull; // FNV-1a
        for (const char16_t unit : text)
            hash = (hash ^ unit) * 0x100000001b3ull;
        return static_cast<size_t>(hash ^ (hash >> 29));
    }
    size_t Mask() const noexcept { return slots_.size() - 1; }
    const Value& Place(std::u16string key, const Value& value) {
        size_t i = Hash(key) & Mask();
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
