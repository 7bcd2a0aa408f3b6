// The comparison walk against a plain reading of the rules (each entry looked up in the offered
// node, the k-th of a name found by a scan), on thousands of generated pairs of trees: sorted and
// ordered nodes, repeated names, localized texts, links, deferred files, the special names.
#include "TreeTestSupport.h"
#include "kern/Collate.h"
#include "resource_tree/ListText.h"
#include "resource_tree/ResourceCompare.h"

#include <algorithm>
#include <gtest/gtest.h>
#include <random>

namespace wbhw {
namespace {

using qv::kern::EqualsNoCase;

// ---- The reference: the rules read literally, in quadratic time. ----

bool RefIgnored(const ResTreeEntry& e) {
    return e.Kind() == EntryKind::LocalizedText || EqualsNoCase(e.Name(), u"Value") ||
           EqualsNoCase(e.Name(), u"LocalizedName") || EqualsNoCase(e.Name(), u"LocalizedValues");
}

void RefLoad(ResTreeNode& node) {
    for (int round = 0; round < 16; ++round) {
        const auto at = node.Find(u":DeferredLoadPath");
        if (at == node.End() || !IsTextKind(at->Kind()))
            return;
        node.LoadDeferred();
    }
}

uint32_t RefLists(std::u16string_view ta, std::u16string_view tb, bool& minor) {
    const auto required = SplitListText(ta, u',', false);
    const auto offered = SplitListText(tb, u',', false);
    minor = minor || required.size() != offered.size();
    for (const auto& piece : required) {
        if (std::none_of(offered.begin(), offered.end(),
                         [&](const auto& o) { return EqualsNoCase(piece, o); }))
            return 1;
    }
    return 0;
}

uint32_t RefTexts(std::u16string_view name, std::u16string_view ta, std::u16string_view tb,
                  bool& minor) {
    if (EqualsNoCase(name, u"MemoryLatency")) {
        const auto number = [](std::u16string_view t) {
            uint64_t v = 0;
            for (size_t i = 0; i < t.size() && t[i] >= u'0' && t[i] <= u'9' && v < 1000000; ++i)
                v = v * 10 + (t[i] - u'0');
            return v;
        };
        minor = minor || number(tb) < number(ta);
        return number(tb) > number(ta) ? 1 : 0;
    }
    if (!EqualsNoCase(name, u"SupportedValues") && !EqualsNoCase(ta, tb))
        return 1;
    return RefLists(ta, tb, minor);
}

uint32_t RefCompare(ResTreeNode* a, ResTreeNode* b) {
    if (a == nullptr)
        return b != nullptr ? 1 : 0;
    if (b == nullptr)
        return 1;
    RefLoad(*b);
    size_t unmatched = 0;
    for (auto f = b->Begin(); f != b->End(); ++f)
        unmatched += RefIgnored(*f) ? 0 : 1;
    RefLoad(*a);
    bool minor = false;
    for (auto e = a->Begin(); e != a->End(); ++e) {
        if (RefIgnored(*e))
            continue;
        // The k-th compared entry of this name in a takes the k-th compared one in b; b's
        // localized texts of the name only excuse an entry that finds no counterpart.
        size_t k = 0;
        for (auto p = a->Begin(); p != e; ++p)
            k += !RefIgnored(*p) && EqualsNoCase(p->Name(), e->Name()) ? 1 : 0;
        const ResTreeEntry* f = nullptr;
        bool localized = false;
        for (auto q = b->Begin(); q != b->End() && f == nullptr; ++q) {
            if (!EqualsNoCase(q->Name(), e->Name()))
                continue;
            if (q->Kind() == EntryKind::LocalizedText)
                localized = true;
            else if (k-- == 0)
                f = &*q;
        }
        if (f == nullptr && localized)
            continue;
        if (f == nullptr)
            return 1;
        const bool ta = IsTextKind(e->Kind());
        const bool tb = IsTextKind(f->Kind());
        if (ta != tb || (ta && RefTexts(e->Name(), *e->Text(), *f->Text(), minor) == 1))
            return 1;
        ResTreeNode* ca = e->Kind() == EntryKind::Child ? e->Child() : nullptr;
        ResTreeNode* cb = f->Kind() == EntryKind::Child ? f->Child() : nullptr;
        const uint32_t below = RefCompare(ca, cb);
        if (below == 1)
            return 1;
        minor = minor || below == 2;
        --unmatched;
    }
    return unmatched != 0 || minor ? 2 : 0;
}

bool IsShortfall(CompareReason reason) {
    switch (reason) {
    case CompareReason::Missing:
    case CompareReason::TextDiffers:
    case CompareReason::ValueMissing:
    case CompareReason::LatencyTooLarge:
    case CompareReason::KindDiffers:
    case CompareReason::OfferedEmpty:
        return true;
    default:
        return false;
    }
}

// ---- Generated trees. ----

const std::u16string kNames[] = {
    u"Pin",           u"pin",           u"Rate", u"Value", u"Line", u"SupportedValues",
    u"MemoryLatency", u"LocalizedName", u"Ünit", u"ünit"};
const std::u16string kTexts[] = {u"",  u"1", u"2",        u"1,2",   u"2,1", u"1,2,3", u"1,,2",
                                 u"x", u"X", u"3 cycles", u"a\\,b", u"10",  u"Ä,ä"};

// Builds a tree from SEED; the same seeds build the same tree, so every walk gets its own copy
// (comparing loads deferred content, which changes a tree). A nonzero CHANGES seed adds or
// alters an entry here and there while the rest of the tree stays as SEED builds it, which makes
// close pairs: matches and tolerated differences, not only early failures.
class TreeMaker {
public:
    TreeMaker(uint32_t seed, uint32_t changes, std::u16string deferred)
        : rng_(seed), changes_(changes), changing_(changes != 0), deferred_(std::move(deferred)) {}

    void Fill(ResTreeNode& node) { Fill(node, 0, rng_); }

private:
    void Fill(ResTreeNode& node, int depth, std::mt19937& rng) {
        const int entries = Pick(rng, depth == 0 ? 7 : 5);
        for (int i = 0; i < entries; ++i) {
            if (changing_ && Pick(changes_, 10) == 0)
                AddEntry(node, depth, changes_);
            AddEntry(node, depth, rng);
        }
    }

    static int Pick(std::mt19937& rng, size_t n) { return static_cast<int>(rng() % n); }

    void AddEntry(ResTreeNode& node, int depth, std::mt19937& rng) {
        const std::u16string& name = kNames[Pick(rng, std::size(kNames))];
        const int kind = Pick(rng, 12);
        if (kind < 6) {
            size_t text = static_cast<size_t>(Pick(rng, std::size(kTexts)));
            if (changing_ && Pick(changes_, 12) == 0)
                text = static_cast<size_t>(Pick(changes_, std::size(kTexts)));
            node.AddText(node.End(), name, kTexts[text],
                         kind == 0 ? EntryKind::LocalizedText : EntryKind::Text);
        } else if (kind < 10) {
            const bool ordered = Pick(rng, 2) == 0;
            auto added = node.AddChild(node.End(), name, u"Group", ordered);
            if (added.created && depth < 3)
                Fill(*added.node, depth + 1, rng);
        } else if (kind == 10) {
            node.AddLink(node.End(), name, u"../Pin");
        } else if (Pick(rng, 3) == 0) {
            node.AddText(node.End(), u":DeferredLoadPath", deferred_);
        }
    }

    std::mt19937 rng_;
    std::mt19937 changes_;
    bool changing_;
    std::u16string deferred_;
};

std::unique_ptr<ResTreeNode> MakeTree(uint32_t seed, uint32_t changes, bool ordered,
                                      const char16_t* deferred) {
    auto root = std::make_unique<ResTreeNode>(WString(), WString(u"userData"), ordered);
    TreeMaker(seed, changes, deferred).Fill(*root);
    return root;
}

TEST(CompareWalkDifferential, AgreesWithTheRulesReadLiterally) {
    test::ScratchDirectory dir;
    dir.Write("d1.xml", "<X><Pin>1</Pin><Rate>x</Rate><SupportedValues>1,2</SupportedValues></X>");
    dir.Write("d2.xml", "<X ordered='true'><Pin>1</Pin><Pin>2</Pin></X>");
    LoaderSettings settings = DefaultLoaderSettings();
    const LoaderSettings saved = settings;
    settings.deferredDirectory = dir.Path();
    SetDefaultLoaderSettings(settings);

    std::mt19937 rng(14);
    size_t answers[3] = {0, 0, 0};
    for (int round = 0; round < 4000; ++round) {
        const uint32_t seedA = static_cast<uint32_t>(rng());
        // Close pairs (a tree against itself or a sibling seed) make matches and tolerated
        // differences common; independent pairs mostly fail early.
        // Mostly a tree against a changed copy of itself; now and then against any other.
        const bool close = rng() % 4 != 0;
        const uint32_t seedB = close ? seedA : static_cast<uint32_t>(rng());
        const uint32_t changes = close && rng() % 4 != 0 ? static_cast<uint32_t>(rng()) : 0;
        const bool orderedA = rng() % 2 == 0;
        const bool orderedB = rng() % 4 == 0 ? !orderedA : orderedA;
        const char16_t* deferredA = rng() % 2 == 0 ? u"d1.xml" : u"d2.xml";
        const char16_t* deferredB = rng() % 4 == 0 ? u"d2.xml,d1.xml" : deferredA;
        const auto makeA = [&] { return MakeTree(seedA, 0, orderedA, deferredA); };
        const auto makeB = [&] { return MakeTree(seedB, changes, orderedB, deferredB); };

        auto ra = makeA();
        auto rb = makeB();
        const uint32_t expected = RefCompare(ra.get(), rb.get());
        auto wa = makeA();
        auto wb = makeB();
        CompareExplanation why;
        const uint32_t walked = CompareNodes(wa.get(), wb.get(), &why);
        ASSERT_EQ(walked, expected) << "round " << round << " seeds " << seedA << "/" << seedB;
        auto qa = makeA();
        auto qb = makeB();
        ASSERT_EQ(CompareNodes(qa.get(), qb.get()), expected) << "explaining changes nothing";
        // The explanation tells the same answer: a shortfall exactly when not satisfied (the
        // last finding, tolerated ones met on the way before it), only tolerated differences
        // when the answer is 2, nothing for a match.
        EXPECT_EQ(why.result, expected);
        EXPECT_EQ(why.findings.empty(), expected == 0) << "round " << round;
        EXPECT_EQ(why.Shortfall() != nullptr, expected == 1) << "round " << round;
        for (size_t i = 0; i < why.findings.size(); ++i) {
            const bool decisive = expected == 1 && i + 1 == why.findings.size();
            EXPECT_EQ(IsShortfall(why.findings[i].reason), decisive)
                << "round " << round << " finding " << i;
            EXPECT_FALSE(why.findings[i].path.empty()) << "round " << round;
        }
        ++answers[expected];
    }
    // The generator must reach every answer often, or the agreement says little.
    for (const size_t count : answers)
        EXPECT_GT(count, 400u);

    SetDefaultLoaderSettings(saved);
}

} // namespace
} // namespace wbhw
