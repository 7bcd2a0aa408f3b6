// wbhost: the embedded host on the command line.
#include "cli/Commands.h"

#include <CLI/CLI.hpp>
#include <iostream>
#include <string>

#ifndef WBT_MODULE_PATH
#define WBT_MODULE_PATH "wbtangio.qxx"
#endif

int main(int argc, char** argv) {
    CLI::App app{"wbhost: an embedded host that loads the Tangent I/O module and drives it"};
    app.require_subcommand(1);
    std::string modulePath = WBT_MODULE_PATH;
    app.add_option("--module", modulePath, "the module to load")->capture_default_str();

    std::string treeFile;
    std::string treePath;
    CLI::App* tree = app.add_subcommand(
        "tree", "load a target description and print the dump of one of its nodes");
    tree->add_option("FILE", treeFile, "a resource-tree document")->required();
    tree->add_option("PATH", treePath, "the node to dump (default: the root)");

    std::string required;
    std::string offered;
    CLI::App* compare = app.add_subcommand(
        "compare", "tell whether OFFERED satisfies REQUIRED: match (exit 0), not satisfied (1), "
                   "tolerated difference (2)");
    compare->add_option("REQUIRED", required, "the required description")->required();
    compare->add_option("OFFERED", offered, "the offered description")->required();

    CLI11_PARSE(app, argc, argv);
    try {
        if (*tree)
            return wbhost::cli::RunTree(modulePath, treeFile, treePath, std::cout, std::cerr);
        return wbhost::cli::RunCompare(modulePath, required, offered, std::cout, std::cerr);
    } catch (const std::exception& e) {
        std::cerr << "wbhost: " << e.what() << "\n";
    } catch (...) {
        std::cerr << "wbhost: unexpected failure\n";
    }
    return 3;
}
