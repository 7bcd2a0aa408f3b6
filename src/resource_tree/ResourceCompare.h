// Decides whether an offered resource description satisfies a required one.
#pragma once

#include "resource_tree/CompareExplanation.h"

#include <cstddef>
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

// The cache of CompareResourceTexts keeps at most this many pairs...
inline constexpr size_t kCompareCachePairs = 100;
// ...and at most this many bytes of their texts; a larger pair is answered but not kept.
inline constexpr size_t kCompareCacheBytes = size_t{64} << 20;

// Loads both resource-tree XML texts (multibyte, the system's default code page) and compares
// them; empty texts: both 0, only the first 2, only the second 1. The most recently computed
// distinct pairs are cached (see the limits above); a pair is looked up before its texts are
// even decoded. Thread-safe: a lock guards only the cache lookup and insertion, so comparisons
// of different pairs run side by side. With WHY, the answer comes from a fresh comparison (never
// the cache) that records into WHY what decided it.
uint32_t CompareResourceTexts(std::string_view first, std::string_view second,
                              CompareExplanation* why = nullptr);

// Compares the required node A with the offered node B (either may be null); loads their
// deferred content. WHY, when given, receives the answer and what decided it. Not locked: the
// caller owns both trees.
uint32_t CompareNodes(ResTreeNode* a, ResTreeNode* b, CompareExplanation* why = nullptr);

// Drops every cached pair (tests and the embedded host use it to start from a known state).
void ClearCompareCache();

// The bytes of text the cache keeps now (tests and benchmarks watch the budget with it).
size_t CompareCacheBytes();

} // namespace wbhw
