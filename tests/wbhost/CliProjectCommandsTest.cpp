// `wbhost project new|list|add-item` through the build's module.
#include "CliTestSupport.h"

using clitest::Options;
using clitest::ScratchProject;
using clitest::Slurp;
using namespace wbhost::cli;

namespace {

TEST(CliProjectCommands, ItemsAddedThroughTheProviderComeBackWithTheirAttributeSets) {
    ScratchProject p;
    ASSERT_EQ(p.New({"T=" + p.description}), kProjectOk) << p.err.str();
    EXPECT_NE(p.out.str().find("target \"T\""), std::string::npos);
    ASSERT_EQ(p.Add({"t", "DIO0", ""}), kProjectOk) << p.err.str();
    ASSERT_EQ(p.Add({"T", "AI0", "Inputs/Level"}), kProjectOk) << p.err.str();

    ASSERT_EQ(p.List(), kProjectOk) << p.err.str();
    const std::string listing = p.out.str();
    for (const char* piece :
         {"project \"p\"", "Tangent I/O item \"DIO0\"", "folder \"Inputs\"",
          "tioAttrBag: resource=/DIO0", "tioAttrBag: resource=/AI0", "tioResourceStatus: bound"})
        EXPECT_NE(listing.find(piece), std::string::npos) << piece << "\n" << listing;
    // The folder is reused, not made twice.
    ASSERT_EQ(p.Add({"T", "DIO0", "Inputs/Other"}), kProjectOk) << p.err.str();
    p.List();
    const std::string again = p.out.str();
    EXPECT_EQ(again.find("folder \"Inputs\""), again.rfind("folder \"Inputs\""));
}

TEST(CliProjectCommands, NewRefusesToReplaceAndToSaveHalfAProject) {
    ScratchProject p;
    ASSERT_EQ(p.New({"T=" + p.description}), kProjectOk) << p.err.str();
    const std::string saved = Slurp(p.path);
    EXPECT_EQ(p.New({}), kProjectFailed);
    EXPECT_NE(p.err.str().find("--force"), std::string::npos);
    // Nothing is written when any target fails, even with --force.
    for (const auto& targets : std::vector<std::vector<std::string>>{
             {"T=" + p.description, "t=" + p.description},
             {"T=" + p.description, "U=" + p.scratch.File("missing.xml")},
             {"=" + p.description},
             {"T="},
             {"T"}}) {
        EXPECT_EQ(p.New(targets, true), kProjectFailed) << targets.back();
        EXPECT_FALSE(p.err.str().empty());
        EXPECT_EQ(Slurp(p.path), saved);
    }
    EXPECT_EQ(p.New({"U=" + p.description}, true), kProjectOk) << p.err.str();
    EXPECT_NE(Slurp(p.path).find(" U\n"), std::string::npos);
}

TEST(CliProjectCommands, ProjectsFindTheirDescriptionsFromAnyFolder) {
    ScratchProject p;
    const auto before = std::filesystem::current_path();
    std::filesystem::current_path(p.scratch.Path());
    const int made = p.New({"T=t.xml"});
    std::filesystem::current_path(before);
    ASSERT_EQ(made, kProjectOk) << p.err.str();
    EXPECT_EQ(p.List(), kProjectOk) << p.err.str();
    EXPECT_NE(p.out.str().find("from " + p.description), std::string::npos) << p.out.str();
}

TEST(CliProjectCommands, AddItemRefusalsLeaveTheFileAsItWas) {
    ScratchProject p;
    ASSERT_EQ(p.New({"T=" + p.description}), kProjectOk) << p.err.str();
    ASSERT_EQ(p.Add({"T", "DIO0", "Box/Valve"}), kProjectOk) << p.err.str();
    const std::string saved = Slurp(p.path);
    const struct {
        AddItemRequest request;
        const char* says;
    } refusals[] = {
        {{"U", "DIO0", "X"}, "no target called \"U\" (targets: \"T\")"},
        {{"T", "DIO7", "X"}, "no resource \"DIO7\""},
        {{"T", "", "X"}, "no resource"},
        // I/O item names are unique in the whole target, not only in their folder.
        {{"T", "AI0", "valve"}, "already has an I/O item called \"Valve\""},
        {{"T", "AI0", "Box/VALVE"}, "already has an item called \"Valve\""},
        {{"T", "AI0", "Box/Valve/Deeper"}, "is a Tangent I/O item, not a folder"},
        {{"T", "AI0", "Box//X"}, "no item name"},
        {{"T", "AI0", "Box/"}, "no item name"},
        // A folder made on the way is not saved when the item is refused.
        {{"T", "AI0", "New/Valve"}, "already has an I/O item"},
    };
    for (const auto& each : refusals) {
        EXPECT_EQ(p.Add(each.request), kProjectFailed) << each.says;
        EXPECT_NE(p.err.str().find(each.says), std::string::npos) << p.err.str();
        EXPECT_EQ(Slurp(p.path), saved) << each.says;
    }
    EXPECT_EQ(p.Add({"T", "AI0", ""}), kProjectOk) << p.err.str();
}

TEST(CliProjectCommands, AModuleThatCannotBeLoadedOrAProjectThatCannotBeReadFails) {
    ScratchProject p;
    auto options = Options();
    options.modulePath = p.scratch.File("none.qxx");
    EXPECT_EQ(p.New({}, false, options), kProjectFailed);
    EXPECT_FALSE(std::filesystem::exists(p.path));
    p.scratch.Write("p.wbproj", "wbhost-project 1\nitem\n");
    EXPECT_EQ(p.List(), kProjectFailed);
    EXPECT_NE(p.err.str().find("line 2"), std::string::npos) << p.err.str();
}

} // namespace
