// Name collation: ICU at secondary strength, and a rank table for ASCII names that the
// constructor derives from the very same collator, so both paths give one answer.
//
// Why the table is exact: when every character of two texts maps to one collation element of
// its own (no expansion, no contraction, not ignorable), and characters that share a primary
// weight also share the secondary one, a secondary-strength comparison is decided by the
// sequence of primary weights alone. Ranking the characters by the collator then orders the
// texts as the collator does. The constructor admits only characters for which it can check
// these conditions, so a tailoring that breaks them (contractions such as "ch", numeric
// ordering, ignorable punctuation) simply sends those texts to ICU.
#include "kern/NameCollator.h"

#include <algorithm>
#include <climits>
#include <cstring>
#include <initializer_list>
#include <unicode/ucol.h>
#include <unicode/uset.h>
#include <vector>

namespace qv::kern {
namespace {

struct SetCloser {
    void operator()(USet* s) const noexcept { uset_close(s); }
};
using SetPtr = std::unique_ptr<USet, SetCloser>;

// ICU takes 32-bit lengths (a negative one would mean "up to the terminator").
int32_t IcuLength(size_t n) {
    return static_cast<int32_t>(std::min<size_t>(n, INT32_MAX));
}

int ToTriState(UCollationResult r) {
    return r == UCOL_LESS ? -1 : (r == UCOL_GREATER ? 1 : 0);
}

UCollationResult CompareUnits(const UCollator* c, char16_t x, char16_t y) {
    return ucol_strcoll(c, &x, 1, &y, 1);
}

UCollator* OpenAtStrength(const char* locale, UColAttributeValue strength) {
    UErrorCode status = U_ZERO_ERROR;
    UCollator* c = ucol_open(locale, &status);
    if (U_FAILURE(status)) {
        ucol_close(c);
        return nullptr;
    }
    ucol_setStrength(c, strength);
    return c;
}

// True when every unit of the text is an ASCII candidate.
bool AllCandidates(const UChar* text, int32_t length, const std::array<bool, 128>& candidate) {
    for (int32_t i = 0; i < length; ++i) {
        if (text[i] >= 128 || !candidate[text[i]])
            return false;
    }
    return true;
}

// Calls f(text, length) for every string of the set; false when ICU fails.
template <class F> bool ForEachString(const USet* set, F f) {
    const int32_t items = uset_getItemCount(set);
    for (int32_t i = 0; i < items; ++i) {
        UChar32 start = 0;
        UChar32 end = 0;
        UChar text[64];
        UErrorCode status = U_ZERO_ERROR;
        const int32_t length = uset_getItem(set, i, &start, &end, text, 64, &status);
        if (U_FAILURE(status))
            return false;
        if (length > 0)
            f(text, length);
    }
    return true;
}

// Sorts out the candidates that expansions, contractions and prefix rules involve. An
// expansion, or a contraction made of candidates only, drops them: such a text is no longer one
// element per character. A contraction that goes on with other characters marks its leading
// candidates in `starts`: a difference found at one of them is only final once the rest of both
// texts is known to hold no such continuation.
void SortOutContractions(const UCollator* c, std::array<bool, 128>& candidate,
                         std::array<bool, 128>& starts) {
    UErrorCode status = U_ZERO_ERROR;
    SetPtr contractions(uset_openEmpty());
    SetPtr expansions(uset_openEmpty());
    ucol_getContractionsAndExpansions(c, contractions.get(), expansions.get(), true, &status);
    const auto drop = [&](const UChar* text, int32_t length) {
        if (AllCandidates(text, length, candidate)) {
            for (int32_t k = 0; k < length; ++k)
                candidate[text[k]] = false;
        }
    };
    const auto mark = [&](const UChar* text, int32_t length) {
        for (int32_t k = 0; k < length && text[k] < 128 && candidate[text[k]]; ++k)
            starts[text[k]] = true;
    };
    if (U_FAILURE(status)) {
        candidate.fill(false);
        return;
    }
    for (char16_t u = 0; u < 128; ++u) {
        if (uset_contains(expansions.get(), u))
            candidate[u] = false;
    }
    if (!ForEachString(contractions.get(), drop) || !ForEachString(contractions.get(), mark))
        candidate.fill(false);
}

} // namespace

void NameCollator::Closer::operator()(UCollator* c) const noexcept {
    ucol_close(c);
}

NameCollator::NameCollator(const char* locale) : collator_(OpenAtStrength(locale, UCOL_SECONDARY)) {
    if (collator_ != nullptr)
        BuildAsciiRanks(locale);
}

NameCollator::~NameCollator() = default;

void NameCollator::BuildAsciiRanks(const char* locale) {
    // Numeric ordering compares digit runs by value, not one digit at a time; a case level
    // orders case after the accents of the whole text, not character by character.
    for (const UColAttribute attribute : {UCOL_NUMERIC_COLLATION, UCOL_CASE_LEVEL}) {
        UErrorCode status = U_ZERO_ERROR;
        if (ucol_getAttribute(collator_.get(), attribute, &status) != UCOL_OFF || U_FAILURE(status))
            return;
    }
    const CollatorPtr primary(OpenAtStrength(locale, UCOL_PRIMARY));
    if (primary == nullptr)
        return;
    std::array<bool, 128> candidate{};
    const UChar none = 0;
    for (char16_t u = 0; u < 128; ++u) {
        // An ignorable character (controls; punctuation when it is shifted) vanishes at primary
        // strength, so a text is no longer one element per character.
        candidate[u] = ucol_strcoll(primary.get(), &u, 1, &none, 0) != UCOL_EQUAL;
    }
    SortOutContractions(collator_.get(), candidate, contractionStarts_);

    std::vector<char16_t> order;
    for (char16_t u = 0; u < 128; ++u) {
        if (candidate[u])
            order.push_back(u);
    }
    if (order.empty())
        return;
    const UCollator* secondary = collator_.get();
    std::stable_sort(order.begin(), order.end(), [secondary](char16_t x, char16_t y) {
        return CompareUnits(secondary, x, y) == UCOL_LESS;
    });
    uint8_t rank = 1;
    ranks_[order[0]] = rank;
    for (size_t i = 1; i < order.size(); ++i) {
        if (CompareUnits(secondary, order[i - 1], order[i]) == UCOL_EQUAL) {
            ranks_[order[i]] = rank;
            continue;
        }
        // Neighbours that differ only at the secondary level would be ordered by the table
        // before the rest of the text is looked at; ICU looks at all primaries first.
        if (CompareUnits(primary.get(), order[i - 1], order[i]) == UCOL_EQUAL) {
            ranks_.fill(0);
            return;
        }
        ranks_[order[i]] = ++rank;
    }
    fastPath_ = true;
    keyed_ = rank < 128;
}

bool NameCollator::AllRanked(std::u16string_view text) const noexcept {
    for (const char16_t u : text) {
        if (u >= 128 || ranks_[u] == 0)
            return false;
    }
    return true;
}

uint64_t NameCollator::OrderKey(std::u16string_view name) const noexcept {
    // For names ranked whole, CompareRanks is the plain lexicographic order of the ranks (a
    // contraction start only matters next to an unranked character), shorter first; packing
    // the first ranks from the top keeps that order, and a missing unit (0) sorts before any.
    if (!keyed_ || !AllRanked(name))
        return 0;
    uint64_t key = 0;
    const size_t held = std::min(name.size(), kOrderKeyUnits);
    for (size_t i = 0; i < held; ++i)
        key |= static_cast<uint64_t>(ranks_[name[i]]) << (7 * (kOrderKeyUnits - i));
    return key | (uint64_t{1} << 63);
}

int NameCollator::CompareRanks(std::u16string_view a, std::u16string_view b) const noexcept {
    const size_t common = std::min(a.size(), b.size());
    size_t i = 0;
    for (; i < common; ++i) {
        const char16_t p = a[i];
        const char16_t q = b[i];
        // Units beyond the table have no rank; one bit test covers both.
        if ((p | q) >= 128)
            return 2;
        const uint8_t x = ranks_[p];
        const uint8_t y = ranks_[q];
        if (x == 0 || y == 0)
            return 2;
        if (x == y)
            continue;
        // Characters before this one cannot reach past it in a contraction (they would have to
        // start one that continues with ranked characters only); this one might.
        if ((contractionStarts_[p] || contractionStarts_[q]) &&
            !(AllRanked(a.substr(i)) && AllRanked(b.substr(i))))
            return 2;
        return x < y ? -1 : 1;
    }
    // Equal so far: the longer text is greater only if its rest is not ignorable.
    if (!AllRanked(a.substr(common)) || !AllRanked(b.substr(common)))
        return 2;
    if (a.size() == b.size())
        return 0;
    return a.size() < b.size() ? -1 : 1;
}

int NameCollator::CompareWithCollator(std::u16string_view a, std::u16string_view b) const noexcept {
    if (collator_ == nullptr)
        return 0;
    // ICU treats a null text as an error, not as empty.
    static constexpr UChar kEmpty[1] = {0};
    const UChar* const x = a.data() != nullptr ? a.data() : kEmpty;
    const UChar* const y = b.data() != nullptr ? b.data() : kEmpty;
    return ToTriState(
        ucol_strcoll(collator_.get(), x, IcuLength(a.size()), y, IcuLength(b.size())));
}

int NameCollator::Compare(std::u16string_view a, std::u16string_view b) const noexcept {
    // The rank walk settles ASCII names, identical ones included, in one pass; every lookup of a
    // name in a node or a loader table comes here, so it goes first.
    if (fastPath_) {
        const int answer = CompareRanks(a, b);
        if (answer != 2)
            return answer;
    }
    if (collator_ == nullptr)
        return 0;
    // Texts identical unit for unit are equal in every collation, without asking ICU.
    // (A null text is empty and must not reach memcmp.)
    if (a.size() == b.size() &&
        (a.empty() || std::memcmp(a.data(), b.data(), a.size() * sizeof(char16_t)) == 0))
        return 0;
    return CompareWithCollator(a, b);
}

} // namespace qv::kern
