// Decides whether an offered resource description satisfies a required one.
#pragma once

#include <cstdint>
#include <string_view>

namespace wbhw {

class ResTreeNode;

// Results of a comparison of a required description (a) with an offered one (b).
enum CompareResult : uint32_t {
    kMatch = 0,               // b matches a
    kNotSatisfied = 1,        // an entry that a requires is missing from b or differs
    kToleratedDifference = 2, // b satisfies a but differs in an allowed way
};

// Loads both resource-tree XML texts (multibyte, the system's default code page) and compares
// them; empty texts: both 0, only the first 2, only the second 1. The 100 most recently computed
// distinct pairs are cached. Thread-safe: one lock serialises whole comparisons.
uint32_t CompareResourceTexts(std::string_view first, std::string_view second);

// Compares the required node A with the offered node B (either may be null); loads their
// deferred content. Not locked: the caller owns both trees.
uint32_t CompareNodes(ResTreeNode* a, ResTreeNode* b);

// Drops every cached pair (tests and the embedded host use it to start from a known state).
void ClearCompareCache();

} // namespace wbhw
