// wbhost: the embedded host on the command line.
#include "cli/Commands.h"
#include "cli/Demo.h"
#include "cli/EditCommands.h"
#include "cli/ProgramCommand.h"
#include "cli/ProjectCommands.h"

#include <CLI/CLI.hpp>
#include <functional>
#include <iostream>
#include <string>
#include <vector>

#ifndef WBT_MODULE_PATH
#define WBT_MODULE_PATH "wbtangio.qxx"
#endif

namespace {

using wbhost::cli::HostOptions;

// What the command line asked for; each subcommand's callback sets RUN to its work.
struct Request {
    HostOptions host{WBT_MODULE_PATH, {}, {}, false};
    std::function<int()> run;
};

void AddTreeAndCompare(CLI::App& app, Request& request) {
    auto* tree = app.add_subcommand(
        "tree", "load a target description, report its problems and print the dump of a node");
    auto treeFile = std::make_shared<std::string>();
    auto treePath = std::make_shared<std::string>();
    tree->add_option("FILE", *treeFile, "a resource-tree document")->required();
    tree->add_option("PATH", *treePath, "the node to dump (default: the root)");
    tree->callback([&request, treeFile, treePath] {
        request.run = [&request, treeFile, treePath] {
            return wbhost::cli::RunTree(request.host.modulePath, *treeFile, *treePath, std::cout,
                                        std::cerr);
        };
    });

    auto* compare = app.add_subcommand(
        "compare", "tell whether OFFERED satisfies REQUIRED: match (exit 0), not satisfied (1), "
                   "tolerated difference (2)");
    auto files = std::make_shared<std::pair<std::string, std::string>>();
    compare->add_option("REQUIRED", files->first, "the required description")->required();
    compare->add_option("OFFERED", files->second, "the offered description")->required();
    compare->callback([&request, files] {
        request.run = [&request, files] {
            return wbhost::cli::RunCompare(request.host.modulePath, files->first, files->second,
                                           std::cout, std::cerr);
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
                    "the item's name, after folders separated by / (default: the resource's)");
    add->callback([&request, path, item] {
        request.run = [&request, path, item] {
            return wbhost::cli::RunAddItem(request.host, *path, *item, std::cout, std::cerr);
        };
    });
}

void AddEdit(CLI::App& app, Request& request) {
    auto* edit = app.add_subcommand(
        "edit", "change a target's resource tree (rename, remove, insert, set or remove an "
                "attribute), show what its items now say, and save");
    edit->footer("  edit PROJECT TARGET rename NODE NEWNAME\n"
                 "  edit PROJECT TARGET remove NODE\n"
                 "  edit PROJECT TARGET insert PARENT DOCUMENT.xml   (PARENT / is the root)\n"
                 "  edit PROJECT TARGET set-attribute NODE NAME VALUE\n"
                 "  edit PROJECT TARGET remove-attribute NODE NAME\n"
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
        ->check(CLI::IsMember({"rename", "remove", "insert", "set-attribute", "remove-attribute"}));
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
    CLI::App app{"wbhost: an embedded host that loads the Tangent I/O module and drives it"};
    app.require_subcommand(1);
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
    AddTreeAndCompare(app, request);
    AddProject(app, request);
    AddEdit(app, request);
    AddProgram(app, request);
    AddDemo(app, request);

    CLI11_PARSE(app, argc, argv);
    try {
        return request.run ? request.run() : 1;
    } catch (const std::exception& e) {
        std::cerr << "wbhost: " << e.what() << "\n";
    } catch (...) {
        std::cerr << "wbhost: unexpected failure\n";
    }
    return 3;
}
