// The attribute bag's XML text: exact bytes, the reader's rules, and the round trip.
#include "RandomText.h"
#include "attribute_bag/TIOAttrBag.h"
#include "attribute_bag/TIOAttrBagParser.h"
#include "kern/Collate.h"
#include "resource_tree/ListText.h"

#include <gtest/gtest.h>
#include <random>

namespace {

constexpr int32_t kFail = static_cast<int32_t>(0x80004005u);

std::u16string Write(const TIOAttrBag& bag) {
    std::u16string out;
    bag.WriteXml(out);
    return out;
}

TEST(AttrBagXml, WritesExactLinesWithTrimmedEscapedValuesAndReadsNestedSets) {
    TIOAttrBag root(u"Item");
    root.SetValue(u"resource", u"  /Conn0/DIO0\n");
    root.SetValue(u"Say \"hi\"", u"a<b & 'c'");
    root.GetOrCreateChild(u"Empty");
    EXPECT_EQ(Write(root), u"<AttributeSet name=\"Item\">\n"
                           u"   <Attribute name=\"resource\">\n"
                           u"   <Value>/Conn0/DIO0</Value>\n"
                           u"   </Attribute>\n"
                           u"   <Attribute name=\"Say &quot;hi&quot;\">\n"
                           u"   <Value>a&lt;b &amp; 'c'</Value>\n"
                           u"   </Attribute>\n"
                           u"   <AttributeSet name=\"Empty\">\n"
                           u"   </AttributeSet>\n"
                           u"</AttributeSet>\n");
    TIOAttrBag target(u"old");
    TIOAttrBag* last = nullptr;
    ASSERT_EQ(TIOAttrBag::ReadXml(u"<attributeset NAME='Item'><ATTRIBUTE name='m'><value>\n  on "
                                  u"\n</value></ATTRIBUTE><Attribute name='bare'/>"
                                  u"<AttributeSet name='A'><AttributeSet name='B'/></AttributeSet>"
                                  u"</attributeset>",
                                  target, &last),
              0);
    EXPECT_EQ(target.Name(), u"Item");
    EXPECT_EQ(target.GetValue(u"M"), u"on");
    // An Attribute without a Value is empty, not the text of the Value before it.
    ASSERT_NE(target.FindValue(u"bare"), nullptr);
    EXPECT_EQ(target.GetValue(u"bare"), u"");
    EXPECT_EQ(last, target.ResolvePath(u"/A/B/"));
}

TEST(AttrBagXml, TopLevelSetsReplaceTheirChildBadDocumentsKeepWhatWasReadNestingIsBounded) {
    TIOAttrBag target;
    target.GetOrCreateChild(u"A").SetValue(u"old", u"1");
    target.GetOrCreateChild(u"P");
    TIOAttrBag* last = nullptr;
    ASSERT_EQ(TIOAttrBag::ReadXml(u"<AttributeSet name='a' parent='/P/'><Attribute name='new'>"
                                  u"<Value>2</Value></Attribute></AttributeSet>",
                                  target, &last),
              0);
    TIOAttrBag* a = target.FindChild(u"A");
    EXPECT_EQ(last, a);
    EXPECT_EQ(a->FindValue(u"old"), nullptr);
    EXPECT_EQ(a->GetValue(u"new"), u"2");
    EXPECT_EQ(TIOAttrBag::ReadXml(u"<AttributeSet name='x' parent='/Missing'/>", target), kFail);
    for (const char16_t* doc : {
             u"<AttributeSet name='r'><AttributeSet name='S'/><AttributeSet name='s'/>"
             u"</AttributeSet>",                                // duplicate set
             u"<AttributeSet name='r'><Other/></AttributeSet>", // unknown element
             u"<Attribute name='x'/>",                          // wrong document element
             u"<AttributeSet name='r'><Attribute name='x'><Value><b/></Value></Attribute>"
             u"</AttributeSet>",                                      // markup in a value
             u"<AttributeSet name='r'/><AttributeSet name='again'/>", // second top element
             u"<AttributeSet name='r'>",                              // not well formed
         }) {
        TIOAttrBag target;
        EXPECT_EQ(TIOAttrBag::ReadXml(doc, target), kFail) << std::string(doc, doc + 20);
    }
    TIOAttrBag kept;
    EXPECT_EQ(TIOAttrBag::ReadXml(u"<AttributeSet name='r'><Attribute name='kept'><Value>k"
                                  u"</Value></Attribute><Bad/></AttributeSet>",
                                  kept),
              kFail);
    EXPECT_EQ(kept.GetValue(u"kept"), u"k");
    // Nesting is bounded, and one unencodable character does not lose the bag.
    auto nested = [](int depth) {
        std::u16string doc;
        for (int i = 0; i < depth; ++i)
            doc += u"<AttributeSet name='s'>";
        for (int i = 0; i < depth; ++i)
            doc += u"</AttributeSet>";
        return doc;
    };
    TIOAttrBag deepest;
    EXPECT_EQ(TIOAttrBag::ReadXml(nested(TIOAttrBagParser::kMaxNesting), deepest), 0);
    TIOAttrBag tooDeep;
    EXPECT_EQ(TIOAttrBag::ReadXml(nested(100000), tooDeep), kFail);
    // Under a top-level set with a parent the target is one level more: what was read must
    // still read back once written out from the target.
    TIOAttrBag fresh;
    const std::u16string doc = nested(TIOAttrBagParser::kMaxNesting);
    EXPECT_EQ(TIOAttrBag::ReadXml(u"<AttributeSet name='p' parent='/'>" + doc.substr(23), fresh),
              kFail);
    std::u16string written;
    fresh.WriteXml(written);
    TIOAttrBag again;
    EXPECT_EQ(TIOAttrBag::ReadXml(written, again), 0);
    TIOAttrBag bag(u"r");
    bag.SetValue(u"ctl", u"a\x01z");
    bag.SetValue(u"lone", u"x\xDC00y");
    bag.SetValue(u"other", u"kept");
    TIOAttrBag back;
    ASSERT_EQ(TIOAttrBag::ReadXml(Write(bag), back), 0);
    EXPECT_EQ(back.GetValue(u"ctl"), u"a?z");
    EXPECT_EQ(back.GetValue(u"lone"), u"x?y");
    EXPECT_EQ(back.GetValue(u"other"), u"kept");
}

TEST(AttrBagXml, ReadingIntoAChildRenamesItsKeyOrFails) {
    TIOAttrBag root;
    TIOAttrBag& a = root.GetOrCreateChild(u"A");
    root.GetOrCreateChild(u"Taken");
    ASSERT_EQ(TIOAttrBag::ReadXml(u"<AttributeSet name='Z'/>", a), 0);
    EXPECT_EQ(root.FindChild(u"Z"), &a);
    EXPECT_EQ(a.GetPath(), u"/Z/");
    EXPECT_EQ(TIOAttrBag::ReadXml(u"<AttributeSet name='taken'/>", a), kFail);
}

// Same names (ignoring case, as the maps do) and the same trimmed values, all the way down.
void ExpectSameTree(const TIOAttrBag& expected, const TIOAttrBag& actual) {
    EXPECT_EQ(expected.Name(), actual.Name());
    ASSERT_EQ(expected.Attributes().size(), actual.Attributes().size());
    for (const auto& [name, value] : expected.Attributes()) {
        const auto it = actual.Attributes().find(name);
        ASSERT_NE(it, actual.Attributes().end());
        EXPECT_EQ(it->first, name);
        EXPECT_EQ(it->second, wbhw::TrimBlanks(value));
    }
    ASSERT_EQ(expected.Children().size(), actual.Children().size());
    for (const auto& [name, child] : expected.Children()) {
        const TIOAttrBag* other = actual.FindChild(name);
        ASSERT_NE(other, nullptr);
        ExpectSameTree(*child, *other);
    }
}

void Populate(TIOAttrBag& set, std::mt19937& random, int depth) {
    std::uniform_int_distribution<int> count(0, 4);
    for (int n = count(random); n > 0; --n)
        set.InsertOwn(test::RandomXmlText(random, 6), test::RandomXmlText(random, 20));
    if (depth == 0)
        return;
    for (int n = count(random); n > 0; --n)
        Populate(set.GetOrCreateChild(test::RandomXmlText(random, 6)), random, depth - 1);
}

TEST(AttrBagXml, ReadOfWriteGivesTheSameTree) {
    std::mt19937 random(4711);
    for (int i = 0; i < 60; ++i) {
        TIOAttrBag bag(test::RandomXmlText(random, 6));
        Populate(bag, random, 3);
        const std::u16string text = Write(bag);
        TIOAttrBag back(u"placeholder");
        ASSERT_EQ(TIOAttrBag::ReadXml(text, back), 0) << i;
        ExpectSameTree(bag, back);
        EXPECT_EQ(Write(back), text);
    }
}

} // namespace
