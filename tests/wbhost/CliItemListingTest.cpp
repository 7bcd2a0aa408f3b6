// The item tree as the command line prints it, on a project built by hand.
#include "cli/AttributeSet.h"
#include "cli/ItemListing.h"
#include "provider/TIOIdentifiers.h"

#include <gtest/gtest.h>
#include <sstream>

using wbhost::project::Project;
using wbhost::project::Property;

namespace {

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
