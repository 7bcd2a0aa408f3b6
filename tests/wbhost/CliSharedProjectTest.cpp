// Real wbhost processes changing one project at once: every change reported as done is in the
// file afterwards; one refused says why and changes nothing.
#include "CliTestSupport.h"

#include <fcntl.h>
#include <filesystem>
#include <spawn.h>
#include <sys/file.h>
#include <sys/wait.h>
#include <unistd.h>
#include <vector>

using clitest::ScratchProject;
using clitest::Slurp;

namespace {

#ifdef WBHOST_PATH

// Starts wbhost with ARGS, its stderr going to the file ERRFILE; answers its process id.
pid_t Start(const std::vector<std::string>& args, const std::string& errFile) {
    std::vector<std::string> all{WBHOST_PATH};
    all.insert(all.end(), args.begin(), args.end());
    std::vector<char*> argv;
    for (std::string& arg : all)
        argv.push_back(arg.data());
    argv.push_back(nullptr);
    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    posix_spawn_file_actions_addopen(&actions, 1, "/dev/null", O_WRONLY, 0);
    posix_spawn_file_actions_addopen(&actions, 2, errFile.c_str(), O_WRONLY | O_CREAT | O_TRUNC,
                                     0600);
    pid_t pid = -1;
    EXPECT_EQ(posix_spawn(&pid, WBHOST_PATH, &actions, nullptr, argv.data(), environ), 0);
    posix_spawn_file_actions_destroy(&actions);
    return pid;
}

int ExitCode(pid_t pid) {
    int status = 0;
    EXPECT_EQ(waitpid(pid, &status, 0), pid);
    return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
}

std::vector<std::string> AddItem(const ScratchProject& p, const std::string& name) {
    return {"project", "add-item", p.path, "--target", "T", "--resource", "DIO0", "--name", name};
}

void CreateProject(ScratchProject& p) {
    ASSERT_EQ(p.New({"T=" + p.description}), wbhost::cli::kProjectOk) << p.err.str();
}

TEST(CliSharedProject, EveryAddReportedAsDoneIsInTheFile) {
    ScratchProject p;
    CreateProject(p);
    constexpr int kProcesses = 6;
    std::vector<pid_t> started;
    for (int i = 0; i < kProcesses; ++i) {
        started.push_back(Start(AddItem(p, "Item" + std::to_string(i)),
                                p.scratch.File("err" + std::to_string(i))));
    }
    int done = 0;
    for (int i = 0; i < kProcesses; ++i) {
        const int code = ExitCode(started[i]);
        const std::string saved = Slurp(p.path);
        const std::string item = "Item" + std::to_string(i);
        const std::string err = Slurp(p.scratch.File("err" + std::to_string(i)));
        if (code == 0) {
            ++done;
            EXPECT_NE(saved.find(item), std::string::npos) << item << " reported done, lost";
        } else {
            EXPECT_EQ(code, 1) << err;
            EXPECT_NE(err.find("being changed by another process"), std::string::npos) << err;
        }
    }
    EXPECT_GE(done, 1);
    // Every save wrote and renamed its own temporary file: none is left.
    for (const auto& entry : std::filesystem::directory_iterator(p.scratch.Path()))
        EXPECT_EQ(entry.path().string().find(".tmp"), std::string::npos) << entry.path();
}

TEST(CliSharedProject, AProcessThatCannotTakeTheProjectChangesNothing) {
    ScratchProject p;
    CreateProject(p);
    const std::string before = Slurp(p.path);
    // Another process is in the middle of its change for longer than a wbhost waits.
    const int held = ::open(p.path.c_str(), O_RDONLY | O_CLOEXEC);
    ASSERT_EQ(::flock(held, LOCK_EX), 0);
    const int code = ExitCode(Start(AddItem(p, "Late"), p.scratch.File("err")));
    const std::string err = Slurp(p.scratch.File("err"));
    EXPECT_EQ(code, 1) << err;
    EXPECT_NE(err.find("is being changed by another process; nothing was changed"),
              std::string::npos)
        << err;
    EXPECT_EQ(Slurp(p.path), before);
    ::close(held);
    // Once it is done, the same change goes through.
    EXPECT_EQ(ExitCode(Start(AddItem(p, "Late"), p.scratch.File("err"))), 0)
        << Slurp(p.scratch.File("err"));
    EXPECT_NE(Slurp(p.path).find("Late"), std::string::npos);
}

#endif

} // namespace
