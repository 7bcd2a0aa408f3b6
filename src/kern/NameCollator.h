// A case-insensitive collator for names: ICU at secondary strength, with a table-driven path for
// plain ASCII names that gives the same answers without calling into ICU.
#pragma once

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
};

} // namespace qv::kern
