// The walk that compares a required resource node with an offered one, entry by entry.
#pragma once

#include "resource_tree/CompareExplanation.h"
#include "resource_tree/ResTreeNode.h"
#include "resource_tree/SpellingTable.h"

#include <cstdint>

namespace wbhw {

// One comparison of a required node (a) with an offered one (b), answering 0, 1 or 2 as
// CompareNodes documents. Entries pair by name: the k-th compared entry of a name in a with the
// k-th compared entry of that name in b (localized texts and "Value", "LocalizedName",
// "LocalizedValues" take no part on either side). Sorted nodes are walked side by side in their
// common collation order; ordered nodes pair place by place while their names agree and through
// a name index from the first disagreement on; so a node of n entries costs O(n log n) name
// comparisons at worst and O(n) when the two sides agree. With an explanation, the walk records
// what decided the answer into it; without one it records nothing.
class CompareWalk {
public:
    explicit CompareWalk(CompareExplanation* why) noexcept : why_(why) {}

    // Compares A (required) with B (offered); either may be null. Loads deferred content.
    uint32_t Nodes(ResTreeNode* a, ResTreeNode* b);

private:
    struct Tally;
    class Counterparts;

    uint32_t SortedEntries(ResTreeNode& a, ResTreeNode& b, Tally& tally);
    uint32_t SequencedEntries(ResTreeNode& a, ResTreeNode& b, Tally& tally);
    uint32_t RestThroughIndex(ResTreeNode& a, ResTreeNode::Position e, ResTreeNode& b,
                              Tally& tally);
    uint32_t Pair(const ResTreeNode& a, const ResTreeEntry& e, const ResTreeEntry& f,
                  uint8_t nameClass, Tally& tally);
    uint32_t Texts(const ResTreeNode& a, const ResTreeEntry& e, const ResTreeEntry& f,
                   uint8_t nameClass, Tally& tally);
    uint32_t Lists(const ResTreeNode& a, const ResTreeEntry& e, const ResTreeEntry& f,
                   Tally& tally);

    // Records a shortfall (when explaining) and answers 1.
    uint32_t Short(CompareReason reason, const ResTreeNode& node, const ResTreeEntry& entry,
                   const ResTreeEntry* offered, std::u16string_view piece = {});
    // Records a tolerated difference when explaining.
    void Tolerate(CompareReason reason, const ResTreeNode& node, const ResTreeEntry& entry,
                  const ResTreeEntry* offered);
    // Records an offered entry that nothing required, unless it takes no part.
    void NoteExtra(const ResTreeNode& b, const ResTreeEntry& f);
    // Counts (and records) an entry of b that the sorted walk passed over, unless it takes no
    // part.
    void PassOver(const ResTreeNode& b, const ResTreeEntry& f, Tally& tally);

    // What the rules make of an entry's name (the k... flags of CompareWalk.cpp). A description
    // repeats a few dozen spellings thousands of times, and names compare in the user's locale,
    // so each spelling is classified once per walk. Entries paired with each other have equal
    // names, so one class serves both.
    uint8_t ClassOf(std::u16string_view name);
    // True when ENTRY takes no part in the pairing (a localized text, or an ignored name).
    bool Ignored(const ResTreeEntry& entry);

    CompareExplanation* why_;
    SpellingTable<uint8_t> classes_;
};

} // namespace wbhw
