// The canonical writer and tree equality: loading what was written gives an equal tree.
#include "resource_tree/ResTreeWriter.h"

#include "TreeTestSupport.h"
#include "kern/Utf8.h"
#include "resource_tree/ListText.h"
#include "resource_tree/LoaderText.h"

#include <cstdlib>
#include <fstream>
#include <gtest/gtest.h>
#include <random>
#include <sstream>

namespace wbhw {
namespace {
using namespace test;

// Writes TREE, loads the result and compares; answers the written document.
ResTreeDocument ExpectRoundTrip(const ResTreeNode& tree, std::u16string_view language = u"eng") {
    const ResTreeDocument written = WriteResTree(tree, language);
    LoaderSettings settings;
    settings.language = std::u16string(language);
    int32_t result = -1;
    auto again = Load(written.xml, &settings, &result);
    EXPECT_EQ(result, 0) << qv::kern::WideToStandardUtf8(written.xml);
    std::u16string difference;
    EXPECT_TRUE(EqualResTrees(tree, *again, &difference))
        << qv::kern::WideToStandardUtf8(difference) << "\n"
        << qv::kern::WideToStandardUtf8(written.xml) << "\nloaded back as\n"
        << qv::kern::WideToStandardUtf8(WriteResTree(*again, language).xml);
    return written;
}

std::string ReadFile(const std::string& path) {
    std::ifstream in(path, std::ios::binary);
    std::stringstream bytes;
    bytes << in.rdbuf();
    return bytes.str();
}

TEST(ResTreeWriter, LoadedDocumentsRoundTripAndWhatCannotComeBackIsFlagged) {
    const char* source = std::getenv("WBT_SOURCE_DIR");
    const std::string dir =
        std::string(source != nullptr ? source : ".") + "/tests/resource_tree/data";
    const std::u16string target = FromUtf8Lenient(ReadFile(dir + "/target.xml"));
    ASSERT_FALSE(target.empty());
    const std::vector<std::u16string> documents = {
        target,
        u"<Top name='t'/>",
        u"<Top ordered='true'><A>1</A><A> 2 </A><B/><Group name='g'/></Top>",
        u"<PinList ordered='false'><Z/><a/></PinList>",
        uR"(<Top><V>a &amp; b &lt; c &gt; "d" 'e'&#13;&#10;f</V><W>	tab</W></Top>)",
        uR"(<Top><Group name=" spaced / and , comma &amp; \ back"><In>1</In></Group></Top>)",
        uR"(<Top><Group name="a"><Group name="b"/></Group><:Link name="toB">a/b</:Link></Top>)",
        uR"(<Top><SomePath>a/b</SomePath><Reserves>x, y</Reserves><T>#{unknown}</T></Top>)",
        uR"(<Top><X name="m" type="xml"><a q="1"><b/></a></X></Top>)",
        uR"(<Top><:Link>nowhere</:Link><Bad><</Bad></Top>)", // a syntax error and its message
        u"<Top><V>\U0001F600 \u00E9</V><Module name='\u00FC'/></Top>",
    };
    for (const std::u16string& doc : documents) {
        auto tree = Load(doc);
        const ResTreeDocument written = ExpectRoundTrip(*tree);
        EXPECT_TRUE(written.faithful) << qv::kern::WideToStandardUtf8(written.xml);
        // Writing is stable: the second generation reads the same.
        auto again = Load(written.xml);
        EXPECT_EQ(WriteResTree(*again, u"eng").xml, written.xml);
    }
    // What cannot come back is flagged.
    auto check = [](auto build) {
        ResTreeNode root(u"r", u"Top", false);
        build(root);
        return WriteResTree(root, u"eng").faithful;
    };
    EXPECT_TRUE(check([](ResTreeNode&) {}));
    EXPECT_FALSE(check([](ResTreeNode& r) { r.SetText(u"1st", u"x"); }));
    EXPECT_FALSE(check([](ResTreeNode& r) { r.SetText(u":Include", u"x"); }));
    // Beyond ASCII the parser's own name classes decide.
    EXPECT_FALSE(check([](ResTreeNode& r) { r.SetText(u"Con\uFFFDg", u"x"); }));
    EXPECT_TRUE(check([](ResTreeNode& r) { r.SetText(u"\u00FCber", u"x"); }));
    EXPECT_FALSE(check([](ResTreeNode& r) { r.SetText(u"V", u"a\u0001b"); }));
    EXPECT_FALSE(check([](ResTreeNode& r) { r.SetText(u"V", u"#{document-root}"); }));
    EXPECT_FALSE(check([](ResTreeNode& r) {
        r.AddChild(r.End(), u"g", u"Top", true).node->SetText(u"V", u"#{ordered}");
    }));
    EXPECT_TRUE(check([](ResTreeNode& r) { r.SetText(u"V", u"#{name} #{other"); }));
    // A link to a node written after it (unordered nodes are written in name order).
    EXPECT_FALSE(check([](ResTreeNode& r) {
        r.AddLink(r.End(), u"a", u"z");
        r.AddChild(r.End(), u"z", u"Top", false);
    }));
    EXPECT_FALSE(check([](ResTreeNode& r) { r.AddLink(r.End(), u"l", u"/absolute"); }));
    EXPECT_FALSE(check([](ResTreeNode& r) {
        r.AddText(r.End(), u"L", std::u16string(u"x\0eng=y", 7), EntryKind::LocalizedText);
    }));
}

TEST(ResTreeWriter, EqualityNoticesEveryKindOfDifference) {
    auto base = Load(u"<Top><A>1</A><Group name='g'><B/></Group><:Link name='l'>g</:Link></Top>");
    EXPECT_TRUE(EqualResTrees(*base, *base));
    for (const std::u16string other : {
             u"<Top><A>2</A><Group name='g'><B/></Group><:Link name='l'>g</:Link></Top>",
             u"<Top><a>1</a><Group name='g'><B/></Group><:Link name='l'>g</:Link></Top>",
             u"<Top><A>1</A><Group name='g' ordered='1'><B/></Group><:Link "
             u"name='l'>g</:Link></Top>",
             u"<Top><A>1</A><Other name='g'><B/></Other><:Link name='l'>g</:Link></Top>",
             u"<Top><A>1</A><Group name='g'><B/></Group><l>g</l></Top>",
             u"<Top><A>1</A><Group name='g'><B/><C/></Group><:Link name='l'>g</:Link></Top>",
             u"<Top><A localize='1'>1</A><Group name='g'><B/></Group><:Link "
             u"name='l'>g</:Link></Top>",
         }) {
        auto tree = Load(other);
        std::u16string difference;
        EXPECT_FALSE(EqualResTrees(*base, *tree, &difference))
            << qv::kern::WideToStandardUtf8(other);
        EXPECT_FALSE(difference.empty());
    }
}

// Builds random trees of what a loaded tree can hold, written so that they must come back.
class TreeGenerator {
public:
    explicit TreeGenerator(uint32_t seed) : random_(seed) {}

    std::unique_ptr<ResTreeNode> Make() {
        auto root = std::make_unique<ResTreeNode>(NodeName(), Type(), Chance(3));
        nodes_.assign(1, root.get());
        Fill(*root, 0);
        return root;
    }

private:
    bool Chance(int oneIn) { return random_() % static_cast<uint32_t>(oneIn) == 0; }
    template <class T> const T& Pick(const std::vector<T>& items) {
        return items[random_() % items.size()];
    }
    std::u16string Type() {
        return Pick<std::u16string>({u"Target", u"IOResource", u"ResourceList", u"Group", u"Module",
                                     u"Connector", u"Resource", u"x:Custom"});
    }
    std::u16string TextName() {
        return Pick<std::u16string>({u"Value", u"DisplayName", u"Direction", u"SomePath",
                                     u"HelpDir", u"Reserves", u"name", u"type", u"Rate",
                                     u"XMLParseErrors", u":DeferredLoadPath", u"V\u00E9"});
    }
    std::u16string NodeName() {
        return Pick<std::u16string>({u"DIO0", u"dio1", u"a/b", u"c,d", u" e ", u"", u"f&g", u"..",
                                     u"x\\y", u"Conn\u00E9", u"Methods", u"#{n}"});
    }
    std::u16string Text() {
        static const std::vector<std::u16string> pieces = {
            u"plain", u" lead", u"trail ",     u"a//b",  u"<&>\"'", u"\r\n", u"\t",  u"#{name}",
            u"#{n}",  u"x,y",   u"\U0001F600", u"eng=E", u"deu=D",  u"",     u"/abs"};
        std::u16string text;
        for (int n = static_cast<int>(random_() % 4); n > 0; --n)
            text += Pick(pieces);
        return text;
    }
    void Fill(ResTreeNode& node, int depth) {
        const int entries = static_cast<int>(random_() % (depth < 3 ? 7 : 3));
        for (int i = 0; i < entries; ++i) {
            const uint32_t what = random_() % 10;
            if (what < 3 && depth < 4) {
                ResTreeNode* child = node.AddChild(node.End(), NodeName(), Type(), Chance(2)).node;
                if (child != nullptr && child->Parent() == &node && child->IsEmpty()) {
                    nodes_.push_back(child);
                    Fill(*child, depth + 1);
                }
            } else if (what < 5) {
                // A link to a node already written: an ancestor or one made before.
                ResTreeNode* target = Pick(nodes_);
                node.AddLink(node.End(), NodeName(),
                             RelativeResourcePath(node.Path(), target->Path()));
            } else if (what < 6) {
                const std::u16string list = u"eng=" + Text() + u",deu=" + Text();
                node.AddText(node.End(), TextName(), LocalizeText(list, u"eng"),
                             EntryKind::LocalizedText);
            } else {
                node.AddText(node.End(), TextName(), Text());
            }
        }
    }

    std::mt19937 random_;
    std::vector<ResTreeNode*> nodes_;
};

TEST(ResTreeWriter, GeneratedTreesRoundTripWhenFaithful) {
    int faithful = 0;
    for (uint32_t seed = 1; seed <= 400; ++seed) {
        TreeGenerator generator(seed);
        const auto tree = generator.Make();
        const ResTreeDocument written = WriteResTree(*tree, u"eng");
        if (!written.faithful)
            continue;
        ++faithful;
        ExpectRoundTrip(*tree);
        if (HasFailure()) {
            ADD_FAILURE() << "seed " << seed;
            return;
        }
    }
    // Most generated trees can be written faithfully; the rest hold links to later nodes,
    // loader variables or names that no element can carry.
    EXPECT_GT(faithful, 150);
}

} // namespace
} // namespace wbhw
