// Items acted on from the command line as the project tree acts on them: renames judged by the
// module's name rules, moves within and between targets, and what each item then reports about
// its error. A refusal leaves the project file byte for byte as it was.
#include "CliTestSupport.h"
#include "cli/ItemCommands.h"
#include "cli/ProjectCommands.h"

#include <nlohmann/json.hpp>

using clitest::Options;
using clitest::ScratchProject;
using clitest::Slurp;
using nlohmann::json;
using namespace wbhost::cli;

namespace {

constexpr const char* kAnalogOnly = R"(<Target>
  <Line name="AI0"><IOInterface>AnalogInput</IOInterface></Line>
</Target>
)";

class CliItemCommands : public ::testing::Test {
protected:
    void SetUp() override {
        ASSERT_EQ(Must([&](std::ostream& out, std::ostream& err) {
                      return RunProjectNew(Options(), p.path,
                                           {"T=" + p.description, "U=" + p.description,
                                            "V=" + p.scratch.Write("v.xml", kAnalogOnly)},
                                           false, out, err);
                  }),
                  0);
    }
    template <class Work> int Must(Work&& work) {
        const int exit = p.Run(work);
        EXPECT_EQ(exit, 0) << p.err.str();
        return exit;
    }
    void Add(const std::string& target, const std::string& resource, const std::string& name) {
        Must([&](std::ostream& out, std::ostream& err) {
            return RunAddItem(Options(), p.path, {target, resource, name}, out, err);
        });
    }
    int Item(const std::string& target, const std::string& item, const std::string& action,
             std::vector<std::string> arguments, std::map<std::string, std::string> options = {}) {
        return p.Run([&](std::ostream& out, std::ostream& err) {
            return RunItem(Options(), p.path, {target, item, action, arguments, options}, out, err);
        });
    }
    // The items of the reopened project, by target and path.
    std::map<std::string, json> Items() {
        Must([&](std::ostream& out, std::ostream& err) {
            return RunProjectJson(Options(), p.path, out, err);
        });
        std::map<std::string, json> items;
        const json listing = json::parse(p.out.str());
        for (const json& target : listing["targets"]) {
            for (const json& item : target["items"])
                items[target["name"].get<std::string>() + ":" + item["path"].get<std::string>()] =
                    item;
        }
        return items;
    }
    // Runs a rename that must be refused and checks that the project file did not change.
    void Refused(const std::string& item, const std::string& name) {
        const std::string before = Slurp(p.path);
        EXPECT_EQ(Item("T", item, "rename", {name}), 1) << name;
        EXPECT_NE(p.err.str().find("refuses to rename"), std::string::npos) << p.err.str();
        EXPECT_EQ(Slurp(p.path), before) << name;
    }
    // Runs a move that must be refused with a message holding WHY; the file stays as it was.
    void MoveRefused(const std::string& item, std::vector<std::string> arguments,
                     std::map<std::string, std::string> options, const std::string& why) {
        const std::string before = Slurp(p.path);
        EXPECT_EQ(Item("T", item, "move", arguments, options), 1);
        EXPECT_NE(p.err.str().find(why), std::string::npos) << p.err.str();
        EXPECT_EQ(Slurp(p.path), before);
    }
    ScratchProject p;
};

TEST_F(CliItemCommands, TheModuleJudgesNewNamesInTheItemsScope) {
    Add("T", "DIO0", "F/Pump");
    Add("T", "AI0", "Level");
    Add("U", "DIO0", "Valve");

    // Its own name in another case needs no check at all; blanks around a name go.
    EXPECT_EQ(Item("T", "F/Pump", "rename", {"PUMP"}), 0) << p.err.str();
    EXPECT_EQ(Item("T", "F/pump", "rename", {" Pump2\t"}), 0) << p.err.str();
    // Taken in the same scope (the target, folders included), whatever the case and blanks.
    Refused("Level", "pump2");
    Refused("F/Pump2", " LEVEL ");
    // Characters no name may hold, even when unique, and even when the rest is the item's own
    // name (the comparison of names passes over control characters).
    Refused("Level", "Le|vel");
    Refused("Level", "Le\x01vel");
    Refused("Level", "Tank\x1f");
    Refused("Level", "Tank\"1");
    // Another target is another scope.
    EXPECT_EQ(Item("U", "Valve", "rename", {"Level"}), 0) << p.err.str();

    const auto items = Items();
    EXPECT_EQ(items.count("T:F/Pump2"), 1u);
    EXPECT_EQ(items.count("T:Level"), 1u);
    EXPECT_EQ(items.count("U:Level"), 1u);
    EXPECT_EQ(items.size(), 3u);
}

TEST_F(CliItemCommands, TheErrorTextNamesBothItemsUntilTheOtherLetsGo) {
    Add("T", "DIO0", "Pump");
    Add("T", "DIO0", "F/Spare");
    auto items = Items();
    for (const char* path : {"T:Pump", "T:F/Spare"}) {
        // A conflict is told by both items, each naming itself first.
        const std::string error = items[path]["error"];
        EXPECT_NE(error.find("\"Pump\""), std::string::npos) << error;
        EXPECT_NE(error.find("\"Spare\""), std::string::npos) << error;
        EXPECT_EQ(error.find('<'), std::string::npos) << error;
    }
    EXPECT_LT(items["T:F/Spare"]["error"].get<std::string>().find("Spare"),
              items["T:F/Spare"]["error"].get<std::string>().find("Pump"));
    EXPECT_EQ(items["T:Pump"]["physical"], false);

    Must([&](std::ostream& out, std::ostream& err) {
        return RunRemoveItem(Options(), p.path, "T", "Pump", out, err);
    });
    items = Items();
    EXPECT_EQ(items["T:F/Spare"]["statusText"], "bound");
    EXPECT_EQ(items["T:F/Spare"]["error"], "");
}

TEST_F(CliItemCommands, OnlyAMoveToAnotherTargetBindsTheItemAgain) {
    Add("T", "DIO0", "Pump");
    Add("T", "DIO0", "Spare"); // waits for DIO0 behind Pump
    Add("T", "AI0", "F/Level");
    Add("U", "AI0", "Level");

    // Within the target Pump keeps its reservation: binding again would have handed DIO0 to
    // Spare, next in line.
    EXPECT_EQ(Item("T", "Pump", "move", {"f"}), 0) << p.err.str();
    auto items = Items();
    EXPECT_EQ(items["T:F/Pump"]["statusText"], "bound");
    EXPECT_EQ(items["T:Spare"]["statusText"], "conflict");

    MoveRefused("F/Pump", {"Nowhere"}, {}, "has no folder \"Nowhere\"");
    MoveRefused("F/Pump", {"Spare"}, {}, "is no folder");
    MoveRefused("F", {"F"}, {}, "cannot go into itself");
    MoveRefused("F", {}, {{"--to-target", "U"}}, "already has an I/O item called \"Level\"");

    // To another target: the item lets go of T's DIO0 (Spare gets it) and binds in U's tree.
    EXPECT_EQ(Item("T", "F/Pump", "move", {"/"}, {{"--to-target", "U"}}), 0) << p.err.str();
    EXPECT_NE(p.out.str().find("Spare: bound"), std::string::npos) << p.out.str();
    items = Items();
    EXPECT_EQ(items["U:Pump"]["statusText"], "bound");
    EXPECT_EQ(items["U:Pump"]["resource"], "/DIO0");
    EXPECT_EQ(items["T:Spare"]["statusText"], "bound");
    EXPECT_EQ(items["T:Spare"]["error"], "");

    // A target without the resource: missing, and the text names the item.
    EXPECT_EQ(Item("U", "Pump", "move", {}, {{"--to-target", "V"}}), 0) << p.err.str();
    items = Items();
    EXPECT_EQ(items["V:Pump"]["statusText"], "missing");
    const std::string error = items["V:Pump"]["error"];
    EXPECT_NE(error.find("\"Pump\""), std::string::npos) << error;
    EXPECT_EQ(error.find('<'), std::string::npos) << error;
    // A folder takes its items along; its item binds in U, where Level holds AI0 already.
    EXPECT_EQ(Item("T", "F/Level", "rename", {"Gauge"}), 0) << p.err.str();
    EXPECT_EQ(Item("T", "F", "move", {}, {{"--to-target", "U"}}), 0) << p.err.str();
    EXPECT_NE(p.out.str().find("F/Gauge: conflict"), std::string::npos) << p.out.str();
    // Reopened, the project binds the items in the order they asked for their resources.
    items = Items();
    EXPECT_EQ(items["U:F/Gauge"]["statusText"], "conflict");
    EXPECT_EQ(items["U:Level"]["statusText"], "bound");
}

TEST_F(CliItemCommands, ActionsAndItemsThatDoNotExistAreRefused) {
    Add("T", "DIO0", "Pump");
    const std::string before = Slurp(p.path);
    EXPECT_EQ(Item("T", "Nope", "rename", {"X"}), 1);
    EXPECT_NE(p.err.str().find("has no item \"Nope\""), std::string::npos) << p.err.str();
    EXPECT_EQ(Item("T", "Pump", "rename", {}), 1);
    EXPECT_NE(p.err.str().find("usage: item PROJECT --target T ITEM rename NEWNAME"),
              std::string::npos)
        << p.err.str();
    EXPECT_EQ(Item("T", "Pump", "frobnicate", {}), 1);
    EXPECT_NE(p.err.str().find("unknown item action"), std::string::npos) << p.err.str();
    EXPECT_EQ(Slurp(p.path), before);
}

} // namespace
