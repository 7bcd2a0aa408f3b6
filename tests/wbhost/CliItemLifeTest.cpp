// Tangent I/O items driven from the command line: each command opens the saved project (the
// module makes and binds every item), changes the target's tree, saves, and the JSON listing
// tells what every item now reports. The items' own rules are tested in ItemBindingTest.
#include "CliTestSupport.h"
#include "cli/EditCommands.h"
#include "cli/ProjectCommands.h"

#include <nlohmann/json.hpp>

using clitest::Options;
using clitest::ScratchProject;
using nlohmann::json;
using namespace wbhost::cli;

namespace {

constexpr const char* kBoard = R"(<Target name="Board">
  <Connector name="C0">
    <DigitalLine name="DIO0">
      <MethodSet>
        <Method name="Read"><Signature>Boolean Read()</Signature></Method>
      </MethodSet>
      <AttributeSet>
        <Attribute name="Direction"><Value>Input</Value></Attribute>
        <Attribute name="Colour"><Value>Red</Value>
          <DoesNotAffectCompilation>Yes</DoesNotAffectCompilation></Attribute>
        <Attribute name="Initial"><Value>Low</Value>
          <DoesNotAffectCompilation>false</DoesNotAffectCompilation></Attribute>
      </AttributeSet>
    </DigitalLine>
  </Connector>
</Target>
)";

class CliItemLife : public ::testing::Test {
protected:
    void SetUp() override {
        p.description = p.scratch.Write("board.xml", kBoard);
        ASSERT_EQ(Run([&](std::ostream& out, std::ostream& err) {
                      return RunProjectNew(Options(), p.path, {"T=" + p.description}, false, out,
                                           err);
                  }),
                  kProjectOk);
    }
    template <class Work> int Run(Work&& work) {
        const int exit = p.Run(work);
        EXPECT_EQ(exit, 0) << p.err.str();
        return exit;
    }
    void Add(const std::string& resource, const std::string& name) {
        Run([&](std::ostream& out, std::ostream& err) {
            return RunAddItem(Options(), p.path, {"T", resource, name}, out, err);
        });
    }
    void Edit(const std::string& action, const std::vector<std::string>& arguments) {
        EditRequest request;
        request.target = "T";
        std::string error;
        ASSERT_TRUE(ParseEdit(action, arguments, request, error)) << error;
        Run([&](std::ostream& out, std::ostream& err) {
            return RunEdit(Options(), p.path, request, out, err);
        });
    }
    // The items of the reopened project by path.
    std::map<std::string, json> Items() {
        Run([&](std::ostream& out, std::ostream& err) {
            return RunProjectJson(Options(), p.path, out, err);
        });
        std::map<std::string, json> items;
        const json listing = json::parse(p.out.str());
        for (const json& item : listing["targets"][0]["items"])
            items[item["path"].get<std::string>()] = item;
        return items;
    }
    ScratchProject p;
};

TEST_F(CliItemLife, EditsReachTheItemsAndTheListingShowsWhatTheyReport) {
    Add("C0/DIO0", "F/Valve"); // in a folder: the path says so
    Add("C0/DIO0", "Backup");
    auto items = Items();
    EXPECT_EQ(items["F/Valve"]["statusText"], "bound");
    EXPECT_EQ(items["Backup"]["statusText"], "conflict");
    // Defaults arrive from the definitions; "Yes" leaves one out of the configuration, "false"
    // keeps it.
    const std::string configuration = items["F/Valve"]["compileConfiguration"];
    EXPECT_NE(configuration.find("Direction=Input;Initial=Low;resource=/C0/DIO0;0"),
              std::string::npos)
        << configuration;
    EXPECT_EQ(configuration.find("Colour"), std::string::npos) << configuration;

    // Each command is a session of its own: what one edit made the items do is what the next
    // one finds after reopening.
    Edit("rename", {"C0", "Front"});
    Edit("set-attribute", {"Front/DIO0/MethodSet/Read", "Signature", "Boolean Read(U8 Port)"});
    Edit("set-attribute", {"Front/DIO0/MethodSet/Read", "Signature", "BOOLEAN READ(u8 port)"});
    EXPECT_NE(p.out.str().find("F/Valve: bound, resource \"/Front/DIO0\", feature set 1"),
              std::string::npos)
        << p.out.str();
    Edit("set-attribute", {"Front/DIO0", "HiddenTIO", "TRUE"});
    Edit("remove-attribute", {"Front/DIO0", "HiddenTIO"});
    items = Items();
    EXPECT_EQ(items["F/Valve"]["resource"], "/Front/DIO0");
    EXPECT_EQ(items["Backup"]["resource"], "/Front/DIO0");
    EXPECT_EQ(items["Backup"]["status"], 2);
    EXPECT_EQ(items["F/Valve"]["featureSetVersion"], 1);
    EXPECT_EQ(items["F/Valve"]["hidden"], true); // the attribute went; the item stays hidden
    EXPECT_EQ(Items(), items);
}

} // namespace
