// The locale-aware, case-insensitive comparison that every name lookup and every map keyed by
// names uses.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string_view>

namespace qv::kern {

// Compares two UTF-16 texts in the user's default locale ignoring case (accents and punctuation
// still count). Answers -1, 0 or 1; 0 when the collation service fails. Thread-safe.
int CompareNoCase(std::u16string_view a, std::u16string_view b) noexcept;

// True when the two texts are equal ignoring case.
inline bool EqualsNoCase(std::u16string_view a, std::u16string_view b) noexcept {
    return CompareNoCase(a, b) == 0;
}

// NAME's order key under the same collation (NameCollator::OrderKey); 0 when it has none.
uint64_t NameOrderKey(std::u16string_view name) noexcept;

// How many leading units of a name its order key holds. The key's lowest seven bits are always
// zero, free for whoever keeps the key to pack something of its own beside it.
constexpr size_t kOrderKeyUnits = 8;
constexpr uint64_t kOrderKeyFreeBits = 0x7F;

// What two order keys tell of names of lengths SIZEA and SIZEB: -1, 0 or 1, or 2 when only the
// names can tell (a key missing, or equal keys of which one may hold only part of its name).
inline int CompareOrderKeys(size_t sizeA, uint64_t keyA, size_t sizeB, uint64_t keyB) noexcept {
    if (((keyA & keyB) >> 63) == 0)
        return 2;
    if (keyA != keyB)
        return keyA < keyB ? -1 : 1;
    return sizeA <= kOrderKeyUnits && sizeB <= kOrderKeyUnits ? 0 : 2;
}

// CompareNoCase for two names and their order keys (from NameOrderKey): most pairs are told
// apart by the keys, without reading the names.
inline int CompareNoCaseKeyed(std::u16string_view a, uint64_t keyA, std::u16string_view b,
                              uint64_t keyB) noexcept {
    const int byKeys = CompareOrderKeys(a.size(), keyA, b.size(), keyB);
    if (byKeys != 2)
        return byKeys;
    // The same spelling is equal in every collation: paired names mostly are.
    return a == b ? 0 : CompareNoCase(a, b);
}

// Strict weak order for maps and sorted containers keyed by names.
struct LessNoCase {
    using is_transparent = void;
    bool operator()(std::u16string_view a, std::u16string_view b) const noexcept {
        return CompareNoCase(a, b) < 0;
    }
};

} // namespace qv::kern
