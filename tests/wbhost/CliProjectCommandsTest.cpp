// `wbhost project new|list|add-item|add-items` through the build's module: add-item through the
// module's wizard, add-items in one bulk creation.
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

constexpr const char* kBoard = R"(<Target>
  <TIOItemTypeName>Board I/O</TIOItemTypeName>
  <Line name="DIO0"><AttributeSet><Attribute name="Colour"><Value>grey</Value></Attribute>
  </AttributeSet></Line>
  <Line name="DIO1"/><Line name="DIO2"/><Line name="DIO3"/>
  <Line name="AI0"><HiddenTIO>true</HiddenTIO></Line>
</Target>
)";

struct BulkProject : ScratchProject {
    BulkProject() {
        description = scratch.Write("t.xml", kBoard);
        New({"T=" + description}, true);
    }
    int AddItems(const std::string& list) {
        const std::string file = scratch.Write("list.txt", list);
        return Run([&](std::ostream& o, std::ostream& e) {
            return RunAddItems(Options(), path, "T", file, o, e);
        });
    }
    std::string Listing() {
        List();
        return out.str();
    }
};

TEST(CliAddItems, AddItemGoesThroughTheWizardWhichCanBeCancelled) {
    BulkProject p;
    ASSERT_EQ(p.Add({"T", "DIO0", "Box\\/Lid/Valve", {"Colour=red"}}), kProjectOk) << p.err.str();
    EXPECT_NE(p.out.str().find("through the wizard (Board I/O)"), std::string::npos) << p.out.str();
    const std::string listing = p.Listing();
    for (const char* piece : {"folder \"Box/Lid\"", "Tangent I/O item \"Valve\"", "Colour=red",
                              "resource=/DIO0", "tioResourceStatus: bound"})
        EXPECT_NE(listing.find(piece), std::string::npos) << piece << "\n" << listing;
    const std::string saved = Slurp(p.path);
    // A user who closes the wizard adds nothing, and that is no failure; nothing is written.
    HostOptions cancelling = Options();
    cancelling.answers = {"new-item-wizard:0=1"};
    EXPECT_EQ(p.Add({"T", "DIO1", "Other", {}}, cancelling), kProjectOk) << p.err.str();
    EXPECT_NE(p.out.str().find("cancelled"), std::string::npos);
    EXPECT_EQ(Slurp(p.path), saved);
    EXPECT_EQ(p.Add({"T", "DIO1", "Other", {"name=x"}}), kProjectFailed);
    EXPECT_EQ(p.Add({"T", "DIO1", "Other", {"=x"}}), kProjectFailed);
    EXPECT_EQ(Slurp(p.path), saved);
}

TEST(CliAddItems, AListIsCheckedWholeBeforeOneCallCreatesItAll) {
    BulkProject p;
    ASSERT_EQ(p.Add({"T", "DIO3", "Existing", {}}), kProjectOk) << p.err.str();
    const std::string saved = Slurp(p.path);
    const struct {
        std::string list;
        const char* says;
    } refusals[] = {
        {"A\tDIO0\nB DIO1\n", "list.txt:2:7: error: expected NAME<TAB>RESOURCE"},
        {"A\tDIO0\n\tDIO1\n", "list.txt:2:1: error: empty item name"},
        {"# header\nA\tDIO9\n", "list.txt:2:3: error: target \"T\" has no resource \"DIO9\""},
        {"A\tDIO0\tColour\n", "list.txt:1:8: error: attribute \"Colour\" is not of the form"},
        {"A\tDIO0\tResource=x\n", "given by the item's place and resource"},
        {"A\tDIO0\na\tDIO1\n", "list.txt:2:1: error: target \"T\" already has an I/O item"},
        {"existing\tDIO0\n", "already has an item called \"Existing\""},
        {"A\tDIO0\nA/B\tDIO1\n", "list.txt:2:1: error: \"A\" is an item of an earlier line"},
        {"F/A\tDIO0\nF\tDIO1\n", "\"F\" is a folder of an earlier line"},
        {"A\tDIO0\nB\xff\tDIO1\n", "list.txt:2:1: error: the line is not UTF-8 text"},
        {"# nothing\n\n", "names no item"},
    };
    for (const auto& each : refusals) {
        EXPECT_EQ(p.AddItems(each.list), kProjectFailed) << each.says;
        EXPECT_NE(p.err.str().find(each.says), std::string::npos) << p.err.str();
        EXPECT_EQ(Slurp(p.path), saved) << each.says;
    }

    ASSERT_EQ(p.AddItems("# the board\r\nPump\tDIO0\tColour=blue\r\n  # indented comment\n"
                         "Out/A\\/B\tDIO1\nOut/Level\tAI0\nOut/Pump2\tDIO2"),
              kProjectOk)
        << p.err.str();
    EXPECT_NE(p.out.str().find("added 4 items"), std::string::npos);
    const std::string listing = p.Listing();
    for (const char* piece : {"Tangent I/O item \"Pump\"", "Colour=blue", "folder \"Out\"",
                              "Tangent I/O item \"A/B\"", "Tangent I/O item \"Level\""})
        EXPECT_NE(listing.find(piece), std::string::npos) << piece << "\n" << listing;
    // The item on a resource marked HiddenTIO is hidden.
    const size_t level = listing.find("\"Level\" {");
    ASSERT_NE(level, std::string::npos);
    EXPECT_NE(listing.substr(level, listing.find('\n', level) - level).find(" hidden"),
              std::string::npos);
}

} // namespace
