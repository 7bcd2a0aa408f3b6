// What the command-line tests share: the options that load the build's module, and a scratch
// project with one target.
#pragma once

#include "ProjectTestSupport.h"
#include "cli/HostOptions.h"
#include "project/AtomicFile.h"

#include <gtest/gtest.h>
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
};

} // namespace clitest
