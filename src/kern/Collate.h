// The locale-aware, case-insensitive comparison that every name lookup and every map keyed by
// names uses.
#pragma once

#include <string_view>

namespace qv::kern {

// Compares two UTF-16 texts in the user's default locale ignoring case (accents and punctuation
// still count). Answers -1, 0 or 1; 0 when the collation service fails. Thread-safe.
int CompareNoCase(std::u16string_view a, std::u16string_view b) noexcept;

// True when the two texts are equal ignoring case.
inline bool EqualsNoCase(std::u16string_view a, std::u16string_view b) noexcept {
    return CompareNoCase(a, b) == 0;
}

// Strict weak order for maps and sorted containers keyed by names.
struct LessNoCase {
    using is_transparent = void;
    bool operator()(std::u16string_view a, std::u16string_view b) const noexcept {
        return CompareNoCase(a, b) < 0;
    }
};

} // namespace qv::kern
