// The project tree's requests to an item from the command line: its menu, its commands with
// their dialogs answered from the session, properties, help and the drop check. Each command is
// a session of its own; what a command changes is saved, what it refuses leaves the file as it
// was. The item's own rules are tested in ItemCommandsTest.
#include "CliTestSupport.h"
#include "cli/ItemCommands.h"

using clitest::Options;
using clitest::ScratchProject;
using clitest::Slurp;
using namespace wbhost::cli;

namespace {

constexpr const char* kBoard = R"(<Target name="Board">
  <IOResourceDefault><Help><Path>help/board.chm</Path><Topic>lines.html</Topic></Help></IOResourceDefault>
  <Connector name="C0">
    <DigitalLine name="DIO0"><DisplayName>DIO0</DisplayName>
      <AttributeSet><Attribute name="Direction"><Value>Input</Value></Attribute></AttributeSet>
    </DigitalLine>
    <DigitalLine name="DIO1"><DisplayName>DIO1</DisplayName></DigitalLine>
  </Connector>
</Target>
)";

class CliItemCommands : public ::testing::Test {
protected:
    void SetUp() override {
        p.description = p.scratch.Write("board.xml", kBoard);
        const std::string other =
            p.scratch.Write("other.xml", "<Target><Line name=\"L\"/></Target>");
        ASSERT_EQ(p.New({"T=" + p.description, "U=" + other}), 0) << p.err.str();
        for (const std::string name : {"DIO0", "Backup"})
            ASSERT_EQ(p.Add({"T", "C0/DIO0", name}), 0) << p.err.str();
    }
    // Runs ACTION on ITEM of target T with ARGUMENTS and the session's ANSWERS.
    int Item(const std::string& item, const std::string& action,
             std::vector<std::string> arguments = {}, std::vector<std::string> answers = {},
             std::map<std::string, std::string> options = {}) {
        HostOptions host = Options();
        host.answers = std::move(answers);
        host.record = true;
        ItemRequest request{"T", item, action, std::move(arguments), std::move(options)};
        return p.Run([&](std::ostream& out, std::ostream& err) {
            return RunItem(host, p.path, request, out, err);
        });
    }
    nlohmann::json ItemNamed(const std::string& name) {
        const auto listing = p.Json();
        for (const auto& target : listing["targets"]) {
            for (const auto& item : target["items"]) {
                if (item["path"] == name)
                    return item;
            }
        }
        ADD_FAILURE() << "no item " << name << " in " << listing.dump(2);
        return nlohmann::json::object();
    }
    std::string Out() const { return p.out.str(); }
    std::string Err() const { return p.err.str(); }

    ScratchProject p;
};

TEST_F(CliItemCommands, EachCommandAnswersRefusalsLeaveTheProjectAConflictIsExplainedAndMended) {
    std::string saved = Slurp(p.path);
    // A dialog whose answer cannot be read as what it should be fails, and changes nothing.
    EXPECT_EQ(Item("DIO0", "run", {"select-resource"},
                   {"select-resource:0=0", "select-resource:1=7", "select-resource:2=1"}),
              1);
    EXPECT_NE(Err().find("failed (status 0x80070057)"), std::string::npos) << Err();
    EXPECT_NE(Out().find("0 still open"), std::string::npos) << Out();
    EXPECT_EQ(Item("DIO0", "run", {"{00000000-0000-0000-0000-000000000001}"}), 1);
    EXPECT_NE(Err().find("has no command"), std::string::npos);
    EXPECT_EQ(Item("DIO0", "run", {"nonsense"}), 1);
    EXPECT_EQ(Item("DIO0", "drop-check", {"T/Nowhere"}), 1);
    EXPECT_EQ(Item("DIO0", "properties", {}, {}, {{"--set", "no equals sign"}}), 1);
    EXPECT_EQ(Slurp(p.path), saved);
    // Properties, help and the drop check.
    ASSERT_EQ(Item("DIO0", "properties", {}, {}, {{"--set", "Direction=Output"}}), 0) << Err();
    EXPECT_NE(Out().find("applied"), std::string::npos);
    EXPECT_NE(Out().find("Direction"), std::string::npos); // the dialog was shown it
    EXPECT_NE(ItemNamed("DIO0")["compileConfiguration"].get<std::string>().find("Direction=Output"),
              std::string::npos);
    // Closed without an answer: nothing to save.
    saved = Slurp(p.path);
    ASSERT_EQ(Item("DIO0", "properties"), 0) << Err();
    EXPECT_NE(Out().find("nothing changed"), std::string::npos);
    EXPECT_EQ(Slurp(p.path), saved);

    ASSERT_EQ(Item("DIO0", "help"), 0) << Err();
    EXPECT_NE(Out().find("path: /"), std::string::npos) << Out();
    EXPECT_NE(Out().find("/help/board.chm\n"), std::string::npos) << Out();
    EXPECT_NE(Out().find("topic: lines.html\n"), std::string::npos);

    EXPECT_EQ(Item("DIO0", "drop-check", {"U"}), 0) << Err();
    EXPECT_NE(Out().find("may be dropped under \"U\""), std::string::npos);
    // A conflict is explained, and a resource chosen with the name following.
    ASSERT_EQ(Item("Backup", "menu"), 0) << Err();
    EXPECT_NE(Out().find("Select Resource...  {A117026A-AD51-4C63-8341-085C842D9F23}"),
              std::string::npos);
    EXPECT_NE(Out().find("Explain Error...  {CBB26BAB-B605-4BC7-BE58-98DDC98C9F70}"),
              std::string::npos);

    // The explanation names both items, and the user asks to be shown the one in the way.
    saved = Slurp(p.path);
    ASSERT_EQ(Item("Backup", "run", {"explain-error"}, {"explain-error:0=1"}), 0) << Err();
    EXPECT_NE(Out().find("the project tree selects and shows \"DIO0\""), std::string::npos);
    const size_t message = Out().find("8 = \"");
    ASSERT_NE(message, std::string::npos) << Out();
    const std::string line = Out().substr(message, Out().find('\n', message) - message);
    EXPECT_NE(line.find("Backup"), std::string::npos) << line;
    EXPECT_NE(line.find("DIO0"), std::string::npos) << line;
    EXPECT_NE(Out().find("9 = 0"), std::string::npos);
    EXPECT_NE(Out().find("0 still open"), std::string::npos);
    EXPECT_EQ(Slurp(p.path), saved);

    // "DIO0" was named after its line: it takes the new line's name; the other item is then free.
    ASSERT_EQ(
        Item("DIO0", "run", {"select-resource"},
             {"select-resource:0=0", "select-resource:1=text:/C0/DIO1", "select-resource:2=1"}),
        0)
        << Err();
    EXPECT_NE(Out().find("9 = \"/C0/DIO0\""), std::string::npos) << Out();
    EXPECT_NE(Out().find("0 still open"), std::string::npos);
    const auto moved = ItemNamed("DIO1");
    EXPECT_EQ(moved["resource"], "/C0/DIO1");
    EXPECT_EQ(moved["status"], 0);
    EXPECT_EQ(ItemNamed("Backup")["status"], 0);
}

} // namespace
