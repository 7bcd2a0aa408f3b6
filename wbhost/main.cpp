// wbhost: the embedded host on the command line.
#include "cli/Commands.h"
#include "cli/ControlEscaper.h"
#include "cli/Demo.h"
#include "cli/EditCommands.h"
#include "cli/ExitStatus.h"
#include "cli/ItemCommands.h"
#include "cli/ProgramCommand.h"
#include "cli/ProjectCommands.h"
#include "runtime/HostFolder.h"

#include <CLI/CLI.hpp>
#include <filesystem>
#include <functional>
#include <iostream>
#include <map>
#include <string>
#include <vector>

#ifndef WBT_MODULE_PATH
#define WBT_MODULE_PATH "wbtangio.qxx"
#endif

#ifndef WBT_VERSION
#define WBT_VERSION "0"
#endif

namespace {

using wbhost::cli::HostOptions;

constexpr const char* kModuleFileName = "wbtangio.qxx";

constexpr const char* kExitStatuses =
    "Exit status:\n"
    "  0   done; compare: match; tree --check: no problems\n"
    "  1   refused or failed; compare: not satisfied; tree --check: problems found\n"
    "  2   compare: tolerated difference; tree --check: a file cannot be read\n"
    "  3   compare could not run (a file, the module, a text the host cannot represent); an\n"
    "      unexpected failure of any command\n"
    "  64  the command line is wrong (unknown option, missing argument)";

// The module an installed host finds beside itself; else the one this build made.
std::string DefaultModulePath() {
    std::error_code failed;
    const auto executable = std::filesystem::read_symlink("/proc/self/exe", failed);
    if (!failed) {
        const auto beside = executable.parent_path() / kModuleFileName;
        if (std::filesystem::is_regular_file(beside, failed))
            return beside.string();
    }
    return WBT_MODULE_PATH;
}

// What the command line asked for; each subcommand's callback sets RUN to its work.
struct Request {
    HostOptions host{DefaultModulePath(), {}, {}, false};
    std::string hostFolder;
    bool version = false;
    std::function<int()> run;
};

void AddTreeAndCompare(CLI::App& app, Request& request) {
    auto* tree = app.add_subcommand(
        "tree", "load a target description, report its problems and print the dump of a node; "
                "with --check, report the problems of each FILE and print no dump");
    tree->footer("  tree FILE [PATH]             the dump of the node at PATH (default: the root)\n"
                 "  tree --check FILE...          FILE:LINE:COLUMN: error: MESSAGE lines, a "
                 "summary;\n"
                 "                               exit 0 clean, 1 problems, 2 a file not read");
    struct TreeRequest {
        std::vector<std::string> arguments;
        bool check = false;
        bool context = false;
    };
    auto treeRequest = std::make_shared<TreeRequest>();
    tree->add_option("FILE", treeRequest->arguments,
                     "a resource-tree document, then the path of the node to dump")
        ->required();
    tree->add_flag("--check", treeRequest->check, "only report the problems of every FILE");
    tree->add_flag("--context", treeRequest->context,
                   "with --check, show the input around each problem");
    tree->callback([&request, treeRequest] {
        const auto& arguments = treeRequest->arguments;
        if (treeRequest->check) {
            request.run = [treeRequest] {
                return wbhost::cli::RunTreeCheck(treeRequest->arguments, treeRequest->context,
                                                 std::cout, std::cerr);
            };
            return;
        }
        if (arguments.size() > 2 || treeRequest->context)
            throw CLI::ValidationError("tree", "without --check: tree FILE [PATH]");
        request.run = [&request, treeRequest] {
            const auto& arguments = treeRequest->arguments;
            return wbhost::cli::RunTree(request.host.modulePath, arguments[0],
                                        arguments.size() > 1 ? arguments[1] : std::string(),
                                        std::cout, std::cerr);
        };
    });

    auto* compare = app.add_subcommand(
        "compare", "tell whether OFFERED satisfies REQUIRED: match (exit 0), not satisfied (1), "
                   "tolerated difference (2)");
    compare->footer(
        "  compare REQUIRED OFFERED            the answer\n"
        "  compare --explain REQUIRED OFFERED  the answer, then what decided it, one line each\n"
        "                                      exit 0 match, 1 not satisfied, 2 tolerated "
        "difference,\n"
        "                                      3 could not run");
    struct CompareRequest {
        std::string required;
        std::string offered;
        bool explain = false;
    };
    auto files = std::make_shared<CompareRequest>();
    compare->add_option("REQUIRED", files->required, "the required description")->required();
    compare->add_option("OFFERED", files->offered, "the offered description")->required();
    compare->add_flag("--explain", files->explain,
                      "also print what decided the answer: for \"not satisfied\" the required "
                      "entry the offered description lacks or contradicts, with both texts; for "
                      "\"tolerated difference\" every entry that made it so");
    compare->callback([&request, files] {
        request.run = [&request, files] {
            return wbhost::cli::RunCompare(request.host.modulePath, files->required, files->offered,
                                           files->explain, std::cout, std::cerr);
        };
    });
}

void AddProject(CLI::App& app, Request& request) {
    auto* project = app.add_subcommand("project", "create a project, list its items, add items");
    project->require_subcommand(1);
    auto path = std::make_shared<std::string>();

    auto* create = project->add_subcommand(
        "new", "create the project file PROJECT with its targets and save it");
    auto targets = std::make_shared<std::vector<std::string>>();
    auto force = std::make_shared<bool>(false);
    create->add_option("PROJECT", *path, "the project file to create")->required();
    create->add_option("--target", *targets, "a target: its name and description file")
        ->type_name("NAME=DESCRIPTION.xml")
        ->allow_extra_args(false);
    create->add_flag("--force", *force, "replace PROJECT when it exists");
    create->callback([&request, path, targets, force] {
        request.run = [&request, path, targets, force] {
            return wbhost::cli::RunProjectNew(request.host, *path, *targets, *force, std::cout,
                                              std::cerr);
        };
    });

    auto* list = project->add_subcommand(
        "list", "print the project's items: type, name, identifier, attribute set, status");
    auto json = std::make_shared<bool>(false);
    list->add_option("PROJECT", *path, "the project file")->required();
    list->add_flag("--json", *json, "print the targets' Tangent I/O items and their state as JSON");
    list->callback([&request, path, json] {
        request.run = [&request, path, json] {
            return *json ? wbhost::cli::RunProjectJson(request.host, *path, std::cout, std::cerr)
                         : wbhost::cli::RunProjectList(request.host, *path, std::cout, std::cerr);
        };
    });

    auto* add = project->add_subcommand(
        "add-item", "add a Tangent I/O item for a resource of a target, through the module's "
                    "provider, and save");
    auto item = std::make_shared<wbhost::cli::AddItemRequest>();
    add->add_option("PROJECT", *path, "the project file")->required();
    add->add_option("--target", item->target, "the target's name")->required();
    add->add_option("--resource", item->resource, "the resource's path in the target's tree")
        ->required();
    add->add_option("--name", item->name,
                    "the item's name, after folders separated by / (\\/ keeps a / in a name; "
                    "default: the resource's)");
    add->add_option("--attribute", item->attributes, "a further attribute of the item")
        ->type_name("ATTRIBUTE=VALUE")
        ->allow_extra_args(false);
    add->callback([&request, path, item] {
        request.run = [&request, path, item] {
            return wbhost::cli::RunAddItem(request.host, *path, *item, std::cout, std::cerr);
        };
    });

    auto* bulk = project->add_subcommand(
        "add-items", "add many Tangent I/O items to a target in one bulk creation by the module "
                     "(TIO_CreateMultiple), and save");
    bulk->footer("FILE has one item a line: NAME<TAB>RESOURCE, optionally followed by "
                 "<TAB>ATTRIBUTE=VALUE pairs; a line starting with # is a comment. Every line is "
                 "checked before anything is created.");
    auto bulkRequest = std::make_shared<std::pair<std::string, std::string>>();
    bulk->add_option("PROJECT", *path, "the project file")->required();
    bulk->add_option("--target", bulkRequest->first, "the target's name")->required();
    bulk->add_option("FILE", bulkRequest->second, "the item list")->required();
    bulk->callback([&request, path, bulkRequest] {
        request.run = [&request, path, bulkRequest] {
            return wbhost::cli::RunAddItems(request.host, *path, bulkRequest->first,
                                            bulkRequest->second, std::cout, std::cerr);
        };
    });

    auto* remove = project->add_subcommand(
        "remove-item", "remove an item (a folder with what is below it) from a target, as the "
                       "project tree does, and save");
    auto removal = std::make_shared<std::pair<std::string, std::string>>();
    remove->add_option("PROJECT", *path, "the project file")->required();
    remove->add_option("--target", removal->first, "the target's name")->required();
    remove->add_option("ITEM", removal->second, "the item's path below the target (Folder/Name)")
        ->required();
    remove->callback([&request, path, removal] {
        request.run = [&request, path, removal] {
            return wbhost::cli::RunRemoveItem(request.host, *path, removal->first, removal->second,
                                              std::cout, std::cerr);
        };
    });
}

void AddEdit(CLI::App& app, Request& request) {
    auto* edit = app.add_subcommand(
        "edit", "change a target's resource tree (rename, remove, insert, set or remove an "
                "attribute, set a property), show what its items now say, and save");
    edit->footer("  edit PROJECT TARGET rename NODE NEWNAME\n"
                 "  edit PROJECT TARGET remove NODE\n"
                 "  edit PROJECT TARGET insert PARENT DOCUMENT.xml   (PARENT / is the root)\n"
                 "  edit PROJECT TARGET set-attribute NODE NAME VALUE\n"
                 "  edit PROJECT TARGET remove-attribute NODE NAME\n"
                 "  edit PROJECT TARGET set-property PATH VALUE   (through the module: the end "
                 "of PATH that names no node is the property of the deepest node it names)\n"
                 "NODE and PARENT are paths in the target's tree, such as Connector0/DIO3. The "
                 "changed tree is kept beside the project as PROJECT.TARGET.xml; the original "
                 "description is never rewritten.");
    auto path = std::make_shared<std::string>();
    auto edits = std::make_shared<wbhost::cli::EditRequest>();
    auto action = std::make_shared<std::string>();
    auto arguments = std::make_shared<std::vector<std::string>>();
    edit->add_option("PROJECT", *path, "the project file")->required();
    edit->add_option("TARGET", edits->target, "the target's name")->required();
    edit->add_option("ACTION", *action, "what to change")
        ->required()
        ->check(CLI::IsMember(
            {"rename", "remove", "insert", "set-attribute", "remove-attribute", "set-property"}));
    edit->add_option("ARGS", *arguments,
                     "the node, then the new name, the document file or the attribute");
    edit->callback([&request, path, edits, action, arguments] {
        std::string error;
        if (!wbhost::cli::ParseEdit(*action, *arguments, *edits, error))
            throw CLI::ValidationError("edit", error);
        request.run = [&request, path, edits] {
            return wbhost::cli::RunEdit(request.host, *path, *edits, std::cout, std::cerr);
        };
    });
}

void AddItem(CLI::App& app, Request& request) {
    auto* item = app.add_subcommand(
        "item", "act on one item of a target as the project tree does, and save when it "
                "changed");
    std::string footer = "  item PROJECT --target T ITEM ACTION ...   ITEM is its place below "
                         "the target (Folder/Name)\nActions:\n";
    for (const auto& [name, action] : wbhost::cli::ItemActions()) {
        std::string line = "  " + name;
        for (const auto& option : action.options)
            line += " [" + option.name + " " + option.valueName + "]";
        line += action.arguments.empty() ? "" : " " + action.arguments;
        footer +=
            line + std::string(line.size() < 40 ? 40 - line.size() : 1, ' ') + action.help + "\n";
    }
    item->footer(footer);
    auto path = std::make_shared<std::string>();
    auto itemRequest = std::make_shared<wbhost::cli::ItemRequest>();
    item->add_option("PROJECT", *path, "the project file")->required();
    item->add_option("--target", itemRequest->target, "the target's name")->required();
    item->add_option("ITEM", itemRequest->item, "the item's place below the target")->required();
    item->add_option("ACTION", itemRequest->action, "what to do")->required();
    item->add_option("ARGS", itemRequest->arguments, "the action's arguments");
    // Every action's options are known to the parser; the frame checks that they go with the
    // action given.
    auto given = std::make_shared<std::map<std::string, std::string>>();
    for (const auto& [name, action] : wbhost::cli::ItemActions()) {
        for (const auto& option : action.options) {
            if (item->get_option_no_throw(option.name) == nullptr)
                item->add_option(option.name, (*given)[option.name], option.help)
                    ->type_name(option.valueName);
        }
    }
    item->callback([&request, item, path, itemRequest, given] {
        for (const auto& [name, value] : *given) {
            if (item->count(name) > 0)
                itemRequest->options[name] = value;
        }
        std::string error;
        if (!wbhost::cli::CheckItemRequest(*itemRequest, error))
            throw CLI::ValidationError("item", error);
        request.run = [&request, path, itemRequest] {
            return wbhost::cli::RunItem(request.host, *path, *itemRequest, std::cout, std::cerr);
        };
    });
}

void AddProgram(CLI::App& app, Request& request) {
    auto* program = app.add_subcommand(
        "program", "run one host program as the module would, its dialogs answered from "
                   "--answer/--answers, and print its outputs");
    program->footer("A bare FILE name is looked up in the module's programs folder too, e.g.\n"
                    "  wbhost program TIOGenUniqueName.gx --input 0=text:DIO "
                    "--input \"1=list:DIO|DIO1\"");
    auto file = std::make_shared<std::string>();
    auto inputs = std::make_shared<std::vector<std::string>>();
    program->add_option("FILE", *file, "the program file (.gx)")->required();
    program
        ->add_option("--input", *inputs,
                     "an input: index=value, the value a number, "
                     "text:... or list:a|b")
        ->allow_extra_args(false);
    program->callback([&request, file, inputs] {
        request.run = [&request, file, inputs] {
            return wbhost::cli::RunProgram(request.host, *file, *inputs, std::cout, std::cerr);
        };
    });
}

void AddDemo(CLI::App& app, Request& request) {
    auto* demo = app.add_subcommand(
        "demo", "play a whole session on the examples and print its transcript; exit 0 only "
                "when every step gave what it should");
    auto settings = std::make_shared<wbhost::cli::DemoSettings>();
    demo->add_option("--examples", settings->examples, "the folder of the example descriptions")
        ->capture_default_str();
    demo->add_option("--workdir", settings->workFolder,
                     "keep the demo's project files in this folder (default: a temporary "
                     "folder, removed afterwards)");
    demo->callback([&request, settings] {
        request.run = [&request, settings] {
            return wbhost::cli::RunDemo(request.host, *settings, std::cout, std::cerr);
        };
    });
}

} // namespace

int main(int argc, char** argv) {
    const wbhost::cli::ControlEscaper escapeOut(std::cout);
    const wbhost::cli::ControlEscaper escapeErr(std::cerr);
    CLI::App app{"wbhost: an embedded host that loads the Tangent I/O module and drives it"};
    app.require_subcommand(0, 1);
    app.footer(kExitStatuses);
    // Options of the host may also follow the subcommand's own.
    app.fallthrough();
    Request request;
    app.add_option("--module", request.host.modulePath, "the module to load")
        ->capture_default_str();
    app.add_option("--answers", request.host.answerFiles,
                   "a file of answers for the dialog programs, one behaviour:index=value a line")
        ->allow_extra_args(false);
    app.add_option("--answer", request.host.answers,
                   "one answer for a dialog program: behaviour:index=value, the value a number, "
                   "text:... or list:a|b (overrides the files')")
        ->allow_extra_args(false);
    app.add_flag("--record", request.host.record, "print the programs' runs at the end");
    app.add_option("--host-dir", request.hostFolder,
                   "the host's folder: where included and deferred description files are "
                   "looked up, and the host folder the module is told (default: the folder of "
                   "the wbhost executable)")
        ->type_name("DIR")
        ->check(CLI::ExistingDirectory);
    app.add_flag("--version", request.version,
                 "print the host's version, the module file it loads and the module's GetInfo "
                 "answer");
    AddTreeAndCompare(app, request);
    AddProject(app, request);
    AddEdit(app, request);
    AddItem(app, request);
    AddProgram(app, request);
    AddDemo(app, request);

    try {
        app.parse(argc, argv);
    } catch (const CLI::ParseError& e) {
        // Help asked for is a success; anything else CLI11 refuses is a usage error.
        return app.exit(e) == 0 ? wbhost::cli::kExitOk : wbhost::cli::kExitUsage;
    }
    if (!request.hostFolder.empty())
        wbhost::runtime::SetHostFolder(request.hostFolder);
    try {
        if (request.version)
            return wbhost::cli::RunVersion(WBT_VERSION, request.host.modulePath, std::cout,
                                           std::cerr);
        if (!request.run) {
            std::cerr << "wbhost: a command is required\nRun with --help for more information.\n";
            return wbhost::cli::kExitUsage;
        }
        return request.run();
    } catch (const std::exception& e) {
        std::cerr << "wbhost: " << e.what() << "\n";
    } catch (...) {
        std::cerr << "wbhost: unexpected failure\n";
    }
    return wbhost::cli::kExitCannotRun;
}
