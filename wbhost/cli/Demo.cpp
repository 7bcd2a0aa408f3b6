// `wbhost demo`: a whole session on the example descriptions.
#include "cli/Demo.h"

#include "cli/Commands.h"
#include "cli/EditCommands.h"
#include "cli/ProgramCommand.h"
#include "cli/ProjectCommands.h"

#include <filesystem>
#include <fstream>
#include <functional>
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

// A part the demo inserts into the target: a third connector with one line.
constexpr const char* kExpansion = R"(<Connector name="Connector2">
  <DisplayName>Connector 2 (expansion)</DisplayName>
  <DigitalLine name="DIO0">
    <Protocols>IOResource,DigitalLine</Protocols>
    <IOInterface>DigitalLine</IOInterface>
  </DigitalLine>
</Connector>
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
    script.Step("One node of the K-40", "tree " + file("KestrelK40.xml") + " Connector0/DIO3",
                {0, {"<DigitalLine name=\"DIO3\">", "<Line>3</Line>"}, {"DIO4"}},
                [&](std::ostream& out, std::ostream& err) {
                    return RunTree(options.modulePath, file("KestrelK40.xml"), "Connector0/DIO3",
                                   out, err);
                });
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
                                          file(each.offered), out, err);
                    });
    }
}

void PlayProject(Transcript& script, const HostOptions& options, const std::string& examples,
                 const WorkFolder& work) {
    const std::string project = work.File("demo.wbproj");
    const std::string description = (fs::path(examples) / "KestrelK40.xml").string();
    script.Step("Create a project with the K-40 as target \"K40\"",
                "project new " + project + " --target K40=" + description,
                {0, {"created", "target \"K40\""}, {}}, [&](std::ostream& out, std::ostream& err) {
                    return RunProjectNew(options, project, {"K40=" + description}, true, out, err);
                });
    const auto addItem = [&](const AddItemRequest& item, const Expect& expect) {
        std::string command = "project add-item " + project + " --target " + item.target +
                              " --resource " + item.resource;
        if (!item.name.empty())
            command += " --name " + item.name;
        script.Step("Add an item for " + item.resource, command, expect,
                    [&](std::ostream& out, std::ostream& err) {
                        return RunAddItem(options, project, item, out, err);
                    });
    };
    addItem({"K40", "Connector0/DIO3", "Valve"},
            {0, {"Tangent I/O item \"Valve\"", "resource=/Connector0/DIO3"}, {}});
    addItem({"K40", "AnalogInputs/AI2", "Sensors/Pressure"},
            {0,
             {"folder \"Sensors\"", "Tangent I/O item \"Pressure\"", "resource=/AnalogInputs/AI2"},
             {}});
    addItem({"K40", "Connector0/DIO9", ""}, {1, {"has no resource \"Connector0/DIO9\""}, {}});
    addItem({"K40", "Connector1/DIO0", "valve"}, {1, {"already has an item called"}, {}});
    script.Step(
        "Reopen the saved project and list its items", "project list " + project,
        {0,
         {"project \"demo\"", "Tangent I/O item \"Valve\"", "Tangent I/O item \"Pressure\""},
         {"DIO0"}},
        [&](std::ostream& out, std::ostream& err) {
            return RunProjectList(options, project, out, err);
        });
}

void PlayEdits(Transcript& script, const HostOptions& options, const WorkFolder& work) {
    const std::string project = work.File("demo.wbproj");
    const std::string expansion = work.File("expansion.xml");
    std::ofstream(expansion, std::ios::binary) << kExpansion;
    const auto edit = [&](const std::string& title, const std::string& action,
                          const std::vector<std::string>& arguments, const Expect& expect) {
        std::string command = "edit " + project + " K40 " + action;
        for (const std::string& argument : arguments)
            command += " " + argument;
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
    edit("Rename the line of \"Valve\"; the items follow or show their state", "rename",
         {"Connector0/DIO3", "ValveLine"}, {0, {"renamed", "Tangent I/O item \"Valve\""}, {}});
    edit("Remove the analog input of \"Pressure\"", "remove", {"AnalogInputs/AI2"},
         {0, {"removed", "Tangent I/O item \"Pressure\""}, {}});
    edit("Insert an expansion connector", "insert", {"/", expansion}, {0, {"inserted"}, {}});
    edit("A node that is not there", "remove", {"AnalogInputs/AI9"}, {1, {"has no node"}, {}});
    script.Step("Add an item for the inserted line",
                "project add-item " + project + " --target K40 --resource Connector2/DIO0",
                {0, {"Tangent I/O item \"DIO0\""}, {}}, [&](std::ostream& out, std::ostream& err) {
                    return RunAddItem(options, project, {"K40", "Connector2/DIO0", ""}, out, err);
                });
    script.Step("Reopen and list again: the changed tree came back with the project",
                "project list " + project,
                {0, {"Tangent I/O item \"Valve\"", "Tangent I/O item \"DIO0\"", ".K40.xml"}, {}},
                [&](std::ostream& out, std::ostream& err) {
                    return RunProjectList(options, project, out, err);
                });
    const std::string kept = EditedDescriptionPath(project, u"K40");
    script.Step(
        "The kept tree has the renamed, removed and inserted parts", "tree " + kept,
        {0,
         {"<DigitalLine name=\"ValveLine\">", "<Connector name=\"Connector2\">", "AI3"},
         {"name=\"AI2\""}},
        [&](std::ostream& out, std::ostream& err) {
            return RunTree(options.modulePath, kept, "", out, err);
        },
        4);
    script.Step("The line's old name is gone from it", "tree " + kept + " Connector0/DIO3",
                {1, {"no node"}, {}}, [&](std::ostream& out, std::ostream& err) {
                    return RunTree(options.modulePath, kept, "Connector0/DIO3", out, err);
                });
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
