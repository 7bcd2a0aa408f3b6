// The cluster-XML form: exact text, tolerant reading, strict layout, round trip.
#include "attribute_bag/WBAttrClusterParser.h"

#include "RandomText.h"

#include <gtest/gtest.h>
#include <random>

namespace {

using wbhw::ParseAttrCluster;
using wbhw::WriteAttrCluster;

constexpr int32_t kFail = static_cast<int32_t>(0x80004005u);

struct Parsed {
    int32_t status;
    std::u16string name;
    std::u16string value;
};

Parsed Parse(std::u16string_view text) {
    Parsed p{};
    p.status = ParseAttrCluster(text, p.name, p.value);
    return p;
}

std::u16string Cluster(std::u16string_view strings) {
    return u"<Cluster><Name></Name><NumElts>2</NumElts>" + std::u16string(strings) + u"</Cluster>";
}

TEST(ClusterXml, WritesThreeCharacterEscapesReadsLooseLayoutsAndRejectsBrokenOnes) {
    EXPECT_EQ(WriteAttrCluster(u"a<b", u"x & y"),
              u"<Cluster><Name></Name><NumElts>2</NumElts>"
              u"<String><Name>name</Name><Val>a&lt;b</Val></String>"
              u"<String><Name>value</Name><Val>x &amp; y</Val></String></Cluster>");
    EXPECT_NE(WriteAttrCluster(u"n", u"say \"it's\" >").find(u"<Val>say \"it's\" &gt;</Val>"),
              std::u16string::npos);
    const Parsed written = Parse(WriteAttrCluster(u"a<b", u"x & y"));
    EXPECT_EQ(written.status, 0);
    EXPECT_EQ(written.name, u"a<b");
    EXPECT_EQ(written.value, u"x & y");
    // Upper-case names and labels, blanks between elements, no cluster Name or NumElts.
    Parsed p = Parse(u"<CLUSTER>\n <STRING><NAME>NAME</NAME><VAL>n</VAL></STRING>\n"
                     u" <string><name>Value</name><val></val></string>\n</CLUSTER>");
    EXPECT_EQ(p.status, 0);
    EXPECT_EQ(p.name, u"n");
    EXPECT_EQ(p.value, u"");
    // A label written with a character reference arrives in pieces and still counts.
    p = Parse(Cluster(u"<String><Name>na&#109;e</Name><Val>x</Val></String>"));
    EXPECT_EQ(p.status, 0);
    EXPECT_EQ(p.name, u"x");
    // The last string element of a label wins; a value in several runs is joined.
    p = Parse(Cluster(u"<String><Name>value</Name><Val>old</Val></String>"
                      u"<String><Name>value</Name><Val>a&amp;b\nc</Val></String>"));
    EXPECT_EQ(p.status, 0);
    EXPECT_EQ(p.value, u"a&b\nc");
    for (const std::u16string& text : {
             Cluster(u"<String><Val>x</Val><Name>name</Name></String>"),      // value before label
             Cluster(u"<String><Name> name</Name><Val>x</Val></String>"),     // blank around label
             Cluster(u"<String><Name>other</Name><Val>x</Val></String>"),     // unknown label
             Cluster(u"<String><Name>name</Name><Val>a<b/>c</Val></String>"), // markup in value
             Cluster(u"<Other/>"),
             std::u16string(u"<String><Name>name</Name><Val>x</Val></String>"), // no cluster
             Cluster(u"<String><Name>name</Name><Val>x</Val>"),                 // not well formed
             WriteAttrCluster(u"bad\xD800", u"x"), // unpaired surrogate cannot be converted
             WriteAttrCluster(u"n", u"bell\x07"),  // a character XML cannot carry
             std::u16string(),
         }) {
        EXPECT_EQ(Parse(text).status, kFail) << std::string(text.begin(), text.end());
    }
    // Outputs are emptied first.
    std::u16string name = u"stale";
    std::u16string value = u"stale";
    EXPECT_EQ(ParseAttrCluster(u"<x/>", name, value), kFail);
    EXPECT_EQ(name, u"");
    EXPECT_EQ(value, u"");
}

TEST(ClusterXml, ParseOfWriteGivesBackAnyText) {
    std::mt19937 random(20261206);
    for (int i = 0; i < 500; ++i) {
        const std::u16string name = test::RandomXmlText(random, 12);
        const std::u16string value = test::RandomXmlText(random, 40);
        const Parsed p = Parse(WriteAttrCluster(name, value));
        ASSERT_EQ(p.status, 0) << i;
        ASSERT_EQ(p.name, name) << i;
        ASSERT_EQ(p.value, value) << i;
    }
}

} // namespace
