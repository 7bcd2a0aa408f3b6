// `wbhost edit`: a target's tree changed, its items listed, the change kept with the project.
#include "CliTestSupport.h"
#include "cli/Commands.h"
#include "cli/EditCommands.h"

#include <map>

using clitest::Options;
using clitest::ScratchProject;
using clitest::Slurp;
using namespace wbhost::cli;

namespace {

class CliEdit : public ::testing::Test {
protected:
    void SetUp() override {
        ASSERT_EQ(p.New({"T=" + p.description}), kProjectOk) << p.err.str();
        ASSERT_EQ(p.Add({"T", "DIO0", "Valve"}), kProjectOk) << p.err.str();
    }
    // The dump of the node PATH of the tree the project now refers to; empty when absent.
    std::string KeptNode(const std::string& path) {
        std::ostringstream out;
        std::ostringstream err;
        return RunTree(WBT_MODULE_PATH, EditedDescriptionPath(p.path, u"T"), path, out, err) == 0
                   ? out.str()
                   : std::string();
    }
    ScratchProject p;
};

TEST(CliEditParse, EachActionTakesItsOwnArgumentsAndKeptDescriptionsArePlainFileNames) {
    EditRequest request;
    std::string error;
    ASSERT_TRUE(ParseEdit("rename", {"A/B", "C"}, request, error));
    EXPECT_EQ(request.kind, EditKind::Rename);
    EXPECT_EQ(request.node, "A/B");
    EXPECT_EQ(request.argument, "C");
    ASSERT_TRUE(ParseEdit("remove", {"A"}, request, error));
    EXPECT_EQ(request.kind, EditKind::Remove);
    EXPECT_EQ(request.argument, "");
    ASSERT_TRUE(ParseEdit("insert", {"/", "part.xml"}, request, error));
    EXPECT_EQ(request.kind, EditKind::Insert);
    ASSERT_TRUE(ParseEdit("set-attribute", {"A", "N", "V"}, request, error));
    EXPECT_EQ(request.kind, EditKind::SetAttribute);
    EXPECT_EQ(request.value, "V");
    EXPECT_FALSE(ParseEdit("remove-attribute", {"A"}, request, error));
    EXPECT_NE(error.find("remove-attribute NODE NAME"), std::string::npos);
    EXPECT_FALSE(ParseEdit("rename", {"A"}, request, error));
    EXPECT_NE(error.find("rename NODE NEWNAME"), std::string::npos);
    EXPECT_FALSE(ParseEdit("remove", {"A", "B"}, request, error));
    EXPECT_FALSE(ParseEdit("move", {"A", "B"}, request, error));
    // Kept descriptions are named as plain files beside the project.
    EXPECT_EQ(EditedDescriptionPath("/p/x.wbproj", u"K40"), "/p/x.wbproj.K40.xml");
    EXPECT_EQ(EditedDescriptionPath("x", u"../a b/\u00e9"), "x.___a_b___.xml");
}

TEST_F(CliEdit, RefusedEditsChangeNoFileOthersReachTheReopenedProjectNeverTheDescription) {
    const std::string saved = Slurp(p.path);
    const std::string broken = p.scratch.Write("broken.xml", "<Line name=\"X\"><Oops></Line>");
    const struct {
        const char* action;
        std::vector<std::string> arguments;
        const char* says;
    } refusals[] = {
        {"rename", {"DIO9", "X"}, "no node \"DIO9\""},
        {"rename", {"DIO0", "AI0"}, "cannot rename /DIO0"},
        {"rename", {"DIO0", ""}, "cannot rename"},
        {"remove", {"/"}, "root of a target cannot be removed"},
        {"remove", {"AI0/X"}, "no node"},
        {"insert", {"DIO9", broken}, "no node"},
        {"insert", {"/", broken}, "does not load"},
        {"insert", {"/", p.scratch.File("missing.xml")}, "cannot read"},
        {"remove-attribute", {"DIO0", "Nothing"}, "has no attribute \"Nothing\""},
        {"set-attribute", {"/", "DIO0", "x"}, "not an attribute"},
        {"set-attribute", {"DIO9", "A", "x"}, "no node"},
    };
    for (const auto& each : refusals) {
        EXPECT_EQ(p.Edit(each.action, each.arguments), 1) << each.says;
        EXPECT_NE(p.err.str().find(each.says), std::string::npos) << p.err.str();
        EXPECT_EQ(Slurp(p.path), saved) << each.says;
        EXPECT_FALSE(std::filesystem::exists(EditedDescriptionPath(p.path, u"T"))) << each.says;
    }
    EditRequest request{"U", EditKind::Remove, "AI0", "", ""};
    EXPECT_EQ(RunEdit(Options(), p.path, request, p.out, p.err), 1);
    // Edits reach the reopened project and never the original description.
    const std::string original = Slurp(p.description);
    ASSERT_EQ(p.Edit("rename", {"DIO0", "Valve0"}), 0) << p.err.str();
    EXPECT_NE(p.out.str().find("renamed /DIO0 to \"Valve0\""), std::string::npos);
    EXPECT_NE(p.out.str().find("Tangent I/O item \"Valve\""), std::string::npos) << p.out.str();
    EXPECT_NE(Slurp(p.path).find(EditedDescriptionPath(p.path, u"T")), std::string::npos);

    // The second edit starts from the first one's tree, read back through the project.
    ASSERT_EQ(p.Edit("remove", {"AI0"}), 0) << p.err.str();
    const std::string part = p.scratch.Write(
        "part.xml", "<Line name=\"DIO1\"><IOInterface>DigitalLine</IOInterface></Line>");
    ASSERT_EQ(p.Edit("insert", {"/", part}), 0) << p.err.str();
    EXPECT_NE(KeptNode("Valve0"), "");
    EXPECT_EQ(KeptNode("DIO0"), "");
    EXPECT_EQ(KeptNode("AI0"), "");
    EXPECT_NE(KeptNode("DIO1").find("<IOInterface>DigitalLine</IOInterface>"), std::string::npos);
    EXPECT_EQ(Slurp(p.description), original);

    // Items can be added for what was inserted.
    EXPECT_EQ(p.Add({"T", "DIO1", ""}), kProjectOk) << p.err.str();
}

TEST_F(CliEdit, AttributeEditsAreKeptAndTheItemsStateIsListed) {
    ASSERT_EQ(p.Add({"T", "AI0", "Sensors/Level"}), kProjectOk) << p.err.str();
    ASSERT_EQ(p.Edit("set-attribute", {"DIO0", "HiddenTIO", "TRUE"}), 0) << p.err.str();
    EXPECT_NE(p.out.str().find("set HiddenTIO=\"TRUE\" on /DIO0"), std::string::npos);
    // Every edit ends with what each item reports, folders in its path.
    EXPECT_NE(p.out.str().find("  Sensors/Level: "), std::string::npos) << p.out.str();
    ASSERT_EQ(p.Edit("set-attribute", {"DIO0", "Note", "a & b <c>"}), 0) << p.err.str();
    EXPECT_NE(KeptNode("DIO0").find("<HiddenTIO>TRUE</HiddenTIO>"), std::string::npos);
    ASSERT_EQ(p.Edit("remove-attribute", {"DIO0", "hiddentio"}), 0) << p.err.str();
    const std::string node = KeptNode("DIO0");
    EXPECT_EQ(node.find("HiddenTIO"), std::string::npos) << node;
    EXPECT_NE(node.find("<Note>a &amp; b &lt;c&gt;</Note>"), std::string::npos) << node;

    const auto listing = p.Json();
    ASSERT_EQ(listing["targets"].size(), 1u);
    const auto& items = listing["targets"][0]["items"];
    ASSERT_EQ(items.size(), 2u) << listing.dump(2);
    EXPECT_EQ(items[0]["path"], "Valve");
    EXPECT_EQ(items[1]["path"], "Sensors/Level");
    EXPECT_EQ(items[1]["id"].get<std::string>().size(), 38u);
    for (const auto& item : items) {
        for (const char* field :
             {"resource", "status", "statusText", "hidden", "featureSetVersion"})
            EXPECT_TRUE(item.contains(field)) << field;
    }
}

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

// Items driven by edits: each command opens the saved project (the module makes and binds
// every item), changes the target's tree, saves, and the JSON listing tells what every item
// now reports. The items' own rules are tested in ItemBindingTest.
class CliItemLife : public ::testing::Test {
protected:
    void SetUp() override {
        p.description = p.scratch.Write("board.xml", kBoard);
        ASSERT_EQ(p.New({"T=" + p.description}), kProjectOk) << p.err.str();
    }
    void Add(const std::string& resource, const std::string& name) {
        EXPECT_EQ(p.Add({"T", resource, name}), kProjectOk) << p.err.str();
    }
    void Edit(const std::string& action, const std::vector<std::string>& arguments) {
        EXPECT_EQ(p.Edit(action, arguments), 0) << p.err.str();
    }
    // The items of the reopened project by path.
    std::map<std::string, nlohmann::json> Items() {
        std::map<std::string, nlohmann::json> items;
        const auto listing = p.Json();
        for (const auto& item : listing["targets"][0]["items"])
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
