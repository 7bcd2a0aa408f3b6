// The attribute bag's tree: inheritance, adoption, paths, change notification, cluster texts.
#include "attribute_bag/TIOAttrBag.h"

#include "attribute_bag/WBAttrClusterParser.h"

#include <functional>
#include <gtest/gtest.h>

namespace {

// A bag /A/B/ with Mode on the root, Rate on A and Mode again (shadowing) on B.
struct Chain : ::testing::Test {
    TIOAttrBag root;
    TIOAttrBag& a = root.GetOrCreateChild(u"A");
    TIOAttrBag& b = a.GetOrCreateChild(u"B");
    void SetUp() override {
        root.SetValue(u"Mode", u"true");
        a.SetValue(u"Rate", u"10");
        b.InsertOwn(u"mode", u"local");
        root.NotifyChanges();
    }
};

TEST_F(Chain, SetValueChangesTheSetThatDefinesTheAttribute) {
    a.SetValue(u"MODE", u"TRUE"); // equal ignoring case: nothing changes
    EXPECT_FALSE(root.IsDirty());
    EXPECT_EQ(root.GetValue(u"Mode"), u"true");

    b.SetValue(u"rate", u"20"); // defined by A only
    EXPECT_TRUE(a.IsDirty());
    EXPECT_FALSE(b.IsDirty());
    EXPECT_EQ(a.GetValue(u"Rate"), u"20");
    EXPECT_TRUE(b.Attributes().find(u"Rate") == b.Attributes().end());

    b.AddIfAbsent(u"Rate", u"99"); // visible through A: no change
    EXPECT_EQ(b.Attributes().size(), 1u);
    EXPECT_FALSE(b.InsertOwn(u"MODE", u"other"));
    EXPECT_EQ(b.GetValue(u"Mode"), u"local");
}

TEST_F(Chain, VisibleAttributesComeOnceAtTheNearestDefinition) {
    std::u16string seen;
    for (const TIOAttrBag::Entry& e : b.VisibleAttributes())
        seen += TIOAttrBag::EntryPath(e) + u"=" + *e.value + u";";
    EXPECT_EQ(seen, u"/A/B/mode/=local;/A/Rate/=10;");

    std::vector<std::u16string> texts;
    const TIOAttrBag::NameSet leaveOut{u"MODE"};
    b.ExportClusterStrings(texts, &leaveOut);
    ASSERT_EQ(texts.size(), 1u);
    EXPECT_EQ(texts[0], wbhw::WriteAttrCluster(u"Rate", u"10"));
    // With the path, an inherited entry is named after the set it is exported from.
    EXPECT_EQ(b.ExportClusterString(b.FindVisible(u"rate"), true),
              wbhw::WriteAttrCluster(u"/A/B/Rate", u"10"));
}

TEST_F(Chain, PathsResolveFromRootOrRelativeAndAdoptionNeverLosesOrDuplicatesASet) {
    EXPECT_EQ(b.GetPath(), u"/A/B/");
    EXPECT_EQ(b.ResolvePath(u"/"), &root);
    EXPECT_EQ(root.ResolvePath(u"/a/b/"), &b);
    EXPECT_EQ(root.ResolvePath(u"/A/B"), &b);
    EXPECT_EQ(a.ResolvePath(u"B"), &b);
    EXPECT_EQ(root.ResolvePath(u"/A/X/"), nullptr);
    std::u16string rest = u"stale";
    EXPECT_EQ(root.ResolvePath(u"/A/X/Y", 0, &rest), &a);
    EXPECT_EQ(rest, u"X/Y");
    EXPECT_EQ(root.ResolvePath(u"/A/B/", 0, &rest), &b);
    EXPECT_EQ(rest, u"");
    auto clash = std::make_unique<TIOAttrBag>(u"b");
    auto [existing, inserted] = a.AdoptChild(clash);
    EXPECT_FALSE(inserted);
    EXPECT_EQ(existing, &b);
    ASSERT_NE(clash, nullptr); // still the caller's
    EXPECT_EQ(clash->Parent(), nullptr);

    auto fresh = std::make_unique<TIOAttrBag>(u"C");
    TIOAttrBag* raw = fresh.get();
    EXPECT_EQ(a.AdoptChild(fresh), std::make_pair(raw, true));
    EXPECT_EQ(fresh, nullptr);
    EXPECT_EQ(raw->GetPath(), u"/A/C/");
    EXPECT_EQ(&a.GetOrCreateChild(u"c"), raw);

    // Renaming a child re-keys it, and refuses a sibling's name.
    EXPECT_FALSE(raw->SetName(u"B"));
    EXPECT_TRUE(raw->SetName(u"D"));
    EXPECT_EQ(a.FindChild(u"d"), raw);
    EXPECT_EQ(a.FindChild(u"C"), nullptr);
    EXPECT_TRUE(a.RemoveChild(u"D"));
    EXPECT_FALSE(a.RemoveChild(u"D"));
}

// Records each call; optionally fails or runs an action.
struct Recorder : TIOAttrBag::ChangeObserver {
    std::u16string* log;
    int32_t answer = 0;
    std::function<void()> action;
    explicit Recorder(std::u16string* l) : log(l) {}
    int32_t OnAttrBagChanged(TIOAttrBag& set, bool wasDirty, bool forced) override {
        *log += set.GetPath() + (wasDirty ? u"d" : u"") + (forced ? u"f" : u"") + u";";
        if (action)
            action();
        return answer;
    }
};

TEST_F(Chain, NotificationReachesDescendantsAndStopsAtAFailure) {
    std::u16string log;
    Recorder r0(&log), ra(&log), rb(&log), rc(&log);
    TIOAttrBag& c = root.GetOrCreateChild(u"C");
    root.SetObserver(&r0);
    a.SetObserver(&ra);
    b.SetObserver(&rb);
    c.SetObserver(&rc);

    a.SetValue(u"Rate", u"11");
    EXPECT_EQ(root.NotifyChanges(), 0);
    EXPECT_EQ(log, u"/A/d;/A/B/f;"); // C is untouched: not called
    EXPECT_FALSE(a.IsDirty());

    log.clear();
    ra.answer = -5;
    a.SetValue(u"Rate", u"12");
    b.SetValue(u"mode", u"x");
    EXPECT_EQ(root.NotifyChanges(), -5);
    EXPECT_TRUE(a.IsDirty());
    EXPECT_TRUE(b.IsDirty()); // never reached

    // An observer that removes a later sibling does not make the walk touch a dead set.
    log.clear();
    ra.answer = 0;
    ra.action = [&] { root.RemoveChild(u"C"); };
    EXPECT_EQ(root.NotifyChanges(true), 0);
    EXPECT_EQ(log, u"/f;/A/df;/A/B/df;");
}

TEST_F(Chain, ImportAppliesTextsUntilTheFirstBadOne) {
    const std::vector<std::u16string> texts{wbhw::WriteAttrCluster(u"Rate", u"30"), u"<broken",
                                            wbhw::WriteAttrCluster(u"New", u"v")};
    EXPECT_EQ(b.ImportClusterStrings(texts), static_cast<int32_t>(0x80004005u));
    EXPECT_EQ(a.GetValue(u"Rate"), u"30");
    EXPECT_EQ(b.FindValue(u"New"), nullptr);
    EXPECT_EQ(b.ImportClusterStrings({texts[2]}), 0);
    EXPECT_EQ(b.GetValue(u"new"), u"v");
}

} // namespace
