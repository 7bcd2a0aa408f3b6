// `wbhost demo`: a whole session on the example descriptions.
#include "cli/Demo.h"

#include "cli/Commands.h"
#include "cli/EditCommands.h"
#include "cli/ItemCommands.h"
#include "cli/ProgramCommand.h"
#include "cli/ProjectCommands.h"

#include <filesystem>
#include <fstream>
#include <functional>
#include <map>
#include <nlohmann/json.hpp>
#include <ostream>
#include <sstream>
#include <unistd.h>
#include <vector>

namespace wbhost::cli {
namespace {

namespace fs = std::filesystem;
using Work = std::function<int(std::ostream& out, std::ostream& err)>;

// What a step must give: its exit code, texts its output must hold and texts it must not.
struct Expect {
    int exit = 0;
    std::vector<std::string> holds;
    std::vector<std::string> lacks;
};

// Writes each step's command and output and checks them against what they should be.
class Transcript {
public:
    // A transcript that writes the folder FOLDER (the work folder) as "./", so its commands
    // read as typed there.
    Transcript(std::ostream& out, std::ostream& err, std::string folder)
        : out_(out), err_(err), folder_(std::move(folder)) {}

    // Runs WORK as the command COMMAND and shows at most MAXLINES lines of its output.
    void Step(const std::string& title, const std::string& command, const Expect& expect,
              const Work& work, size_t maxLines = 40) {
        out_ << "== " << ++steps_ << ". " << title << "\n$ wbhost " << Shorten(command) << "\n";
        std::ostringstream output;
        std::ostringstream problems;
        int exit = 0;
        try {
            exit = work(output, problems);
        } catch (const std::exception& e) {
            problems << "wbhost: " << e.what() << "\n";
            exit = -1;
        }
        Show(output.str(), "  ", maxLines);
        Show(problems.str(), "  ! ", maxLines);
        std::string why;
        if (exit != expect.exit)
            why = "exit " + std::to_string(exit) + ", expected " + std::to_string(expect.exit);
        const std::string all = output.str() + problems.str();
        for (const std::string& piece : expect.holds) {
            if (why.empty() && all.find(piece) == std::string::npos)
                why = "the output lacks \"" + piece + "\"";
        }
        for (const std::string& piece : expect.lacks) {
            if (why.empty() && all.find(piece) != std::string::npos)
                why = "the output still shows \"" + piece + "\"";
        }
        out_ << (why.empty() ? "  -> as expected\n\n" : "  -> NOT as expected: " + why + "\n\n");
        if (!why.empty()) {
            ++failures_;
            err_ << "demo: step " << steps_ << " (" << title << "): " << why << "\n";
        }
    }
    int Steps() const noexcept { return steps_; }
    int Failures() const noexcept { return failures_; }

private:
    std::string Shorten(std::string text) const {
        const std::string prefix = folder_ + "/";
        for (size_t at = text.find(prefix); at != std::string::npos; at = text.find(prefix, at))
            text.replace(at, prefix.size(), "./");
        return text;
    }
    void Show(const std::string& text, const char* prefix, size_t maxLines) {
        std::istringstream lines(Shorten(text));
        std::string line;
        size_t count = 0;
        while (std::getline(lines, line)) {
            if (++count <= maxLines)
                out_ << prefix << line << "\n";
        }
        if (count > maxLines)
            out_ << prefix << "... (" << count << " lines in all)\n";
    }
    std::ostream& out_;
    std::ostream& err_;
    const std::string folder_;
    int steps_ = 0;
    int failures_ = 0;
};

// The folder the demo works in: the one asked for, or a temporary one removed at the end.
class WorkFolder {
public:
    explicit WorkFolder(const std::string& asked) {
        if (!asked.empty()) {
            std::error_code ignored;
            fs::create_directories(asked, ignored);
            path_ = asked;
            return;
        }
        std::string pattern = (fs::temp_directory_path() / "wbhost-demo-XXXXXX").string();
        if (::mkdtemp(pattern.data()) != nullptr) {
            path_ = pattern;
            temporary_ = true;
        }
    }
    ~WorkFolder() {
        std::error_code ignored;
        if (temporary_)
            fs::remove_all(path_, ignored);
    }
    WorkFolder(const WorkFolder&) = delete;
    WorkFolder& operator=(const WorkFolder&) = delete;
    bool Usable() const { return !path_.empty() && fs::is_directory(path_); }
    std::string File(const std::string& name) const { return (fs::path(path_) / name).string(); }
    const std::string& Path() const noexcept { return path_; }

private:
    std::string path_;
    bool temporary_ = false;
};

// The analog input that the demo removes and then puts back, described as the board does.
constexpr const char* kAnalogInput = R"(<AnalogChannel name="AI2">
  <Protocols>IOResource,AnalogInput</Protocols>
  <IOInterface>AnalogInput</IOInterface>
  <Channel>2</Channel>
  <MethodSet>
    <Method name="Read"><Signature>Double Read()</Signature></Method>
  </MethodSet>
  <AttributeSet>
    <Attribute name="Mode"><Value>Calibrated</Value></Attribute>
  </AttributeSet>
</AnalogChannel>
)";

void PlayDescriptions(Transcript& script, const HostOptions& options, const std::string& dir) {
    const auto file = [&](const char* name) { return (fs::path(dir) / name).string(); };
    for (const char* name : {"KestrelK40.xml", "KestrelK40X.xml", "KestrelK20.xml"}) {
        script.Step(
            std::string("Load and check ") + name, "tree " + file(name),
            {0, {"<Target name="}, {"Error on line"}},
            [&](std::ostream& out, std::ostream& err) {
                return RunTree(options.modulePath, file(name), "", out, err);
            },
            6);
    }
    script.Step(
        "One node of the K-40", "tree " + file("KestrelK40.xml") + " Connector0/DIO3",
        {0, {"<DigitalLine name=\"DIO3\">", "<Line>3</Line>"}, {"DIO4"}},
        [&](std::ostream& out, std::ostream& err) {
            return RunTree(options.modulePath, file("KestrelK40.xml"), "Connector0/DIO3", out, err);
        },
        12);
    const struct {
        const char* offered;
        int answer;
        const char* text;
    } comparisons[] = {{"KestrelK40.xml", 0, "match"},
                       {"KestrelK40X.xml", 2, "tolerated difference"},
                       {"KestrelK20.xml", 1, "not satisfied"}};
    for (const auto& each : comparisons) {
        script.Step(std::string("Does the ") + each.offered + " satisfy what the K-40 asks for?",
                    "compare " + file("KestrelK40.xml") + " " + file(each.offered),
                    {each.answer, {each.text}, {}}, [&](std::ostream& out, std::ostream& err) {
                        return RunCompare(options.modulePath, file("KestrelK40.xml"),
                                          file(each.offered), false, out, err);
                    });
    }
}

void PlayProject(Transcript& script, const HostOptions& options, const std::string& examples,
                 const WorkFolder& work) {
    const std::string project = work.File("demo.wbproj");
    const std::string description = (fs::path(examples) / "KestrelK40.xml").string();
    script.Step(
        "Create a project with two K-40 boards, targets \"K40\" and \"K40B\"",
        "project new " + project + " --target K40=" + description + " --target K40B=" + description,
        {0, {"created", "target \"K40\"", "target \"K40B\""}, {}},
        [&](std::ostream& out, std::ostream& err) {
            return RunProjectNew(options, project, {"K40=" + description, "K40B=" + description},
                                 true, out, err);
        });
    const auto addItem = [&](const std::string& title, const AddItemRequest& item,
                             const Expect& expect) {
        std::string command = "project add-item " + project + " --target " + item.target +
                              " --resource " + item.resource;
        if (!item.name.empty())
            command += " --name '" + item.name + "'";
        script.Step(title, command, expect, [&](std::ostream& out, std::ostream& err) {
            return RunAddItem(options, project, item, out, err);
        });
    };
    addItem(
        "An item for a digital line: it binds to its resource", {"K40", "Connector1/DIO3", "Valve"},
        {0,
         {"Tangent I/O item \"Valve\"", "resource=/Connector1/DIO3", "tioResourceStatus: bound"},
         {}});
    addItem("An item in a folder, for an analog input",
            {"K40", "AnalogInputs/AI2", "Sensors/Pressure"},
            {0,
             {"folder \"Sensors\"", "Tangent I/O item \"Pressure\"", "resource=/AnalogInputs/AI2"},
             {}});
    addItem(
        "A second item on the line of \"Valve\": the first holds it, so this one is in conflict",
        {"K40", "Connector1/DIO3", "Backup"},
        {0, {"Tangent I/O item \"Backup\"", "tioResourceStatus: held by another item"}, {}});
    addItem(
        "Through the wizard, an item whose name keeps an escaped \"/\", in a new folder",
        {"K40", "Connector0/DIO5", "Pumps/Inlet\\/Outlet"},
        {0, {"through the wizard", "folder \"Pumps\"", "Tangent I/O item \"Inlet/Outlet\""}, {}});
    addItem("A second item in that folder: the folder is reused",
            {"K40", "Connector0/DIO6", "pumps/Drain"},
            {0, {"Tangent I/O item \"Drain\"", "resource=/Connector0/DIO6"}, {"folder \"pumps\""}});
    addItem("A resource the board does not have", {"K40", "Connector0/DIO9", ""},
            {1, {"has no resource \"Connector0/DIO9\""}, {}});
    addItem("A name the target has already", {"K40", "Connector0/DIO0", "valve"},
            {1, {"already has an item called"}, {}});
}

// Checks the JSON listing TEXT: each item of EXPECTED (path, status) is there with that status.
// False, with what differs on ERR, otherwise.
bool HoldsStatuses(const std::string& text,
                   const std::vector<std::pair<std::string, int>>& expected, std::ostream& err) {
    const auto listing = nlohmann::json::parse(text, nullptr, false);
    if (listing.is_discarded()) {
        err << "demo: the listing is not JSON\n";
        return false;
    }
    std::map<std::string, nlohmann::json> items;
    for (const auto& target : listing["targets"]) {
        for (const auto& item : target["items"])
            items[item["path"].get<std::string>()] = item;
    }
    bool all = true;
    for (const auto& [path, status] : expected) {
        const auto found = items.find(path);
        if (found == items.end() || found->second["status"] != status) {
            err << "demo: " << path << " should have status " << status << "\n";
            all = false;
        }
    }
    return all;
}

void PlayEdits(Transcript& script, const HostOptions& options, const WorkFolder& work) {
    const std::string project = work.File("demo.wbproj");
    const std::string analog = work.File("ai2.xml");
    std::ofstream(analog, std::ios::binary) << kAnalogInput;
    const auto edit = [&](const std::string& title, const std::string& action,
                          const std::vector<std::string>& arguments, const Expect& expect) {
        std::string command = "edit " + project + " K40 " + action;
        for (const std::string& argument : arguments)
            command +=
                " " + (argument.find(' ') == std::string::npos ? argument : "\"" + argument + "\"");
        script.Step(title, command, expect, [&](std::ostream& out, std::ostream& err) {
            EditRequest request{"K40", EditKind::Rename, "", "", ""};
            std::string error;
            if (!ParseEdit(action, arguments, request, error)) {
                err << error << "\n";
                return 1;
            }
            return RunEdit(options, project, request, out, err);
        });
    };
    edit("Rename the connector above \"Valve\" and \"Backup\": both follow it", "rename",
         {"Connector1", "RearConnector"},
         {0,
          {"renamed /Connector1", "Valve: bound, resource \"/RearConnector/DIO3\"",
           "Backup: conflict, resource \"/RearConnector/DIO3\""},
          {"do not read back the same"}});
    edit("Remove the analog input of \"Pressure\": its item says it is missing", "remove",
         {"AnalogInputs/AI2"}, {0, {"removed", "Sensors/Pressure: missing"}, {}});
    edit("Put the input back: the item was watching for it and binds again", "insert",
         {"AnalogInputs", analog},
         {0, {"inserted", "Sensors/Pressure: bound, resource \"/AnalogInputs/AI2\""}, {}});
    const std::string read = "RearConnector/DIO3/MethodSet/Read";
    edit("Change the signature of the line's Read method: the feature set counts once",
         "set-attribute", {read, "Signature", "Boolean Read(U8 Port)"},
         {0, {"Valve: bound, resource \"/RearConnector/DIO3\", feature set 1"}, {}});
    edit("The same signature in other case is no change", "set-attribute",
         {read, "Signature", "boolean read(u8 port)"},
         {0, {"Valve: bound, resource \"/RearConnector/DIO3\", feature set 1"}, {}});
    edit("A node that is not there", "remove", {"AnalogInputs/AI9"}, {1, {"has no node"}, {}});
    script.Step(
        "Reopen the saved project: every item binds back to the same status",
        "project list " + project + " --json", {0, {"\"featureSetVersion\": 1"}, {}},
        [&](std::ostream& out, std::ostream& err) {
            std::ostringstream listing;
            const int exit = RunProjectJson(options, project, listing, err);
            out << listing.str();
            const bool same = HoldsStatuses(
                listing.str(), {{"Valve", 0}, {"Backup", 2}, {"Sensors/Pressure", 0}}, err);
            return exit != 0 || !same ? 1 : 0;
        },
        60);
    const std::string kept = EditedDescriptionPath(project, u"K40");
    script.Step("The kept tree: the method under the renamed connector, with the signature the "
                "items saw last",
                "tree " + kept + " " + read,
                {0,
                 {"<Signature>boolean read(u8 port)</Signature>",
                  "<TIOLastSignature>Boolean Read(U8 Port)</TIOLastSignature>"},
                 {}},
                [&](std::ostream& out, std::ostream& err) {
                    return RunTree(options.modulePath, kept, read, out, err);
                }); // After the kept tree is shown: a change of the line makes its items bind
                    // again, and they
    // record the signature as it now reads.
    edit("Set a property through the module on a path whose last piece names no node: the "
         "deepest node it names takes it",
         "set-property", {"RearConnector/DIO3/Label", "Valve line"},
         {0, {"set the property Label=\"Valve line\" on /RearConnector/DIO3"}, {}});
    edit("A path that leaves the tree before its last piece sets nothing", "set-property",
         {"RearConnector/DIO9/Label", "x"}, {1, {"nothing was set"}, {}});
}

// A rack of 4 slots of 32 digital lines, and a list of 100 items for it, as a person writes one.
void WriteRack(const std::string& board, const std::string& list, const std::string& badList) {
    std::ofstream rack(board, std::ios::binary);
    rack << "<Target>\n  <TIOItemTypeName>Rack I/O</TIOItemTypeName>\n";
    for (int slot = 0; slot < 4; ++slot) {
        rack << "  <Connector name=\"Slot" << slot << "\">\n";
        for (int line = 0; line < 32; ++line)
            rack << "    <DigitalLine name=\"DIO" << line << "\"><Line>" << line
                 << "</Line></DigitalLine>\n";
        rack << "  </Connector>\n";
    }
    rack << "</Target>\n";
    std::ofstream items(list, std::ios::binary);
    items << "# NAME<TAB>RESOURCE[<TAB>ATTRIBUTE=VALUE]...\n";
    for (int i = 0; i < 100; ++i)
        items << "Slot" << i / 32 << "/Line" << i << "\tSlot" << i / 32 << "/DIO" << i % 32
              << "\tColour=" << (i % 2 == 0 ? "green" : "red") << "\n";
    std::ofstream(badList, std::ios::binary)
        << "# the third line has no resource\nFirst\tSlot0/DIO0\nSecond\n";
}

void PlayBulkImport(Transcript& script, const HostOptions& options, const WorkFolder& work) {
    const std::string board = work.File("rack.xml");
    const std::string list = work.File("rack-items.txt");
    const std::string badList = work.File("rack-bad.txt");
    const std::string project = work.File("rack.wbproj");
    WriteRack(board, list, badList);
    script.Step("A project for a rack of 128 digital lines",
                "project new " + project + " --target Rack=" + board,
                {0, {"created", "target \"Rack\""}, {}}, [&](std::ostream& out, std::ostream& err) {
                    return RunProjectNew(options, project, {"Rack=" + board}, true, out, err);
                });
    script.Step("A list whose third line is bad: refused with its line, nothing created",
                "project add-items " + project + " --target Rack " + badList,
                {1, {"rack-bad.txt:3:", "expected NAME<TAB>RESOURCE"}, {}},
                [&](std::ostream& out, std::ostream& err) {
                    return RunAddItems(options, project, "Rack", badList, out, err);
                });
    script.Step("Import 100 items from the list in one call of TIO_CreateMultiple",
                "project add-items " + project + " --target Rack " + list,
                {0, {"added 100 items to target \"Rack\" in one call"}, {}},
                [&](std::ostream& out, std::ostream& err) {
                    return RunAddItems(options, project, "Rack", list, out, err);
                });
    script.Step(
        "Reopened, all 100 items are bound to their lines", "project list " + project + " --json",
        {0, {"100 items, 100 bound"}, {}}, [&](std::ostream& out, std::ostream& err) {
            std::ostringstream listing;
            const int exit = RunProjectJson(options, project, listing, err);
            const auto json = nlohmann::json::parse(listing.str(), nullptr, false);
            size_t items = 0;
            size_t bound = 0;
            for (const auto& target : json.is_discarded() ? nlohmann::json() : json["targets"]) {
                for (const auto& item : target["items"]) {
                    ++items;
                    bound += item["status"] == 0 ? 1 : 0;
                }
            }
            out << items << " items, " << bound << " bound\n";
            return exit;
        });
}

void PlayItemCommands(Transcript& script, const HostOptions& options, const WorkFolder& work) {
    const std::string project = work.File("demo.wbproj");
    const auto item = [&](const std::string& title, const ItemRequest& request,
                          const Expect& expect) {
        std::string command = "item " + project + " --target " + request.target + " " +
                              request.item + " " + request.action;
        for (const auto& [name, value] : request.options)
            command += " " + name + " " + value;
        for (const std::string& argument : request.arguments)
            command += " \"" + argument + "\"";
        script.Step(title, command, expect, [&](std::ostream& out, std::ostream& err) {
            return RunItem(options, project, request, out, err);
        });
    };
    item("Rename \"Valve\" to a name holding \"|\": the module refuses, nothing changes",
         {"K40", "Valve", "rename", {"Va|ve"}, {}}, {1, {"refuses to rename"}, {"renamed"}});
    item("Rename \"Backup\" to \"VALVE\": the name is in use in another case",
         {"K40", "Backup", "rename", {"VALVE"}, {}}, {1, {"refuses to rename"}, {"renamed"}});
    item("Rename \"Backup\" to \" Standby \": the blanks go",
         {"K40", "Backup", "rename", {" Standby "}, {}},
         {0, {"renamed \"Backup\" to \"Standby\""}, {}});
    item("Move \"Pressure\" out of its folder: same target, it keeps its binding",
         {"K40", "Sensors/Pressure", "move", {"/"}, {}},
         {0, {"moved \"Pressure\" to target \"K40\"", "Pressure: bound"}, {}});
    item("Move \"Pressure\" to the other board: it binds to that board's input",
         {"K40", "Pressure", "move", {}, {{"--to-target", "K40B"}}},
         {0,
          {"moved \"Pressure\" to target \"K40B\"",
           "Pressure: bound, resource \"/AnalogInputs/AI2\""},
          {}});
    script.Step(
        "The listing tells why an item is in error: both items of the conflict are named",
        "project list " + project + " --json",
        {0,
         {"\"error\": \"The I/O item \\\"Standby\\\" uses the same resource as the "
          "I/O item \\\"Valve\\\""},
         {}},
        [&](std::ostream& out, std::ostream& err) {
            return RunProjectJson(options, project, out, err);
        },
        20);
}

void PlayItemDialogs(Transcript& script, const HostOptions& options, const WorkFolder& work) {
    const std::string project = work.File("demo.wbproj");
    // A dialog in a session without a user answers what the session was told to; the runs are
    // recorded, with the host references they were handed.
    const auto item = [&](const std::string& title, const ItemRequest& request,
                          const std::vector<std::string>& answers, const Expect& expect) {
        HostOptions answered = options;
        answered.answers = answers;
        answered.record = !answers.empty();
        std::string command;
        for (const std::string& answer : answers)
            command += "--answer " + answer + " ";
        command += std::string(answered.record ? "--record " : "") + "item " + project +
                   " --target " + request.target + " " + request.item + " " + request.action;
        for (const std::string& argument : request.arguments)
            command += " " + argument;
        script.Step(title, command, expect, [&](std::ostream& out, std::ostream& err) {
            return RunItem(answered, project, request, out, err);
        });
    };
    item("The menu of \"Standby\", in conflict: it can explain its error",
         {"K40", "Standby", "menu", {}, {}}, {},
         {0, {"Explain Error...  {CBB26BAB-B605-4BC7-BE58-98DDC98C9F70}"}, {}});
    item("The explanation names the item that holds the line; asked to, the tree shows it",
         {"K40", "Standby", "run", {"explain-error"}, {}}, {"explain-error:0=1"},
         {0,
          {"TIOExplainErrorDialog.gx (explain-error)", "as the I/O item \\\"Valve\\\"",
           "the project tree selects and shows \"Valve\"", "0 still open"},
          {}});
    const std::vector<std::string> chooseDio = {"select-resource:0=0", "select-resource:2=1"};
    auto choose = [&](const char* path) {
        std::vector<std::string> answers = chooseDio;
        answers.push_back(std::string("select-resource:1=text:") + path);
        return answers;
    };
    item("Choose another line for \"Standby\": bound now, and the user's own name stays",
         {"K40", "Standby", "run", {"select-resource"}, {}}, choose("/RearConnector/DIO6"),
         {0,
          {"ran select-resource on \"Standby\"", "9 = \"/RearConnector/DIO3\"", "0 still open"},
          {"is now called"}});
    script.Step(
        "An item named after its line, as the board shows it",
        "project add-item " + project +
            " --target K40 --resource RearConnector/DIO4 "
            "--name DIO4",
        {0, {"Tangent I/O item \"DIO4\""}, {}}, [&](std::ostream& out, std::ostream& err) {
            return RunAddItem(options, project, {"K40", "RearConnector/DIO4", "DIO4"}, out, err);
        });
    item("Choose DIO7 for it: the name follows the line's display name",
         {"K40", "DIO4", "run", {"select-resource"}, {}}, choose("/RearConnector/DIO7"),
         {0, {"\"DIO4\" is now called \"DIO7\"", "0 still open"}, {}});
    script.Step(
        "Reopened, both items are bound where they were put", "project list " + project + " --json",
        {0, {"\"path\": \"DIO7\""}, {}},
        [&](std::ostream& out, std::ostream& err) {
            std::ostringstream listing;
            const int exit = RunProjectJson(options, project, listing, err);
            out << listing.str();
            const bool bound = HoldsStatuses(listing.str(), {{"Standby", 0}, {"DIO7", 0}}, err);
            return exit != 0 || !bound ? 1 : 0;
        },
        0);
    item("Help for \"Valve\": its line names none, nor does the board, so the module's own page",
         {"K40", "Valve", "help", {}, {}}, {},
         {0, {"/help/wbfpgaconcepts.chm", "topic: Performing_Basic_I_O.html"}, {}});
}

void PlayPrograms(Transcript& script, const HostOptions& options) {
    script.Step("A unique name next to the names taken",
                "program TIOGenUniqueName.gx --input 0=text:Valve --input \"1=list:Valve|Valve1\"",
                {0, {"4 = \"Valve2\""}, {}}, [&](std::ostream& out, std::ostream& err) {
                    return RunProgram(options, "TIOGenUniqueName.gx",
                                      {"0=text:Valve", "1=list:Valve|Valve1"}, out, err);
                });
    // A dialog in a session without a user answers what the session was told to.
    HostOptions answered = options;
    answered.answers = {"select-resource:0=0", "select-resource:1=text:Connector1/DIO5"};
    script.Step("The resource dialog, answered from the session",
                "--answer select-resource:0=0 --answer select-resource:1=text:Connector1/DIO5 "
                "program TIOSelectResourceDialog.gx --input 9=text:Connector0/DIO3",
                {0, {"0 = 0", "1 = \"Connector1/DIO5\""}, {}},
                [&](std::ostream& out, std::ostream& err) {
                    return RunProgram(answered, "TIOSelectResourceDialog.gx",
                                      {"9=text:Connector0/DIO3"}, out, err);
                });
    script.Step("Without answers the dialog is closed: cancelled, the resource kept",
                "program TIOSelectResourceDialog.gx --input 9=text:Connector0/DIO3",
                {0, {"0 = 1", "1 = \"Connector0/DIO3\""}, {}},
                [&](std::ostream& out, std::ostream& err) {
                    return RunProgram(options, "TIOSelectResourceDialog.gx",
                                      {"9=text:Connector0/DIO3"}, out, err);
                });
}

} // namespace

int RunDemo(const HostOptions& options, const DemoSettings& settings, std::ostream& out,
            std::ostream& err) {
    const WorkFolder work(settings.workFolder);
    if (!work.Usable()) {
        err << "demo: no folder to work in\n";
        return 1;
    }
    if (!fs::is_regular_file(fs::path(settings.examples) / "KestrelK40.xml")) {
        err << "demo: " << settings.examples << " does not hold the example descriptions\n";
        return 1;
    }
    out << "(working in " << work.Path() << ", written ./ below)\n\n";
    Transcript script(out, err, work.Path());
    PlayDescriptions(script, options, settings.examples);
    PlayProject(script, options, settings.examples, work);
    PlayEdits(script, options, work);
    PlayItemCommands(script, options, work);
    PlayItemDialogs(script, options, work);
    PlayBulkImport(script, options, work);
    PlayPrograms(script, options);
    if (script.Failures() != 0) {
        out << "demo: " << script.Failures() << " of " << script.Steps()
            << " steps did not give what they should\n";
        return 1;
    }
    out << "demo: all " << script.Steps() << " steps gave what they should\n";
    return 0;
}

} // namespace wbhost::cli
