// Links and localized texts.
#include "TreeTestSupport.h"
#include "resource_tree/ParseStack.h"

#include <gtest/gtest.h>

namespace wbhw {
namespace {
using namespace test;

TEST(ParseElement, LinksStoreTheirPathOrSayUnresolvedAndLocalizedTextsPickTheLanguage) {
    auto root = Load(uR"(<Top>
        <Group name="a"><Group name="pin"/></Group>
        <Group name="b">
            <:Link>/a/pin</:Link>
            <:Link name="named">#{document-root}/a</:Link>
            <:Link name="broken">../nowhere</:Link>
            <:Link>../alsoNowhere</:Link>
        </Group>
        <:Link name="fromRoot">/a/pin</:Link>
    </Top>)");
    ResTreeNode* b = ChildOf(*root, u"b");
    ResTreePosition pin = b->Find(u"pin");
    ASSERT_NE(pin, b->End());
    EXPECT_EQ(pin->Kind(), EntryKind::Link);
    EXPECT_EQ(*pin->Text(), u"../a/pin");
    EXPECT_EQ(b->NodeAt(pin), ChildOf(*ChildOf(*root, u"a"), u"pin"));
    EXPECT_EQ(TextOf(*b, u"named"), u"../a");
    EXPECT_EQ(TextOf(*b, u"broken"), u"UNRESOLVED LINK: ../nowhere");
    EXPECT_EQ(b->Find(u"broken")->Kind(), EntryKind::Text);
    EXPECT_EQ(TextOf(*b, u":Link"), u"UNRESOLVED LINK: ../alsoNowhere");
    // From the root the path goes straight down.
    EXPECT_EQ(TextOf(*root, u"fromRoot"), u"a/pin");
    EXPECT_EQ(root->ResolvePath(u"fromRoot"), ChildOf(*ChildOf(*root, u"a"), u"pin"));
    // The root's own path is "/"; "#{document-root}/a" must not become "//a", which names nothing.
    root = Load(uR"(<Top>
        <Group name="a"/><Group name="b"/>
        <Group name="user"><Reserves>#{document-root}/a, #{document-root}/b</Reserves>
            <Self>#{document-root}</Self></Group>
    </Top>)");
    ResTreeNode* user = ChildOf(*root, u"user");
    ASSERT_NE(user, nullptr);
    EXPECT_EQ(TextOf(*user, u"Reserves"), u"../a,../b"); // rewritten from the node, as loaded
    EXPECT_EQ(TextOf(*user, u"Self"), u"/");
    EXPECT_EQ(user->ReservedNodes(true),
              (std::vector<ResTreeNode*>{ChildOf(*root, u"a"), ChildOf(*root, u"b")}));
    root = Load(uR"(<Top>
        <Group name="a"/>
        <Group name="b"><:Link name="l">../a<x><y/></x></:Link><After>1</After></Group>
        <Later>2</Later>
    </Top>)");
    b = ChildOf(*root, u"b");
    ASSERT_NE(b, nullptr);
    EXPECT_EQ(TextOf(*b, u"l"), u"../a");
    EXPECT_EQ(TextOf(*b, u"After"), u"1");
    EXPECT_EQ(TextOf(*root, u"Later"), u"2");
    EXPECT_NE(TextOf(*b, u"XMLParseErrors").find(u"Child elements of a :Link element are ignored"),
              std::u16string::npos);
    // Localized texts pick the language and keep the list.
    const std::u16string doc = uR"(<Top>
        <Label localize="true">eng=Input, deu=Eingang , fra = Entree</Label>
        <Other localize="1">fra=Sortie</Other>
        <Plain localize="no">eng=x</Plain>
        <L>plain</L><L localize="yes">eng=English</L>
    </Top>)";
    LoaderSettings german;
    german.language = u"deu";
    auto de = Load(doc, &german);
    const std::u16string list = u"eng=Input, deu=Eingang , fra = Entree";
    EXPECT_EQ(TextOf(*de, u"Label"), u"Eingang" + std::u16string(1, u'\0') + list);
    EXPECT_EQ(de->Find(u"Label")->Kind(), EntryKind::LocalizedText);
    // No entry for the language and none in English: stored unchanged, without a NUL.
    EXPECT_EQ(TextOf(*de, u"Other"), u"fra=Sortie");
    EXPECT_EQ(de->Find(u"Other")->Kind(), EntryKind::LocalizedText);
    EXPECT_EQ(de->Find(u"Plain")->Kind(), EntryKind::Text);
    // Readers that stop at the NUL see the chosen text.
    EXPECT_EQ(std::u16string(de->TextAt(u"Label")->c_str()), u"Eingang");
    // A localized text overwrites a plain one of its name.
    EXPECT_EQ(de->Find(u"L")->Kind(), EntryKind::LocalizedText);
    EXPECT_EQ(std::u16string(de->TextAt(u"L")->c_str()), u"English");

    LoaderSettings japanese;
    japanese.language = u"jpn";
    auto fallback = Load(doc, &japanese);
    EXPECT_EQ(std::u16string(fallback->TextAt(u"Label")->c_str()), u"Input");
}

} // namespace
} // namespace wbhw
