// The attribute-set texts the command line writes for new items and reads for listings, and the
// item tree as it prints it, on a project built by hand.
#include "cli/AttributeSet.h"
#include "cli/HostText.h"
#include "cli/ItemListing.h"
#include "provider/TIOIdentifiers.h"

#include <gtest/gtest.h>
#include <sstream>

using wbhost::cli::NewItemAttributeSet;
using wbhost::cli::ReadAttributeSet;
using wbhost::cli::SetAttribute;
using wbhost::project::Project;
using wbhost::project::Property;

namespace {

TEST(CliAttributeSet, NewItemSetsReadBackWhateverTheNamesHoldNestedByPathOthersAreRefused) {
    for (const std::u16string name :
         {u"Valve", u"A/B/C", u"a&b <c> \"d\" 'e'", u"Ventil \u00e4\u20ac"}) {
        const auto read = ReadAttributeSet(NewItemAttributeSet(name, u"Connector0/DIO<1>&"));
        ASSERT_TRUE(read);
        EXPECT_EQ(*read, (std::vector<SetAttribute>{{u"name", name},
                                                    {u"resource", u"Connector0/DIO<1>&"}}));
    }
    const auto read =
        ReadAttributeSet(u"<AttributeSet name=\"\">"
                         u"<Attribute name=\"resource\"><Value>AI0</Value></Attribute>"
                         u"<AttributeSet name=\"Scaling\">"
                         u"<Attribute name=\"Gain\"><Value>2</Value></Attribute>"
                         u"</AttributeSet></AttributeSet>");
    ASSERT_TRUE(read);
    EXPECT_EQ(*read, (std::vector<SetAttribute>{{u"resource", u"AI0"}, {u"/Scaling/Gain", u"2"}}));
    // What is no attribute set is refused.
    for (const std::u16string text :
         {u"", u"resource=AI0", u"<AttributeSet name=\"\">", u"<Target><Line>1</Line></Target>",
          u"<Attribute name=\"x\"><Value>1</Value></Attribute>"}) {
        EXPECT_FALSE(ReadAttributeSet(text)) << wbhost::cli::ToUtf8(text);
    }
    EXPECT_EQ(ReadAttributeSet(u"<AttributeSet name=\"\"/>"), std::vector<SetAttribute>{});
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

TEST(CliItemListing, ShowsStatusInWordsHiddenItemsAndOneLinePerProperty) {
    wbhost::resources::ResourceService service;
    Project project(service, u"P");
    auto item = project.Root().AddChild(tio::kIOItemType, {}, u"Two\nLines");
    auto& bag = item->Bag();
    bag.Put(u"tioAttrBag",
            {Property::Kind::String, wbhost::cli::NewItemAttributeSet(u"X", u"A/B"), 0});
    bag.Put(u"tioResourceStatus", {Property::Kind::Int, {}, 2});
    bag.Put(u"HiddenTIO", {Property::Kind::Bool, {}, 1});
    bag.Put(u"note", {Property::Kind::String, u"tab\there", 0});
    item->SetFlags(0);
    auto other = project.Root().AddChild(tio::kIOItemType, {}, u"Fresh");
    other->Bag().Put(u"tioAttrBag", {Property::Kind::String, u"<Broken", 0});
    project.Root().AddChild(wbproj::kFolderType, {}, u"F");

    std::ostringstream out;
    wbhost::cli::PrintItemTree(project.Root(), out);
    const std::string text = out.str();
    for (const char* piece :
         {"project \"P\" ", "Tangent I/O item \"Two\\nLines\" ", " hidden\n",
          "    tioAttrBag: name=X resource=A/B\n", "    tioResourceStatus: held by another item\n",
          "    HiddenTIO: true\n", "    note: \"tab\\there\"\n", "  folder \"F\" ",
          "    tioAttrBag (not an attribute set): <Broken\n",
          "    tioResourceStatus: not reported yet\n"}) {
        EXPECT_NE(text.find(piece), std::string::npos) << piece << "\n" << text;
    }
    // The item that reported its status does not also claim to have none.
    EXPECT_EQ(text.find("not reported yet"), text.rfind("not reported yet"));
    EXPECT_EQ(wbhost::cli::ResourceStatusText(0), "bound");
    EXPECT_EQ(wbhost::cli::ResourceStatusText(7), "status 7");
}

} // namespace
