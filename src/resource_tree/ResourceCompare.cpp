// Comparison of two resource descriptions through the comparison walk, with a cache of recent
// answers that many threads share.
#include "resource_tree/ResourceCompare.h"

#include "kern/AsciiRun.h"
#include "kern/CodePage.h"
#include "resource_tree/CompareCache.h"
#include "resource_tree/CompareWalk.h"
#include "resource_tree/ResTreeNode.h"

#include <array>
#include <mutex>

namespace wbhw {
namespace {

// One lock and one cache for the process; both live until its end.
std::mutex& CacheLock() {
    static std::mutex lock;
    return lock;
}

CompareCache& Cache() {
    static CompareCache cache(kCompareCachePairs, kCompareCacheBytes);
    return cache;
}

// True when the code page reads every ASCII byte as that character, as all the pages we name
// do (a page named by the environment need not).
bool CodePageKeepsAscii() {
    std::array<char, 128> ascii{};
    for (size_t i = 0; i < ascii.size(); ++i)
        ascii[i] = static_cast<char>(i);
    const std::u16string wide = qv::kern::AnsiToWide(std::string_view(ascii.data(), ascii.size()));
    for (size_t i = 0; i < wide.size(); ++i) {
        if (static_cast<size_t>(wide[i]) != i)
            return false;
    }
    return wide.size() == ascii.size();
}

// Loads one description into a fresh root. Whatever a load builds takes part, "XMLParseErrors"
// included: a document that fails to load still compares, and differs from one that loads.
// Descriptions are nearly always ASCII, and then their bytes are already the UTF-8 that Expat
// reads: no wide copy and no second conversion. Other texts are decoded just before their load,
// so only one wide copy lives at a time.
void LoadRoot(ResTreeNode& root, std::string_view text) {
    if (qv::kern::AsciiPrefixLength(text) == text.size() && CodePageKeepsAscii()) {
        root.ParseUtf8(text, false);
        return;
    }
    root.ParseText(qv::kern::AnsiToWide(text), false);
}

uint32_t CompareLoaded(std::string_view first, std::string_view second, CompareExplanation* why) {
    ResTreeNode a(WString(), WString(u"userData1"), false);
    ResTreeNode b(WString(), WString(u"userData2"), false);
    LoadRoot(a, first);
    LoadRoot(b, second);
    return CompareNodes(&a, &b, why);
}

uint32_t CompareEmpty(std::string_view first, std::string_view second, CompareExplanation* why) {
    const uint32_t result =
        first.empty() ? (second.empty() ? kMatch : kToleratedDifference) : kNotSatisfied;
    if (why != nullptr) {
        why->result = result;
        why->findings.clear();
        if (result != kMatch)
            why->findings.push_back(CompareFinding{result == kNotSatisfied
                                                       ? CompareReason::OfferedEmpty
                                                       : CompareReason::RequiredEmpty,
                                                   {},
                                                   {},
                                                   {},
                                                   {}});
    }
    return result;
}

} // namespace

uint32_t CompareNodes(ResTreeNode* a, ResTreeNode* b, CompareExplanation* why) {
    if (why != nullptr)
        why->findings.clear();
    CompareWalk walk(why);
    const uint32_t result = walk.Nodes(a, b);
    if (why != nullptr)
        why->result = result;
    return result;
}

uint32_t CompareResourceTexts(std::string_view first, std::string_view second,
                              CompareExplanation* why) {
    // Every code page we decode gives at least one character for a byte, so a text is empty
    // exactly when its bytes are.
    if (first.empty() || second.empty())
        return CompareEmpty(first, second, why);
    const std::string codePage = qv::kern::ConverterName({});
    const CompareCache::Probe probe(first, second, codePage);
    if (why == nullptr) {
        const std::lock_guard<std::mutex> hold(CacheLock());
        if (const auto cached = Cache().Find(probe))
            return *cached;
    }
    // Loading and comparing hold no lock: callers comparing different pairs work side by side.
    const uint32_t result = CompareLoaded(first, second, why);
    if (Cache().Admits(probe)) {
        CompareCache::Key key(probe);
        const std::lock_guard<std::mutex> hold(CacheLock());
        Cache().Insert(std::move(key), result);
    }
    return result;
}

void ClearCompareCache() {
    const std::lock_guard<std::mutex> hold(CacheLock());
    Cache().Clear();
}

size_t CompareCacheBytes() {
    const std::lock_guard<std::mutex> hold(CacheLock());
    return Cache().bytes();
}

} // namespace wbhw
