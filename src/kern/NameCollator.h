// A case-insensitive collator for names: ICU at secondary strength, with a table-driven path for
// plain ASCII names that gives the same answers without calling into ICU.
#pragma once

#include "kern/Collate.h"

#include <array>
#include <cstdint>
#include <memory>
#include <string_view>

struct UCollator;

namespace qv::kern {

// Compares texts the way the collator of one locale does at secondary strength (case ignored,
// accents and punctuation not). Immutable after construction; Compare may be called from any
// thread, but CompareNoCase keeps one instance per thread all the same.
class NameCollator {
public:
    // Opens the collator of the ICU locale id ("" for the root collation). When ICU cannot open
    // it, every comparison answers 0.
    explicit NameCollator(const char* locale);
    ~NameCollator();
    NameCollator(const NameCollator&) = delete;
    NameCollator& operator=(const NameCollator&) = delete;

    // -1, 0 or 1 as the collator orders the texts; 0 when the collator is not open.
    int Compare(std::u16string_view a, std::u16string_view b) const noexcept;
    // The same answer, always through ICU (what the fast path must agree with).
    int CompareWithCollator(std::u16string_view a, std::u16string_view b) const noexcept;
    // An integer whose unsigned order is this collator's for names the rank table covers whole:
    // a set top bit, then the ranks of the first kOrderKeyUnits units, seven bits each, zero past
    // the end of a shorter name, and seven zero bits. 0 for any other name (and for every name
    // when the table cannot rank, or ranks too many characters for seven bits). A set stores it
    // with each name, so that most comparisons are one integer compare and never read the names.
    uint64_t OrderKey(std::u16string_view name) const noexcept;
    // Compare(a, b), given their order keys: the keys decide when both are set and differ, or
    // when they are equal and both names short enough to be held whole; else the names do.
    int CompareKeyed(std::u16string_view a, uint64_t keyA, std::u16string_view b,
                     uint64_t keyB) const noexcept {
        const int byKeys = CompareOrderKeys(a.size(), keyA, b.size(), keyB);
        return byKeys != 2 ? byKeys : Compare(a, b);
    }

    // True when ASCII names (all of them, or those avoiding a few letters) skip ICU.
    bool HasAsciiFastPath() const noexcept { return fastPath_; }
    // True when ICU opened the collator.
    bool IsOpen() const noexcept { return collator_ != nullptr; }

private:
    struct Closer {
        void operator()(UCollator* c) const noexcept;
    };
    using CollatorPtr = std::unique_ptr<UCollator, Closer>;

    void BuildAsciiRanks(const char* locale);
    // True when every unit of the text has a rank.
    bool AllRanked(std::u16string_view text) const noexcept;
    // Answers the fast path's result, or 2 when a text holds something the table cannot rank.
    int CompareRanks(std::u16string_view a, std::u16string_view b) const noexcept;

    CollatorPtr collator_;
    // The collation rank of each ASCII code unit; 0 marks one that only ICU may order.
    std::array<uint8_t, 128> ranks_{};
    // ASCII code units that begin a contraction continuing with characters outside the table.
    std::array<bool, 128> contractionStarts_{};
    bool fastPath_ = false;
    // True when the fast path is on and every rank fits in seven bits (OrderKey).
    bool keyed_ = false;
};

} // namespace qv::kern
