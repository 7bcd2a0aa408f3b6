// The memory a tree keeps for its entries and their names: shared, reused, and bounded when a
// tree is edited for a long time.
#include "resource_tree/NameStore.h"
#include "resource_tree/ResTreeNode.h"
#include "resource_tree/TreeArena.h"

#include <cstdint>
#include <gtest/gtest.h>
#include <set>
#include <string>
#include <vector>

namespace wbhw {
namespace {

std::u16string Numbered(const char16_t* stem, size_t n) {
    std::u16string name = stem;
    for (const char c : std::to_string(n))
        name += static_cast<char16_t>(c);
    return name;
}

TEST(NameStore, KeepsOneCopyPerSpellingAndDropsUnusedOnesLater) {
    NameStore store(true);
    NameStore::Name& first = store.Intern(u"Direction");
    NameStore::AddUse(first);
    EXPECT_EQ(&store.Intern(u"Direction"), &first);
    // Another case is another spelling: entries give back their names as they were written.
    NameStore::Name& other = store.Intern(u"direction");
    EXPECT_NE(&other, &first);
    EXPECT_EQ(other.spelling, u"direction");
    // Names made, used and given back by a long run of edits, each spelled differently.
    for (size_t i = 0; i < 100000; ++i) {
        NameStore::Name& name = store.Intern(Numbered(u"Pin", i));
        NameStore::AddUse(name);
        NameStore::Release(name);
    }
    EXPECT_LT(store.size(), 4096u);
    // A name in use is never dropped.
    EXPECT_EQ(&store.Intern(u"Direction"), &first);
    EXPECT_EQ(first.spelling, u"Direction");
    NameStore::Release(first);
}

TEST(TreeArena, ReusesGivenBackBlocksAndDropsThemWhenClosed) {
    TreeArena arena;
    std::vector<void*> blocks;
    for (int i = 0; i < 3000; ++i) {
        blocks.push_back(arena.Allocate(88));
        EXPECT_EQ(reinterpret_cast<uintptr_t>(blocks.back()) % TreeArena::kGranule, 0u);
    }
    EXPECT_EQ(std::set<void*>(blocks.begin(), blocks.end()).size(), blocks.size());
    const size_t slabs = arena.SlabBytes();
    for (void* block : blocks)
        arena.Release(block, 88);
    const std::set<void*> given(blocks.begin(), blocks.end());
    for (int i = 0; i < 3000; ++i)
        EXPECT_EQ(given.count(arena.Allocate(96)), 1u) << "block " << i;
    EXPECT_EQ(arena.SlabBytes(), slabs);
    arena.Close();
    arena.Release(blocks[0], 88);
    EXPECT_EQ(given.count(arena.Allocate(88)), 0u);
}

TEST(TreeMemory, NodesEditedForLongKeepTheirAnswersAndOrder) {
    ResTreeNode root(WString(), u"Target", false);
    ResTreeNode* holder = root.AddChild(root.End(), u"Holder", u"Group", false).node;
    ASSERT_NE(holder, nullptr);
    for (size_t round = 0; round < 50; ++round) {
        for (size_t i = 0; i < 200; ++i)
            holder->AddText(holder->End(), Numbered(u"Value", round * 1000 + i), u"x");
        ResTreeNode* list =
            holder->AddChild(holder->End(), Numbered(u"Node", round), u"Group", true).node;
        for (size_t i = 0; i < 30; ++i)
            list->AddText(list->End(), u"Pin", Numbered(u"", i));
        while (!holder->IsEmpty())
            holder->RemoveAt(holder->Begin());
    }
    holder->AddText(holder->End(), u"beta", u"2");
    holder->AddText(holder->End(), u"ALPHA", u"1");
    holder->AddText(holder->End(), u"Alpha", u"3");
    ASSERT_EQ(holder->EntryCount(), 2u);
    EXPECT_EQ(holder->Begin()->Name(), u"ALPHA");
    EXPECT_EQ(*holder->TextAt(u"alpha"), u"1");
    EXPECT_EQ(*holder->TextAt(u"BETA"), u"2");
}

TEST(TreeMemory, NodeNamesAndTypesStayRightThroughRenames) {
    ResTreeNode root(WString(), u"Target", false);
    ResTreeNode* node = root.AddChild(root.End(), u"DIO0", u"IOResource", false).node;
    ASSERT_NE(node, nullptr);
    for (size_t i = 1; i <= 5000; ++i)
        node->SetNameAndType(Numbered(u"DIO", i), node->Type());
    EXPECT_EQ(node->Name(), u"DIO5000");
    EXPECT_EQ(node->Type(), u"IOResource");
    EXPECT_EQ(node->Path(), u"/DIO5000");
    // Each one given as the other: both are read before either old spelling goes.
    node->SetNameAndType(node->Type(), node->Name());
    EXPECT_EQ(node->Name(), u"IOResource");
    EXPECT_EQ(node->Type(), u"DIO5000");
    EXPECT_EQ(root.Begin()->Name(), u"DIO0");
}

} // namespace
} // namespace wbhw
