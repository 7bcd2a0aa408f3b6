// What decided a comparison of resource descriptions, recorded by the very walk that answers.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace wbhw {

// Why one entry made a comparison answer 1 (not satisfied) or 2 (tolerated difference).
enum class CompareReason : uint32_t {
    // Answer 1: the first required entry that the offered description lacks or contradicts.
    Missing,         // the offered node has no entry of that name (or fewer of them, in order)
    TextDiffers,     // both hold a text, and the texts differ (case aside)
    ValueMissing,    // a piece of the required list is not among the offered pieces
    LatencyTooLarge, // the offered "MemoryLatency" is greater than the required one
    KindDiffers,     // a text against a node or a link, or a node against a link
    OfferedEmpty,    // only the offered text was empty (the whole description is missing)
    // Answer 2: what made the offered description differ in an allowed way.
    OfferedExtra,      // an entry that only the offered node holds
    ListLengthDiffers, // the lists have different numbers of pieces, every required one offered
    SmallerLatency,    // the offered "MemoryLatency" is smaller than the required one
    RequiredEmpty,     // only the required text was empty
};

// One entry that decided or shaped the answer.
struct CompareFinding {
    CompareReason reason;
    // The entry's path from the compared root ("/Direction", "/Group/Pin"): the required entry's,
    // or for OfferedExtra the offered entry's; empty for the whole description.
    std::u16string path;
    // The required entry's text; empty when it has none (a node, a link, absent).
    std::u16string required;
    // The offered entry's text; empty when it has none.
    std::u16string offered;
    // ValueMissing: the required piece not offered; otherwise empty.
    std::u16string piece;
};

// Collects what decided one comparison. Hand one to CompareNodes or CompareResourceTexts: the
// same walk that computes the answer records into it, so the explanation cannot drift from the
// answer. Without one (the usual null) the walk records nothing and builds no text.
//
// Findings come in walk order. Tolerated differences are recorded as the walk meets them; the
// walk stops at the first shortfall, so when the answer is 1 the last finding is the one that
// decided it (Shortfall()), and the tolerated ones before it are what was seen on the way. When
// the answer is 2 every finding is a tolerated difference; when it is 0 there are none.
struct CompareExplanation {
    // The answer of the comparison (0, 1 or 2).
    uint32_t result = 0;
    // The entries that decided or shaped the answer, in walk order.
    std::vector<CompareFinding> findings;

    // The finding that made the answer 1; null when the answer is not 1.
    const CompareFinding* Shortfall() const noexcept {
        return result == 1 && !findings.empty() ? &findings.back() : nullptr;
    }
};

} // namespace wbhw
