// What the command-line tests share: the options that load the build's module, and a scratch
// project with one target.
#pragma once

#include "ProjectTestSupport.h"
#include "cli/EditCommands.h"
#include "cli/HostOptions.h"
#include "cli/ProjectCommands.h"
#include "project/AtomicFile.h"

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>
#include <sstream>
#include <string>

namespace clitest {

inline wbhost::cli::HostOptions Options() {
    return {WBT_MODULE_PATH, {}, {}, false};
}

// The whole file PATH; empty when it cannot be read.
inline std::string Slurp(const std::string& path) {
    std::string content;
    wbhost::project::ReadWholeFile(path, content, nullptr);
    return content;
}

// A scratch folder with the description "t.xml" (lines DIO0 and AI0) and, once Create ran, the
// project "p.wbproj" whose target "T" uses it.
struct ScratchProject {
    projecttest::ScratchFolder scratch;
    std::string description = scratch.Write("t.xml", projecttest::kDescription);
    std::string path = scratch.File("p.wbproj");
    std::ostringstream out;
    std::ostringstream err;

    // Runs the command WORK(out, err) after clearing both streams; answers its exit code.
    template <class Work> int Run(Work&& work) {
        out.str("");
        err.str("");
        return work(out, err);
    }
    // The project commands on this project, as `wbhost project ...` runs them.
    int New(const std::vector<std::string>& targets, bool replace = false,
            const wbhost::cli::HostOptions& options = Options()) {
        return Run([&](std::ostream& o, std::ostream& e) {
            return wbhost::cli::RunProjectNew(options, path, targets, replace, o, e);
        });
    }
    int Add(const wbhost::cli::AddItemRequest& request,
            const wbhost::cli::HostOptions& options = Options()) {
        return Run([&](std::ostream& o, std::ostream& e) {
            return wbhost::cli::RunAddItem(options, path, request, o, e);
        });
    }
    int List() {
        return Run([&](std::ostream& o, std::ostream& e) {
            return wbhost::cli::RunProjectList(Options(), path, o, e);
        });
    }
    // `wbhost edit` on target T: ACTION with ARGUMENTS; -1 when they do not parse.
    int Edit(const std::string& action, const std::vector<std::string>& arguments) {
        wbhost::cli::EditRequest request{"T", wbhost::cli::EditKind::Rename, "", "", ""};
        std::string error;
        if (!wbhost::cli::ParseEdit(action, arguments, request, error)) {
            err << error;
            return -1;
        }
        return Run([&](std::ostream& o, std::ostream& e) {
            return wbhost::cli::RunEdit(Options(), path, request, o, e);
        });
    }
    // The JSON listing of the reopened project; an empty object when it cannot be made.
    nlohmann::json Json() {
        const int exit = Run([&](std::ostream& o, std::ostream& e) {
            return wbhost::cli::RunProjectJson(Options(), path, o, e);
        });
        EXPECT_EQ(exit, wbhost::cli::kProjectOk) << err.str();
        return exit == wbhost::cli::kProjectOk ? nlohmann::json::parse(out.str())
                                               : nlohmann::json::object();
    }
};

} // namespace clitest
