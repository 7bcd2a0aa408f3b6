// Resource-tree nodes: entries, lookups, removal, paths, links and reservations.
#include "resource_tree/ResTreeNode.h"

#include "TreeTestSupport.h"
#include "kern/Collate.h"
#include "resource_tree/TypeRegistry.h"

#include <gtest/gtest.h>

namespace wbhw {
namespace {
using namespace test;

TEST(ResTreeNode, UnorderedNodesKeepOneEntryPerNameSortedOrderedOnesKeepDuplicatesInOrder) {
    ResTreeNode node(u"n", u"IOResource", false);
    // Names arrive out of order, and every fourth one again in other case.
    for (int i = 0; i < 200; ++i) {
        const int k = (i * 73) % 200;
        const std::u16string name = u"Pin" +
                                    std::u16string(1, static_cast<char16_t>(u'a' + k / 26)) +
                                    std::u16string(1, static_cast<char16_t>(u'a' + k % 26));
        EXPECT_TRUE(node.AddText(node.End(), name, u"first").inserted);
        if (k % 4 == 0) {
            std::u16string upper = name;
            for (char16_t& c : upper)
                c = (c >= u'a' && c <= u'z') ? static_cast<char16_t>(c - 32) : c;
            const auto again = node.AddChild(node.End(), upper, u"X", false);
            EXPECT_FALSE(again.created);
            EXPECT_EQ(again.node, nullptr); // a text of that name is answered as it is
            EXPECT_EQ(again.position->Name(), name);
        }
    }
    EXPECT_EQ(node.EntryCount(), 200u);
    // A text of a name already there keeps the first one's value.
    const auto again = node.AddText(node.End(), u"PINAA", u"second");
    EXPECT_FALSE(again.inserted);
    EXPECT_EQ(*again.position->Text(), u"first");
    const std::vector<std::u16string> names = Names(node);
    for (size_t i = 1; i < names.size(); ++i)
        EXPECT_LT(qv::kern::CompareNoCase(names[i - 1], names[i]), 0) << i;
    EXPECT_EQ(*node.Find(u"PINHB")->Text(), u"first");
    ResTreeNode list(u"n", u"ResourceList", true);
    list.AddText(list.End(), u"Pin", u"first");
    const auto second = list.AddText(list.End(), u"PIN", u"second");
    EXPECT_TRUE(second.inserted);
    list.AddText(second.position, u"before", u"");
    EXPECT_EQ(Names(list), (std::vector<std::u16string>{u"Pin", u"before", u"PIN"}));
    EXPECT_EQ(*list.Find(u"pin")->Text(), u"first");
    // Made unordered, the list keeps the first entry of each name, sorted; made ordered again,
    // it keeps them in that order and appends.
    list.SetOrdered(false);
    EXPECT_EQ(Names(list), (std::vector<std::u16string>{u"before", u"Pin"}));
    EXPECT_EQ(TextOf(list, u"PIN"), u"first");
    list.SetOrdered(true);
    list.AddText(list.End(), u"BEFORE", u"");
    EXPECT_EQ(Names(list), (std::vector<std::u16string>{u"before", u"Pin", u"BEFORE"}));
}

TEST(ResTreeNode, LargeOrderedNodesFindTheFirstOfEachNameAsAScanWould) {
    ResTreeNode node(u"n", u"ResourceList", true);
    std::vector<std::u16string> spellings = {u"a", u"A", u"b", u"B", u"c"};
    auto firstByScan = [&node](std::u16string_view name) {
        for (ResTreePosition at = node.Begin(); at != node.End(); ++at) {
            if (qv::kern::EqualsNoCase(at->Name(), name))
                return at;
        }
        return node.End();
    };
    uint32_t state = 7;
    auto next = [&state] { return state = state * 1103515245u + 12345u; };
    for (int round = 0; round < 1000; ++round) {
        const std::u16string name = spellings[next() % spellings.size()] +
                                    std::u16string(1, static_cast<char16_t>(u'0' + next() % 8));
        const uint32_t action = next() % 5;
        ResTreePosition at = node.Begin();
        if (!node.IsEmpty()) {
            for (uint32_t steps = next() % node.EntryCount(); steps > 0; --steps)
                ++at;
        }
        if (action == 0 && !node.IsEmpty()) {
            // Insert before some existing entry.
            node.AddText(at, name, u"");
        } else if (action == 4 && !node.IsEmpty()) {
            // Remove any entry, the first of its name or a later one.
            node.RemoveAt(at);
        } else if (action == 1) {
            node.RemoveByName(name);
        } else {
            node.AddText(node.End(), name, u"");
        }
        for (const std::u16string& probe : {name, std::u16string(u"A3"), std::u16string(u"c7")})
            ASSERT_TRUE(node.Find(probe) == firstByScan(probe)) << round;
        for (char16_t digit = u'0'; digit < u'8'; ++digit) {
            const std::u16string probe = std::u16string(u"b") + digit;
            ASSERT_TRUE(node.Find(probe) == firstByScan(probe)) << round;
        }
    }
    EXPECT_GT(node.EntryCount(), 30u);
}

TEST(ResTreeNode, TextsAreSetOnTextEntriesOnlyPathsResolveThroughAnchorsAndLinksReservesInOrder) {
    ResTreeNode texts(u"", u"Target", false);
    EXPECT_TRUE(texts.SetText(u"Value", u"1"));
    EXPECT_EQ(*texts.TextAt(u"value"), u"1");
    EXPECT_TRUE(texts.SetText(u"VALUE", u"2"));
    EXPECT_EQ(*texts.TextAt(u"Value"), u"2");
    texts.AddLink(texts.End(), u"l", u"");
    EXPECT_FALSE(texts.SetTextAt(texts.Find(u"l"), u"x"));
    EXPECT_FALSE(texts.SetTextAt(texts.End(), u"x"));
    EXPECT_EQ(texts.TextAt(u"l"), nullptr);
    EXPECT_EQ(texts.TextAt(u"missing"), nullptr);
    // Paths escape slashes and resolve back, from an anchor or the node itself.
    ResTreeNode top(u"top", u"Target", false);
    ResTreeNode* ab = top.AddChild(top.End(), u"a/b", u"Module", false).node;
    ResTreeNode* leaf = ab->AddChild(ab->End(), u"c\\d", u"IOResource", false).node;
    EXPECT_EQ(top.Path(), u"/");
    EXPECT_EQ(ab->Path(), u"/a\\/b");
    EXPECT_EQ(leaf->Path(), u"/a\\/b/c\\\\d");
    EXPECT_EQ(top.ResolvePath(ab->Path()), ab);
    EXPECT_EQ(leaf->ResolvePath(leaf->Path()), leaf);
    EXPECT_EQ(leaf->ResolvePath(u"../.."), &top);
    EXPECT_EQ(leaf->ResolvePath(u"./../C\\\\D"), leaf);
    EXPECT_EQ(top.ResolvePath(u".."), nullptr);
    EXPECT_EQ(top.ResolvePath(u""), &top);
    EXPECT_EQ(top.ResolvePath(u"a\\/b/missing"), nullptr);
    ResTreeNode root(u"", u"Target", false);
    ResTreeNode* doc = root.AddChild(root.End(), u"doc", u"Module", false).node;
    ResTreeNode* x = doc->AddChild(doc->End(), u"x", u"IOResource", false).node;
    EXPECT_EQ(x->ResolvePath(u"#{document-root}/x", doc), x);
    EXPECT_EQ(x->ResolvePath(u"#{Document-Root}", doc), doc);
    // Without a document root (or with another anchor) the walk starts at the node itself.
    EXPECT_EQ(doc->ResolvePath(u"#{document-root}/x", nullptr), x);
    EXPECT_EQ(doc->ResolvePath(u"#{other}/x", x), x);
    // No closing brace: no anchor, just a name that is not there.
    EXPECT_EQ(doc->ResolvePath(u"#{document-root", doc), nullptr);
    ResTreeNode links(u"", u"Target", true);
    ResTreeNode* linked = links.AddChild(links.End(), u"A", u"Module", false).node;
    links.AddLink(links.End(), u"toA", u"A");
    links.AddLink(links.End(), u"dangling", u"nowhere");
    links.AddLink(links.End(), u"empty", u"");
    EXPECT_EQ(links.NodeAt(links.Find(u"toA")), linked);
    EXPECT_EQ(links.ResolvePath(u"toA"), linked);
    EXPECT_EQ(links.NodeAt(links.Find(u"dangling")), nullptr);
    EXPECT_EQ(links.NodeAt(links.Find(u"empty")), nullptr);
    // A link that leads to itself, directly or through another link.
    links.AddLink(links.Begin(), u"self", u"self");
    links.AddLink(links.End(), u"p", u"q");
    links.AddLink(links.End(), u"q", u"p");
    EXPECT_EQ(links.NodeAt(links.Find(u"self")), nullptr);
    EXPECT_EQ(links.ResolvePath(u"p/x"), nullptr);
    // Reserved nodes follow the list in order.
    ResTreeNode owner(u"", u"Target", false);
    ResTreeNode* a = owner.AddChild(owner.End(), u"a", u"IOResource", false).node;
    ResTreeNode* b = owner.AddChild(owner.End(), u"b", u"IOResource", false).node;
    ResTreeNode* user = owner.AddChild(owner.End(), u"user", u"IOResource", false).node;
    user->SetText(u"Reserves", u" ../b , ../missing,../a ");
    EXPECT_EQ(user->ReservedNodes(true), (std::vector<ResTreeNode*>{b, a}));
    user->RemoveByName(u"Reserves");
    EXPECT_TRUE(user->ReservedNodes(false).empty());
}

TEST(ResTreeNode, RemovalEmptiesChildrenFromTheEndKeepsTextsAndSparesNodesInUse) {
    ResTreeNode root(u"", u"Target", true);
    root.AddText(root.End(), u"t", u"x");
    root.AddLink(root.End(), u"l", u"");
    for (const char16_t* name : {u"a", u"b", u"c"})
        root.AddChild(root.End(), name, u"Module", false);
    root.RemoveAllChildren();
    EXPECT_EQ(Names(root), (std::vector<std::u16string>{u"t", u"l"}));
    root.RemoveByName(u"absent");
    EXPECT_FALSE(root.RemoveAt(root.End()));
    EXPECT_TRUE(root.RemoveAt(root.Find(u"T")));
    EXPECT_EQ(Names(root), std::vector<std::u16string>{u"l"});
    ResTreeNode holder(u"", u"Target", false);
    ResTreeNode* a = holder.AddChild(holder.End(), u"a", u"Module", false).node;
    ResTreeNode* deep = a->AddChild(a->End(), u"deep", u"Module", false).node;
    {
        NodeInUse hold(deep);
        EXPECT_FALSE(holder.RemoveAt(holder.Find(u"a")));
        EXPECT_EQ(ChildOf(holder, u"a"), a);
    }
    EXPECT_TRUE(holder.RemoveAt(holder.Find(u"a")));
    EXPECT_TRUE(holder.IsEmpty());
}

TEST(TypeRegistry, ListTypesComeFromNamesAndBases) {
    for (const char16_t* list : {u"ResourceList", u"Target", u"connector", u"Module", u"FooList"})
        EXPECT_TRUE(IsListType(list)) << std::u16string(list).size();
    for (const char16_t* plain : {u"Resource", u"IOResource", u"Foo", u"Listing", u""})
        EXPECT_FALSE(IsListType(plain)) << std::u16string(plain).size();
}

} // namespace
} // namespace wbhw
