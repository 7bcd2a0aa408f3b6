// The attribute-set texts the command line writes for new items and reads for listings.
#include "cli/AttributeSet.h"
#include "cli/HostText.h"

#include <gtest/gtest.h>

using wbhost::cli::NewItemAttributeSet;
using wbhost::cli::ReadAttributeSet;
using wbhost::cli::SetAttribute;

namespace {

TEST(CliAttributeSet, NewItemSetsReadBackWhateverTheNamesHold) {
    for (const std::u16string name :
         {u"Valve", u"A/B/C", u"a&b <c> \"d\" 'e'", u"Ventil \u00e4\u20ac"}) {
        const auto read = ReadAttributeSet(NewItemAttributeSet(name, u"Connector0/DIO<1>&"));
        ASSERT_TRUE(read);
        EXPECT_EQ(*read, (std::vector<SetAttribute>{{u"name", name},
                                                    {u"resource", u"Connector0/DIO<1>&"}}));
    }
}

TEST(CliAttributeSet, NestedSetsAreNamedByTheirPath) {
    const auto read =
        ReadAttributeSet(u"<AttributeSet name=\"\">"
                         u"<Attribute name=\"resource\"><Value>AI0</Value></Attribute>"
                         u"<AttributeSet name=\"Scaling\">"
                         u"<Attribute name=\"Gain\"><Value>2</Value></Attribute>"
                         u"</AttributeSet></AttributeSet>");
    ASSERT_TRUE(read);
    EXPECT_EQ(*read, (std::vector<SetAttribute>{{u"resource", u"AI0"}, {u"/Scaling/Gain", u"2"}}));
}

// Sets as deep as the module reads are read; deeper ones fail instead of taking memory by the
// square of their depth (100,000 levels of long names took tens of GB).
TEST(CliAttributeSet, NestingIsBoundedAsTheModuleBoundsIt) {
    auto nested = [](size_t levels, size_t nameLength = 200) {
        const std::u16string name(nameLength, u'n');
        std::u16string text;
        for (size_t i = 0; i < levels; ++i)
            text += u"<AttributeSet name=\"" + name + u"\">";
        text += u"<Attribute name=\"x\"><Value>1</Value></Attribute>";
        for (size_t i = 0; i < levels; ++i)
            text += u"</AttributeSet>";
        return text;
    };
    const auto deepest = ReadAttributeSet(nested(256));
    ASSERT_TRUE(deepest);
    EXPECT_EQ(deepest->front().first.size(), 255u * 201u + 2u);
    EXPECT_FALSE(ReadAttributeSet(nested(257)));
    EXPECT_FALSE(ReadAttributeSet(nested(100000, 1)));
}

TEST(CliAttributeSet, RefusesWhatIsNoAttributeSet) {
    for (const std::u16string text :
         {u"", u"resource=AI0", u"<AttributeSet name=\"\">", u"<Target><Line>1</Line></Target>",
          u"<Attribute name=\"x\"><Value>1</Value></Attribute>"}) {
        EXPECT_FALSE(ReadAttributeSet(text)) << wbhost::cli::ToUtf8(text);
    }
    EXPECT_EQ(ReadAttributeSet(u"<AttributeSet name=\"\"/>"), std::vector<SetAttribute>{});
}

} // namespace
