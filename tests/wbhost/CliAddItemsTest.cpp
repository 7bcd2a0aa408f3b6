// `wbhost project add-item` through the module's wizard and `project add-items` in one bulk
// creation, through the build's module.
#include "CliTestSupport.h"

using clitest::Options;
using clitest::ScratchProject;
using clitest::Slurp;
using namespace wbhost::cli;

namespace {

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
