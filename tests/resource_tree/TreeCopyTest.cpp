// Names lists, prototypes and variables.
#include "TreeTestSupport.h"
#include "resource_tree/ParseStack.h"

#include <gtest/gtest.h>

namespace wbhw {
namespace {
using namespace test;

bool HasError(ResTreeNode& node, std::u16string_view part) {
    return TextOf(node, u"XMLParseErrors").find(part) != std::u16string::npos;
}

TEST(TreeCopy, NamesListsMixNamesAndRangesCopyingTheFirstNodeCappedOrSkippedWhenHugeOrEmpty) {
    auto root = Load(uR"(<Top ordered="true">
        <First/>
        <IOResource names="DIO[n=0..3]">
            <Line>#{n}</Line><Label>#{name} of #{ n }</Label><Keep>#{other}</Keep>
            <Group name="inner"><Deep>#{n}</Deep></Group>
        </IOResource>
        <Last/>
    </Top>)");
    EXPECT_EQ(Names(*root),
              (std::vector<std::u16string>{u"First", u"DIO0", u"DIO1", u"DIO2", u"DIO3", u"Last"}));
    for (int i = 0; i < 4; ++i) {
        const std::u16string name = u"DIO" + std::u16string(1, static_cast<char16_t>(u'0' + i));
        ResTreeNode* dio = ChildOf(*root, name);
        ASSERT_NE(dio, nullptr);
        EXPECT_EQ(dio->Type(), u"IOResource");
        EXPECT_EQ(TextOf(*dio, u"Line"), name.substr(3));
        EXPECT_EQ(TextOf(*dio, u"Label"), name + u" of " + name.substr(3));
        EXPECT_EQ(TextOf(*dio, u"Keep"), u"#{other}");
        EXPECT_EQ(TextOf(*ChildOf(*dio, u"inner"), u"Deep"), name.substr(3));
    }
    root = Load(uR"(<Top ordered="true">
        <Port names="A, B[i=2..3]x, C\,D, E[j=5..4]"><Idx>#{i}/#{j}/#{name}</Idx></Port>
    </Top>)");
    EXPECT_EQ(Names(*root), (std::vector<std::u16string>{u"A", u"B2x", u"B3x", u"C,D"}));
    EXPECT_EQ(TextOf(*ChildOf(*root, u"A"), u"Idx"), u"#{i}/#{j}/A");
    EXPECT_EQ(TextOf(*ChildOf(*root, u"B3x"), u"Idx"), u"3/#{j}/B3x");
    LoaderSettings settings;
    settings.maxNames = 100;
    root = Load(uR"(<Top>
        <Port names="X[i=0..4000000000]"/>
        <Port names="Y[i=9..1]"><Inner><Deeper/></Inner></Port>
        <After/>
    </Top>)",
                &settings);
    EXPECT_EQ(root->EntryCount(), 102u); // 100 names, the messages, After
    EXPECT_NE(ChildOf(*root, u"X99"), nullptr);
    EXPECT_EQ(ChildOf(*root, u"X100"), nullptr);
    EXPECT_TRUE(HasError(*root, u"yields more than 100 names"));
    EXPECT_TRUE(HasError(*root, u"yields no name; the element is skipped: Y[i=9..1]"));
    EXPECT_EQ(TextOf(*root, u"After"), u"");
    EXPECT_EQ(root->Find(u"Inner"), root->End());
}

TEST(TreeCopy, PrototypesAndVariablesAreCopiedWithinBudgetUnlessAPrototypeHoldsTheNewNode) {
    auto root = Load(uR"(<Top>
        <Group name="other"/>
        <Group name="proto"><A>1</A><B>#{kind}</B><Group name="sub"><C>c</C></Group>
            <:Link name="toOther">../other</:Link></Group>
        <Group name="made" prototype="proto" kind="analog"><A>2</A></Group>
        <Group name="anchored" prototype="#{document-root}/proto"/>
        <Group name="lost" prototype="nowhere"><A>3</A></Group>
    </Top>)");
    ResTreeNode* made = ChildOf(*root, u"made");
    ASSERT_NE(made, nullptr);
    EXPECT_EQ(TextOf(*made, u"A"), u"2");
    EXPECT_EQ(TextOf(*made, u"B"), u"analog");
    EXPECT_EQ(TextOf(*ChildOf(*made, u"sub"), u"C"), u"c");
    // The copied link is the path from the copy to where the original points, unshortened.
    EXPECT_EQ(TextOf(*made, u"toOther"), u"../proto/../other");
    EXPECT_EQ(made->NodeAt(made->Find(u"toOther")), ChildOf(*root, u"other"));
    EXPECT_EQ(TextOf(*ChildOf(*root, u"anchored"), u"A"), u"1");
    EXPECT_EQ(TextOf(*ChildOf(*root, u"lost"), u"A"), u"3");
    EXPECT_TRUE(HasError(*root, u"Unable to find prototype node: nowhere"));
    root = Load(uR"(<Top>
        <Group name="outer"><X>1</X>
            <Group name="self" prototype=".."/>
            <Group name="loop" prototype="../loop"/>
        </Group>
        <Group name="outer2" prototype="outer2/inner"><Group name="inner"/></Group>
    </Top>)");
    ResTreeNode* outer = ChildOf(*root, u"outer");
    ASSERT_NE(outer, nullptr);
    EXPECT_TRUE(ChildOf(*outer, u"self")->IsEmpty());
    EXPECT_TRUE(HasError(*outer, u"contains the node being built"));
    EXPECT_NE(ChildOf(*root, u"outer2"), nullptr);
    // A replaced prototype is not read after it is gone.
    root = Load(uR"(<Top>
        <Group name="a"><Group name="p"><X>1</X></Group></Group>
        <Group name="a" prototype="a/p" replace="yes"><Y>2</Y></Group>
    </Top>)");
    ResTreeNode* a = ChildOf(*root, u"a");
    EXPECT_EQ(TextOf(*a, u"X"), u"<absent>");
    EXPECT_EQ(TextOf(*a, u"Y"), u"2");
    EXPECT_TRUE(HasError(*root, u"Unable to find prototype node: a/p"));
    // Variables come from open elements, outermost first; copies stay within the entry budget.
    root = Load(uR"(<Top vendor="outer" board="b1">
        <Group name="g" vendor="inner" rev="2">
            <Text>#{vendor}-#{board}-#{rev}-#{missing}-#{name}-#{document-root}-#{unclosed</Text>
        </Group>
        <Sibling>#{rev}</Sibling>
    </Top>)");
    EXPECT_EQ(TextOf(*ChildOf(*root, u"g"), u"Text"),
              u"outer-b1-2-#{missing}-#{name}-/-#{unclosed");
    EXPECT_EQ(TextOf(*root, u"Sibling"), u"#{rev}");
    // Each level holds two copies of the level before: without a budget this doubles per line.
    std::u16string doc = u"<Top><Group name='l0'><X>x</X></Group>";
    const auto level = [](int i) {
        std::u16string name = u"l";
        name += static_cast<char16_t>(u'0' + i % 10);
        name += static_cast<char16_t>(u'a' + i / 10);
        return name;
    };
    for (int i = 1; i < 40; ++i) {
        const std::u16string prev = level(i - 1);
        const std::u16string me = level(i);
        doc += u"<Group name='" + me + u"'><Group name='p' prototype='../" + prev +
               u"'/><Group name='q' prototype='../" + prev + u"'/></Group>";
    }
    doc += u"</Top>";
    // The first level's name carries no suffix letter; give it one.
    doc.replace(doc.find(u"l0'"), 3, u"l0a'");
    LoaderSettings settings;
    settings.maxEntries = 10000;
    int32_t result = 0;
    root = Load(doc, &settings, &result);
    EXPECT_EQ(result, static_cast<int32_t>(0x80004005u));
    EXPECT_TRUE(HasError(*root, u"more than 10000 entries"));
}

} // namespace
} // namespace wbhw
