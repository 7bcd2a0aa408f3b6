// Comparison of two resource descriptions, entry by entry, with a cache of recent answers.
#include "resource_tree/ResourceCompare.h"

#include "kern/CodePage.h"
#include "kern/Collate.h"
#include "resource_tree/CompareCache.h"
#include "resource_tree/ListText.h"
#include "resource_tree/ResTreeNode.h"

#include <algorithm>
#include <map>
#include <mutex>
#include <vector>

namespace wbhw {
namespace {

using qv::kern::EqualsNoCase;

constexpr std::u16string_view kValue = u"Value";
constexpr std::u16string_view kMemoryLatency = u"MemoryLatency";
constexpr std::u16string_view kSupportedValues = u"SupportedValues";

// Localized names travel in whatever language the target was described in; a description in
// another language must compare equal, so they are left out on both sides.
bool IsLocalizedName(std::u16string_view name) {
    return EqualsNoCase(name, u"LocalizedName") || EqualsNoCase(name, u"LocalizedValues");
}

bool IsIgnoredOnBothSides(const ResTreeEntry& entry) {
    return entry.Kind() == EntryKind::LocalizedText || EqualsNoCase(entry.Name(), kValue) ||
           IsLocalizedName(entry.Name());
}

// The leading decimal digits of TEXT as a number; 0 when there are none.
uint64_t LeadingNumber(std::u16string_view text) {
    uint64_t value = 0;
    for (const char16_t c : text) {
        if (c < u'0' || c > u'9' || value > (UINT64_MAX - 9) / 10)
            break;
        value = value * 10 + static_cast<uint64_t>(c - u'0');
    }
    return value;
}

// The comma-separated pieces of TEXT, untrimmed; an empty text is one empty piece.
std::vector<std::u16string> Pieces(std::u16string_view text) {
    if (text.empty())
        return {std::u16string()};
    return SplitListText(text, u',', false);
}

// Every piece of A's comma list must appear (case aside) in B's; different lengths are minor.
uint32_t CompareLists(std::u16string_view a, std::u16string_view b, bool& minor) {
    const std::vector<std::u16string> required = Pieces(a);
    const std::vector<std::u16string> offered = Pieces(b);
    if (required.size() != offered.size())
        minor = true;
    for (const std::u16string& piece : required) {
        const bool present = std::any_of(offered.begin(), offered.end(),
                                         [&](const auto& o) { return EqualsNoCase(piece, o); });
        if (!present)
            return kNotSatisfied;
    }
    return kMatch;
}

// Compares the texts of two same-named entries; TA is a's text (never null here).
uint32_t CompareTexts(std::u16string_view name, const WString& ta, const WString* tb, bool& minor) {
    if (tb == nullptr)
        return kNotSatisfied;
    if (EqualsNoCase(name, kMemoryLatency)) {
        const uint64_t required = LeadingNumber(ta);
        const uint64_t offered = LeadingNumber(*tb);
        if (offered > required)
            return kNotSatisfied;
        if (offered < required)
            minor = true;
        return kMatch;
    }
    if (!EqualsNoCase(name, kSupportedValues) && !EqualsNoCase(ta, *tb))
        return kNotSatisfied;
    return CompareLists(ta, *tb, minor);
}

const WString* TextOf(const ResTreeEntry& entry) {
    return IsTextKind(entry.Kind()) ? entry.Text() : nullptr;
}

ResTreeNode* ChildOf(const ResTreeEntry& entry) {
    return entry.Kind() == EntryKind::Child ? entry.Child() : nullptr;
}

// Finds, for each entry of a, its counterpart in b: the k-th entry of a name in a pairs with the
// k-th entry of that name in b, so ordered nodes that repeat a name compare element by element.
class CounterpartFinder {
public:
    explicit CounterpartFinder(ResTreeNode& b) : b_(b) {}

    // The counterpart of the next entry of a named NAME; End() when b has no such entry.
    ResTreeNode::Position Next(const WString& name) {
        const size_t k = seen_[name]++;
        if (k == 0)
            return b_.FindLoading(name);
        if (!b_.IsOrdered())
            return b_.End(); // names are unique in b: there is no second one
        return NthInOrder(name, k);
    }

private:
    ResTreeNode::Position NthInOrder(std::u16string_view name, size_t k) const {
        for (auto it = b_.Begin(); it != b_.End(); ++it) {
            if (EqualsNoCase(it->Name(), name) && k-- == 0)
                return it;
        }
        return b_.End();
    }

    ResTreeNode& b_;
    std::map<WString, size_t, qv::kern::LessNoCase> seen_;
};

// The entries of b that a must match, before the walk over a.
size_t CountComparedEntries(const ResTreeNode& b) {
    size_t count = 0;
    for (auto it = b.Begin(); it != b.End(); ++it)
        count += IsIgnoredOnBothSides(*it) ? 0 : 1;
    return count;
}

} // namespace

uint32_t CompareNodes(ResTreeNode* a, ResTreeNode* b) {
    if (a == nullptr)
        return b != nullptr ? kNotSatisfied : kMatch;
    if (b == nullptr)
        return kNotSatisfied;
    b->LoadDeferred();
    size_t unmatched = CountComparedEntries(*b);
    a->LoadDeferred();
    bool minor = false;
    CounterpartFinder counterparts(*b);
    for (auto e = a->Begin(); e != a->End(); ++e) {
        if (IsIgnoredOnBothSides(*e))
            continue;
        const auto f = counterparts.Next(e->Name());
        if (f == b->End())
            return kNotSatisfied;
        if (f->Kind() == EntryKind::LocalizedText)
            continue;
        const WString* ta = TextOf(*e);
        const WString* tb = TextOf(*f);
        if (ta != nullptr && CompareTexts(e->Name(), *ta, tb, minor) == kNotSatisfied)
            return kNotSatisfied;
        if (ta == nullptr && tb != nullptr)
            return kNotSatisfied;
        const uint32_t below = CompareNodes(ChildOf(*e), ChildOf(*f));
        if (below == kNotSatisfied)
            return kNotSatisfied;
        minor = minor || below == kToleratedDifference;
        --unmatched;
    }
    return unmatched != 0 || minor ? kToleratedDifference : kMatch;
}

namespace {

// One lock and one cache for the process; both live until its end.
std::mutex& CompareLock() {
    static std::mutex lock;
    return lock;
}

CompareCache& Cache() {
    static CompareCache cache(100);
    return cache;
}

uint32_t CompareLoaded(const std::u16string& first, const std::u16string& second) {
    ResTreeNode a(WString(), WString(u"userData1"), false);
    ResTreeNode b(WString(), WString(u"userData2"), false);
    // Whatever a load builds takes part, "XMLParseErrors" included: a document that fails to
    // load still compares, and differs from one that loads.
    a.ParseText(first, false);
    b.ParseText(second, false);
    return CompareNodes(&a, &b);
}

} // namespace

uint32_t CompareResourceTexts(std::string_view first, std::string_view second) {
    std::u16string a = qv::kern::AnsiToWide(first);
    std::u16string b = qv::kern::AnsiToWide(second);
    const std::lock_guard<std::mutex> hold(CompareLock());
    if (a.empty() || b.empty())
        return a.empty() ? (b.empty() ? kMatch : kToleratedDifference) : kNotSatisfied;
    CompareCache::Key key(std::move(a), std::move(b));
    if (const auto cached = Cache().Find(key))
        return *cached;
    const uint32_t result = CompareLoaded(key.first, key.second);
    Cache().Insert(std::move(key), result);
    return result;
}

void ClearCompareCache() {
    const std::lock_guard<std::mutex> hold(CompareLock());
    Cache().Clear();
}

} // namespace wbhw
