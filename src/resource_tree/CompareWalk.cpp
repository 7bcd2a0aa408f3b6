// The comparison walk: pairing entries by name, and the rules for the texts they hold.
#include "resource_tree/CompareWalk.h"

#include "kern/Collate.h"
#include "resource_tree/ListText.h"

#include <algorithm>
#include <map>
#include <unordered_set>
#include <utility>
#include <vector>

namespace wbhw {
namespace {

using qv::kern::EqualsNoCase;

constexpr uint32_t kMatch = 0;
constexpr uint32_t kNotSatisfied = 1;
constexpr uint32_t kToleratedDifference = 2;

constexpr std::u16string_view kValue = u"Value";
constexpr std::u16string_view kMemoryLatency = u"MemoryLatency";
constexpr std::u16string_view kSupportedValues = u"SupportedValues";
constexpr std::u16string_view kDeferredLoadPath = u":DeferredLoadPath";

// A deferred file may name further deferred files for the same node; a chain that names itself
// must still end.
constexpr int kMaxDeferredRounds = 16;

// A node with at least this many entries has its children walked with their memory asked for
// ahead (PrefetchChildren).
constexpr size_t kLargeNode = 16;

// What the rules make of a name (CompareWalk::ClassOf).
constexpr uint8_t kIgnoredName = 1; // takes no part in the pairing
constexpr uint8_t kLatencyName = 2; // "MemoryLatency": compared as a number
constexpr uint8_t kListName = 4;    // "SupportedValues": compared as a list

// Localized names travel in whatever language the target was described in; a description in
// another language must compare equal, so they are left out on both sides, as are localized
// texts and "Value".
uint8_t ClassifyName(std::u16string_view name) {
    if (EqualsNoCase(name, kValue) || EqualsNoCase(name, u"LocalizedName") ||
        EqualsNoCase(name, u"LocalizedValues"))
        return kIgnoredName;
    if (EqualsNoCase(name, kMemoryLatency))
        return kLatencyName;
    return EqualsNoCase(name, kSupportedValues) ? kListName : 0;
}

// The children of a large node are subtrees of a large tree, each most likely out of the cache,
// and following the pointers through one waits for every line in turn. Asked for before the walk
// reaches them, the memory of this pair of children and of the next arrives together. (This pair
// was mostly asked for a step earlier, as the next; but b's place may have moved on by more than
// one entry since.) The children of a small node came in with the node.
void PrefetchChildren(const ResTreeNode& a, ResTreeNode::Position e, const ResTreeNode& b,
                      ResTreeNode::Position f) {
    if (a.EntryCount() < kLargeNode || b.EntryCount() < kLargeNode)
        return;
    constexpr int kAhead = 2;
    for (auto [at, end] : {std::pair(e, a.End()), std::pair(f, b.End())}) {
        for (int i = 0; i < kAhead && at != end; ++i, ++at) {
            if (const ResTreeNode* child = at->Child())
                child->PrefetchSubtree();
        }
    }
}

bool IsLocalized(const ResTreeEntry& entry) {
    return entry.Kind() == EntryKind::LocalizedText;
}

// True when two entries at the same place of two ordered nodes take the same part in the
// pairing: equal names, and both localized or neither.
bool SameSlot(const ResTreeEntry& e, const ResTreeEntry& f) {
    return IsLocalized(e) == IsLocalized(f) && CompareEntryNames(e, f) == 0;
}

// True when two entries are plain texts with the same text: such a pair matches under every
// rule (identical numbers, identical lists, identical texts), so it needs no name class.
bool SameText(const ResTreeEntry& e, const ResTreeEntry& f) {
    return e.Kind() == EntryKind::Text && f.Kind() == EntryKind::Text && *e.Text() == *f.Text();
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

const WString* TextOf(const ResTreeEntry& entry) {
    return IsTextKind(entry.Kind()) ? entry.Text() : nullptr;
}

ResTreeNode* ChildOf(const ResTreeEntry& entry) {
    return entry.Kind() == EntryKind::Child ? entry.Child() : nullptr;
}

// Loads a node's deferred content, and what that content defers in turn.
void LoadAllDeferred(ResTreeNode& node) {
    for (int round = 0; round < kMaxDeferredRounds && node.MayHoldDeferredContent(); ++round) {
        const auto found = node.Find(kDeferredLoadPath);
        if (found == node.End() || !IsTextKind(found->Kind()))
            return;
        node.LoadDeferred();
    }
}

// Answers whether a piece equals (case aside) one of the offered pieces. A short list is
// searched; a long one is looked up by spelling first and then through a sorted copy, so that n
// pieces required of n offered cost O(n log n), not O(n^2).
class ListCover {
public:
    explicit ListCover(const std::vector<std::u16string>& offered) : offered_(offered) {
        if (offered_.size() <= kSearchUpTo)
            return;
        spellings_.reserve(offered_.size());
        for (const std::u16string& piece : offered_)
            spellings_.insert(piece);
    }

    bool Holds(std::u16string_view piece) const {
        if (offered_.size() <= kSearchUpTo) {
            return std::any_of(offered_.begin(), offered_.end(),
                               [piece](const auto& o) { return EqualsNoCase(piece, o); });
        }
        if (spellings_.count(piece) != 0)
            return true;
        if (sorted_.empty()) {
            sorted_.assign(offered_.begin(), offered_.end());
            std::sort(sorted_.begin(), sorted_.end(), qv::kern::LessNoCase());
        }
        const auto at =
            std::lower_bound(sorted_.begin(), sorted_.end(), piece, qv::kern::LessNoCase());
        return at != sorted_.end() && EqualsNoCase(*at, piece);
    }

private:
    static constexpr size_t kSearchUpTo = 8;
    const std::vector<std::u16string>& offered_;
    std::unordered_set<std::u16string_view> spellings_;
    mutable std::vector<std::u16string_view> sorted_;
};

std::u16string EntryPath(const ResTreeNode& node, const ResTreeEntry& entry) {
    return JoinResourcePath(node.Path(), EscapeListText(entry.Name(), u'/'));
}

std::u16string TextOrEmpty(const ResTreeEntry* entry) {
    const WString* text = entry != nullptr ? entry->Text() : nullptr;
    return text != nullptr ? std::u16string(*text) : std::u16string();
}

} // namespace

// What one node pair has left: b's compared entries not yet paired, and whether a tolerated
// difference was met.
struct CompareWalk::Tally {
    size_t unmatched = 0;
    bool minor = false;
};

// b's compared entries by name, in order, for pairing a's entries from the first place where
// the two nodes disagree on: the k-th of a name in a takes the k-th of that name in b.
class CompareWalk::Counterparts {
public:
    Counterparts(const ResTreeNode& b, CompareWalk& walk) {
        for (auto it = b.Begin(); it != b.End(); ++it) {
            if ((walk.ClassOf(it->Name()) & kIgnoredName) != 0)
                continue;
            Slot& slot = slots_[std::u16string_view(it->Name())];
            if (IsLocalized(*it))
                slot.localized = true;
            else
                slot.entries.push_back(&*it);
        }
    }

    // Counts an entry of NAME as paired already (by place, before the first disagreement).
    void Skip(std::u16string_view name) {
        const auto found = slots_.find(name);
        if (found != slots_.end())
            ++found->second.used;
    }

    // The next entry of b for a's next entry named NAME; null when b has no more of them, and
    // then LOCALIZED tells whether b holds that name as a localized text.
    const ResTreeEntry* Next(std::u16string_view name, bool& localized) {
        const auto found = slots_.find(name);
        if (found == slots_.end())
            return nullptr;
        Slot& slot = found->second;
        if (slot.used < slot.entries.size())
            return slot.entries[slot.used++];
        localized = slot.localized;
        return nullptr;
    }

    // Calls F for every compared entry of b that was not paired.
    template <class F> void ForEachUnpaired(F&& f) const {
        for (const auto& [name, slot] : slots_) {
            for (size_t i = slot.used; i < slot.entries.size(); ++i)
                f(*slot.entries[i]);
        }
    }

private:
    struct Slot {
        std::vector<const ResTreeEntry*> entries;
        size_t used = 0;
        bool localized = false;
    };
    std::map<std::u16string_view, Slot, qv::kern::LessNoCase> slots_;
};

uint8_t CompareWalk::ClassOf(std::u16string_view name) {
    if (const uint8_t* known = classes_.Find(name))
        return *known;
    return classes_.Add(name, ClassifyName(name));
}

bool CompareWalk::Ignored(const ResTreeEntry& entry) {
    return IsLocalized(entry) || (ClassOf(entry.Name()) & kIgnoredName) != 0;
}

uint32_t CompareWalk::Nodes(ResTreeNode* a, ResTreeNode* b) {
    if (a == nullptr)
        return b != nullptr ? kNotSatisfied : kMatch;
    if (b == nullptr)
        return kNotSatisfied;
    LoadAllDeferred(*b);
    LoadAllDeferred(*a);
    Tally tally;
    const uint32_t walked = !a->IsOrdered() && !b->IsOrdered() ? SortedEntries(*a, *b, tally)
                                                               : SequencedEntries(*a, *b, tally);
    if (walked == kNotSatisfied)
        return kNotSatisfied;
    return tally.unmatched != 0 || tally.minor ? kToleratedDifference : kMatch;
}

// Both nodes keep their entries sorted by name in the collator's order, one entry per name:
// one pass over both pairs them. Every entry of b is either paired or passed over; those passed
// over that take part are the ones a leaves unmatched.
uint32_t CompareWalk::SortedEntries(ResTreeNode& a, ResTreeNode& b, Tally& tally) {
    auto f = b.Begin();
    const auto bEnd = b.End();
    for (auto e = a.Begin(); e != a.End(); ++e) {
        PrefetchChildren(a, e, b, f);
        if (IsLocalized(*e))
            continue;
        // b's entries before E are passed over whether or not E takes part: an entry E would
        // skip is passed over by the next one that does, in the same order.
        int order = -1;
        while (f != bEnd && (order = CompareEntryNames(*f, *e)) < 0)
            PassOver(b, *f++, tally);
        if (f == bEnd || order != 0) {
            if ((ClassOf(e->Name()) & kIgnoredName) != 0)
                continue;
            return Short(CompareReason::Missing, a, *e, nullptr);
        }
        const ResTreeEntry& counterpart = *f++;
        // A required entry that the offered side holds as a localized text is taken as given.
        // Equal plain texts match whatever the rules make of their name, and a counterpart of an
        // ignored entry is ignored too (their names are equal), so most pairs need no class.
        if (IsLocalized(counterpart) || SameText(*e, counterpart))
            continue;
        const uint8_t nameClass = ClassOf(e->Name());
        if ((nameClass & kIgnoredName) != 0)
            continue;
        if (Pair(a, *e, counterpart, nameClass, tally) == kNotSatisfied)
            return kNotSatisfied;
    }
    for (; f != bEnd; ++f)
        PassOver(b, *f, tally);
    return kMatch;
}

// At least one node keeps its entries in document order. While both hold the same names in
// the same places, the k-th entry of each name sits at the same place on both sides, so they
// pair place by place; from the first disagreement on, a name index of b pairs the rest.
uint32_t CompareWalk::SequencedEntries(ResTreeNode& a, ResTreeNode& b, Tally& tally) {
    auto e = a.Begin();
    auto f = b.Begin();
    for (; e != a.End() && f != b.End() && SameSlot(*e, *f); ++e, ++f) {
        PrefetchChildren(a, e, b, f);
        if (IsLocalized(*e) || SameText(*e, *f))
            continue;
        const uint8_t nameClass = ClassOf(e->Name());
        if ((nameClass & kIgnoredName) != 0)
            continue;
        if (Pair(a, *e, *f, nameClass, tally) == kNotSatisfied)
            return kNotSatisfied;
    }
    // Entries paired by place take the same part on both sides (SameSlot), so b's compared
    // entries left unmatched are those from F on, until the name index pairs some of them.
    const bool aDone = e == a.End();
    for (; f != b.End(); ++f) {
        if (Ignored(*f))
            continue;
        ++tally.unmatched;
        if (aDone)
            NoteExtra(b, *f);
    }
    return aDone ? kMatch : RestThroughIndex(a, e, b, tally);
}

uint32_t CompareWalk::RestThroughIndex(ResTreeNode& a, ResTreeNode::Position e, ResTreeNode& b,
                                       Tally& tally) {
    Counterparts counterparts(b, *this);
    for (auto paired = a.Begin(); paired != e; ++paired) {
        if (!Ignored(*paired))
            counterparts.Skip(paired->Name());
    }
    for (; e != a.End(); ++e) {
        if (IsLocalized(*e))
            continue;
        const uint8_t nameClass = ClassOf(e->Name());
        if ((nameClass & kIgnoredName) != 0)
            continue;
        bool localized = false;
        const ResTreeEntry* f = counterparts.Next(e->Name(), localized);
        if (f == nullptr && localized)
            continue; // held by the offered side as a localized text: taken as given
        if (f == nullptr)
            return Short(CompareReason::Missing, a, *e, nullptr);
        if (Pair(a, *e, *f, nameClass, tally) == kNotSatisfied)
            return kNotSatisfied;
        --tally.unmatched;
    }
    if (why_ != nullptr)
        counterparts.ForEachUnpaired([this, &b](const ResTreeEntry& f) { NoteExtra(b, f); });
    return kMatch;
}

uint32_t CompareWalk::Pair(const ResTreeNode& a, const ResTreeEntry& e, const ResTreeEntry& f,
                           uint8_t nameClass, Tally& tally) {
    const WString* ta = TextOf(e);
    const WString* tb = TextOf(f);
    if ((ta == nullptr) != (tb == nullptr))
        return Short(CompareReason::KindDiffers, a, e, &f);
    if (ta != nullptr && Texts(a, e, f, nameClass, tally) == kNotSatisfied)
        return kNotSatisfied;
    ResTreeNode* const ca = ChildOf(e);
    ResTreeNode* const cb = ChildOf(f);
    if (ca != nullptr || cb != nullptr) {
        // Links are not followed: a link against a node does not match, two links do.
        if (ca == nullptr || cb == nullptr)
            return Short(CompareReason::KindDiffers, a, e, &f);
        const uint32_t below = Nodes(ca, cb);
        if (below == kNotSatisfied)
            return kNotSatisfied;
        tally.minor = tally.minor || below == kToleratedDifference;
    }
    return kMatch;
}

uint32_t CompareWalk::Texts(const ResTreeNode& a, const ResTreeEntry& e, const ResTreeEntry& f,
                            uint8_t nameClass, Tally& tally) {
    const std::u16string_view ta = *e.Text();
    const std::u16string_view tb = *f.Text();
    if ((nameClass & kLatencyName) != 0) {
        const uint64_t required = LeadingNumber(ta);
        const uint64_t offered = LeadingNumber(tb);
        if (offered > required)
            return Short(CompareReason::LatencyTooLarge, a, e, &f);
        if (offered < required) {
            tally.minor = true;
            Tolerate(CompareReason::SmallerLatency, a, e, &f);
        }
        return kMatch;
    }
    // Identical texts split alike and cover each other piece for piece, lists included (a list
    // of the same pieces has the same length, and a piece always equals itself).
    if (ta == tb)
        return kMatch;
    if ((nameClass & kListName) == 0 && !EqualsNoCase(ta, tb))
        return Short(CompareReason::TextDiffers, a, e, &f);
    return Lists(a, e, f, tally);
}

// Every piece of a's comma list must appear (case aside) in b's; different lengths are minor.
// An empty text is an empty list: a required empty list asks for nothing.
uint32_t CompareWalk::Lists(const ResTreeNode& a, const ResTreeEntry& e, const ResTreeEntry& f,
                            Tally& tally) {
    const std::vector<std::u16string> required = SplitListText(*e.Text(), u',', false);
    const std::vector<std::u16string> offered = SplitListText(*f.Text(), u',', false);
    if (required.size() != offered.size()) {
        tally.minor = true;
        Tolerate(CompareReason::ListLengthDiffers, a, e, &f);
    }
    const ListCover cover(offered);
    for (const std::u16string& piece : required) {
        if (!cover.Holds(piece))
            return Short(CompareReason::ValueMissing, a, e, &f, piece);
    }
    return kMatch;
}

uint32_t CompareWalk::Short(CompareReason reason, const ResTreeNode& node,
                            const ResTreeEntry& entry, const ResTreeEntry* offered,
                            std::u16string_view piece) {
    if (why_ != nullptr) {
        why_->findings.push_back(CompareFinding{reason, EntryPath(node, entry), TextOrEmpty(&entry),
                                                TextOrEmpty(offered), std::u16string(piece)});
    }
    return kNotSatisfied;
}

void CompareWalk::Tolerate(CompareReason reason, const ResTreeNode& node, const ResTreeEntry& entry,
                           const ResTreeEntry* offered) {
    if (why_ != nullptr) {
        why_->findings.push_back(CompareFinding{reason, EntryPath(node, entry), TextOrEmpty(&entry),
                                                TextOrEmpty(offered), std::u16string()});
    }
}

void CompareWalk::PassOver(const ResTreeNode& b, const ResTreeEntry& f, Tally& tally) {
    if (Ignored(f))
        return;
    ++tally.unmatched;
    NoteExtra(b, f);
}

void CompareWalk::NoteExtra(const ResTreeNode& b, const ResTreeEntry& f) {
    if (why_ == nullptr || Ignored(f))
        return;
    why_->findings.push_back(CompareFinding{CompareReason::OfferedExtra, EntryPath(b, f),
                                            std::u16string(), TextOrEmpty(&f), std::u16string()});
}

} // namespace wbhw
