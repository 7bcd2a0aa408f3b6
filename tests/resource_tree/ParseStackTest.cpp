// The loader's core: what elements become, texts, merging, capture and the error messages.
#include "resource_tree/ParseStack.h"

#include "TreeTestSupport.h"

#include <gtest/gtest.h>

namespace wbhw {
namespace {
using namespace test;

constexpr int32_t kFail = static_cast<int32_t>(0x80004005u);

TEST(ParseStack, DocumentElementDescribesTheRootOrANewChildAndChildrenBecomeEntries) {
    int32_t result = -1;
    auto root = Load(uR"(<Target name="T">
        <Value>  padded  </Value>
        <Keep xml:space="preserve">  padded  </Keep>
        <IOResource name="DIO0"><Direction>in</Direction></IOResource>
        <Empty/>
        <Named name="n"/>
        <!-- comments, processing instructions and stray text vanish -->
        <?pi data?> stray
        <Module><Inner/></Module>
    </Target>)",
                     nullptr, &result);
    EXPECT_EQ(result, 0);
    EXPECT_EQ(root->Name(), u"T");
    EXPECT_EQ(root->Type(), u"Target");
    EXPECT_TRUE(root->IsOrdered()); // Target is a list type
    EXPECT_EQ(TextOf(*root, u"Value"), u"padded");
    EXPECT_EQ(TextOf(*root, u"Keep"), u"  padded  ");
    EXPECT_EQ(TextOf(*root, u"Empty"), u"");
    ResTreeNode* dio = ChildOf(*root, u"DIO0");
    ASSERT_NE(dio, nullptr);
    EXPECT_EQ(dio->Type(), u"IOResource");
    EXPECT_FALSE(dio->IsOrdered());
    EXPECT_EQ(TextOf(*dio, u"direction"), u"in");
    // A leaf with a name is a node; a container without one is a node named by its tag.
    ASSERT_NE(ChildOf(*root, u"n"), nullptr);
    EXPECT_EQ(ChildOf(*root, u"n")->Type(), u"Named");
    ASSERT_NE(ChildOf(*root, u"Module"), nullptr);
    EXPECT_EQ(root->EntryCount(), 6u);
    EXPECT_EQ(root->Find(u"XMLParseErrors"), root->End());
    // As a child, the document element makes a new child.
    ResTreeNode parent(u"", u"Target", false);
    ResTreeNode* out = nullptr;
    EXPECT_EQ(parent.ParseText(u"<Module name='m'><X>1</X></Module>", true, &out), 0);
    ASSERT_NE(out, nullptr);
    EXPECT_EQ(out, ChildOf(parent, u"m"));
    EXPECT_EQ(TextOf(*out, u"X"), u"1");
    EXPECT_EQ(parent.Name(), u"");
}

TEST(ParseStack, OrderedAndNextControlTheOrderSameNamedNodesMergeUnlessReplaced) {
    auto root = Load(uR"(<Top ordered="yes"><b/><c/><a next="c"/><z next="missing"/></Top>)");
    EXPECT_EQ(Names(*root), (std::vector<std::u16string>{u"b", u"a", u"c", u"z"}));
    auto unordered = Load(uR"(<PinList ordered="Off"><b/><a/></PinList>)");
    EXPECT_FALSE(unordered->IsOrdered());
    // Another tag replaces the node.
    root = Load(uR"(<Top>
        <Module name="m"><A>1</A><B>1</B></Module>
        <Module name="M"><A>2</A><C>2</C></Module>
        <Other name="m"><D/></Other>
    </Top>)");
    ASSERT_NE(ChildOf(*root, u"m"), nullptr);
    EXPECT_EQ(ChildOf(*root, u"m")->Type(), u"Other");

    // (Group is no list type: its texts are unique by name.) "replace" rebuilds its own element
    // only: the later "b" is merged as the document asks.
    root = Load(uR"(<Top><V>1</V><V>2</V>
        <Group name="m"><A>1</A><B>1</B></Group>
        <Group name="m"><A>2</A><C>2</C></Group>
        <Group name="r"><A>1</A><B>1</B></Group>
        <Group name="b"><X>1</X></Group>
        <Group name="r" replace="true"><A>2</A><W>1</W><W>2</W></Group>
        <Group name="b"><Y>2</Y></Group>
    </Top>)");
    EXPECT_EQ(TextOf(*root, u"V"), u"2");
    ResTreeNode* m = ChildOf(*root, u"m");
    EXPECT_EQ(TextOf(*m, u"A"), u"2");
    EXPECT_EQ(TextOf(*m, u"B"), u"1");
    EXPECT_EQ(TextOf(*m, u"C"), u"2");
    ResTreeNode* r = ChildOf(*root, u"r");
    EXPECT_EQ(TextOf(*r, u"A"), u"2");
    EXPECT_EQ(TextOf(*r, u"B"), u"<absent>");
    EXPECT_EQ(TextOf(*r, u"W"), u"1");
    EXPECT_EQ(TextOf(*ChildOf(*root, u"b"), u"X"), u"1");
    EXPECT_EQ(TextOf(*ChildOf(*root, u"b"), u"Y"), u"2");
}

TEST(ParseStack, XmlPathAndReferenceTextsAreNormalOnlyTheTextInsideALeafIsGathered) {
    auto root = Load(uR"(<Top>
        <Cfg name="flat" type="xml"><a x="1" B="2">text</a><b/></Cfg>
        <Cfg name="deep" type="xml"><a><b y="&lt;"><c/></b>t</a><d/></Cfg>
        <Cfg name="none" type="xml"/>
        <After>kept</After>
    </Top>)");
    EXPECT_EQ(TextOf(*root, u"flat"), u"<a B=\"2\" x=\"1\"></a><b></b>");
    EXPECT_EQ(TextOf(*root, u"deep"), u"<a><b y=\"<\"><c></c></b></a><d></d>");
    // A childless one leaves an empty text and does not swallow its sibling.
    EXPECT_EQ(TextOf(*root, u"none"), u"");
    EXPECT_EQ(TextOf(*root, u"After"), u"kept");
    EXPECT_EQ(root->EntryCount(), 4u);
    root = Load(uR"(<Top>
        <SomePath>a//b/c/</SomePath>
        <LibDir>/abs/x</LibDir>
        <Plain type="path">p/q</Plain>
        <NotAPath type="text">a//b</NotAPath>
        <Module name="m"><Reserves>/a, ../b ,/m/c\,d</Reserves></Module>
        <Reserves>/m</Reserves>
    </Top>)");
    EXPECT_EQ(TextOf(*root, u"SomePath"), u"a/b/c");
    EXPECT_EQ(TextOf(*root, u"LibDir"), u"/abs/x");
    EXPECT_EQ(TextOf(*root, u"Plain"), u"p/q");
    EXPECT_EQ(TextOf(*root, u"NotAPath"), u"a//b");
    EXPECT_EQ(TextOf(*ChildOf(*root, u"m"), u"Reserves"), u"../a,../b,c\\,d");
    // Written in the document element, the paths go down from the root and resolve.
    EXPECT_EQ(TextOf(*root, u"Reserves"), u"m");
    EXPECT_EQ(root->ReservedNodes(true), std::vector<ResTreeNode*>{ChildOf(*root, u"m")});
    root = Load(uR"(<Top>lead
        <A>  x  <!-- a comment splits the text --> y </A>between
        <B xml:space="preserve"> p <![CDATA[<q>]]> </B>tail
        <G>stray<C>1</C>after C</G>
        <:Link name="l">C<ignored>inner</ignored> </:Link>
    </Top>)");
    EXPECT_EQ(TextOf(*root, u"A"), u"x   y");
    EXPECT_EQ(TextOf(*root, u"B"), u" p <q> ");
    ResTreeNode* g = ChildOf(*root, u"G");
    ASSERT_NE(g, nullptr);
    EXPECT_EQ(Names(*g), std::vector<std::u16string>{u"C"});
    EXPECT_EQ(TextOf(*g, u"C"), u"1");
    EXPECT_EQ(root->EntryCount(), 4u + 1u); // A, B, G, the link's text and the message
    // Reference lists of one reference are trimmed or rewritten as longer ones.
    root = Load(uR"(<Top>
        <Group name="g">
            <Reserves xml:space="preserve">  ../b  </Reserves>
            <Mine type="ref-list" xml:space="preserve"> /Top/g/x </Mine>
            <Esc type="ref-list">x\y</Esc>
            <Blank type="ref-list" xml:space="preserve">   </Blank>
        </Group>
    </Top>)");
    g = ChildOf(*root, u"g");
    ASSERT_NE(g, nullptr);
    EXPECT_EQ(TextOf(*g, u"Reserves"), u"../b");
    // An absolute reference is found after trimming, even with blanks kept around it.
    EXPECT_EQ(TextOf(*g, u"Mine"), u"../Top/g/x");
    EXPECT_EQ(TextOf(*g, u"Esc"), u"x\\y");
    EXPECT_EQ(TextOf(*g, u"Blank"), u"");
}

TEST(ParseStack, SyntaxErrorsAccumulateInContextDeepNestingStopsTheLoadTextKeepsEveryPlane) {
    ResTreeNode parsed(u"", u"", false);
    const std::u16string bad = u"<Top>\n<A>1</A>\n<B>\n</Top>\n";
    EXPECT_EQ(parsed.ParseText(bad, false), kFail);
    const std::u16string first = TextOf(parsed, u"XMLParseErrors");
    EXPECT_EQ(first, u"Error on line 4 at column 2\n   mismatched tag\n   \n<B>\n</Top>\n\n");
    // The entries made before the error stay.
    EXPECT_EQ(TextOf(parsed, u"A"), u"1");
    EXPECT_EQ(parsed.ParseText(u"<Top><", false), kFail);
    const std::u16string both = TextOf(parsed, u"XMLParseErrors");
    EXPECT_EQ(both.substr(0, first.size()), first);
    EXPECT_EQ(both.substr(first.size()),
              u"Error on line 1 at column 5\n   unclosed token\n   <Top><\n");
    // Text input keeps characters beyond the basic plane; deep nesting stops the load.
    auto root = Load(u"<Top><V>\U0001F600\u00E9</V></Top>");
    EXPECT_EQ(TextOf(*root, u"V"), u"\U0001F600\u00E9");
    int32_t result = 0;
    Load(u"<Top><V>\xD800</V></Top>", nullptr, &result);
    EXPECT_EQ(result, kFail);
    LoaderSettings settings;
    settings.maxElementDepth = 50;
    std::u16string doc;
    for (int i = 0; i < 80; ++i)
        doc += u"<a>";
    doc += u"<x/>";
    for (int i = 0; i < 80; ++i)
        doc += u"</a>";
    root = Load(doc, &settings, &result);
    EXPECT_EQ(result, kFail);
    EXPECT_NE(TextOf(*root, u"XMLParseErrors").find(u"nested deeper than 50"),
              std::u16string::npos);
}
} // namespace
} // namespace wbhw
