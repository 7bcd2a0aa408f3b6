// The run-time engine search over a directory tree of our own: which candidate wins, and which
// are skipped.
#include "host/binding/EngineSearch.h"

#include "support/ScratchFolder.h"

#include <filesystem>
#include <fstream>
#include <gtest/gtest.h>
#include <map>

namespace fs = std::filesystem;
namespace rt = qv::host::rt;

namespace {

class EngineSearchTest : public ::testing::Test {
protected:
    void SetUp() override {
        fs::create_directories(root_ / "bin");
        env_.executablePath = (root_ / "bin" / "host.exe").string();
        env_.variable = [this](const std::string& name) -> std::optional<std::string> {
            const auto it = variables_.find(name);
            return it == variables_.end() ? std::nullopt : std::optional(it->second);
        };
    }
    std::string Path(const std::string& relative) const { return (root_ / relative).string(); }
    // Puts a library file at `relative`/libwbrt.so and answers its path.
    std::string PlaceLibrary(const std::string& relative) const {
        fs::create_directories(root_ / relative);
        const fs::path file = root_ / relative / rt::kRunTimeEngineLibrary;
        std::ofstream(file) << "not really a library";
        return file.string();
    }
    void Write(const std::string& relative, const std::string& text) const {
        std::ofstream(root_ / relative) << text;
    }
    rt::EngineSearchResult Find(const std::string& version = "16.0") const {
        return rt::FindRunTimeEngine(rt::kRunTimeEngineLibrary,
                                     rt::EngineSearchRecord::ForKind(0, version), env_);
    }

    const test::ScratchFolder scratch_;
    const fs::path root_ = scratch_.Path();
    rt::EngineSearchEnvironment env_;
    std::map<std::string, std::string> variables_;
};

TEST_F(EngineSearchTest, ProfileDirectoryWithoutTheLibraryIsSkippedForTheExecutables) {
    fs::create_directories(root_ / "empty");
    Write("bin/host.ini", "[WBRT]\nDLLPath = " + Path("empty") + "\n");
    const std::string beside = PlaceLibrary("bin");
    EXPECT_EQ(Find().path, beside);
    EXPECT_TRUE(Find().found);

    const std::string profiled = PlaceLibrary("profiled");
    Write("bin/host.ini", "[wbrt]\ndllpath=" + Path("profiled") + "\n");
    EXPECT_EQ(Find().path, profiled)
        << "a profile naming the library beats the executable's folder";
}

TEST_F(EngineSearchTest, InstalledVersionsInTheirOrder) {
    variables_["ProgramFiles"] = Path("pf");
    variables_["ENGINES"] = Path("registered");
    const std::string fromProgramFilesDir =
        PlaceLibrary("pfdir/Quorvane/Shared/Wirebench Run-Time/16.0");
    Write("registry.ini",
          "[HKEY_LOCAL_MACHINE\\Software\\Microsoft\\Windows\\CurrentVersion]\n"
          "ProgramFilesDir=" +
              Path("pfdir") +
              "\n[HKEY_LOCAL_MACHINE\\SOFTWARE\\Quorvane\\Wirebench Run-Time\\16.0]\n"
              "Path=REG_EXPAND_SZ:%ENGINES%/16.0\n");
    env_.registryFile = Path("registry.ini");
    EXPECT_EQ(Find().path, fromProgramFilesDir);

    const std::string expanded = PlaceLibrary("pf/Quorvane/Shared/Wirebench Run-Time/16.0");
    EXPECT_EQ(Find().path, expanded) << "%ProgramFiles% comes before ProgramFilesDir";

    const std::string registered = PlaceLibrary("registered/16.0");
    EXPECT_EQ(Find().path, registered) << "the registry's Path comes before both";

    EXPECT_FALSE(Find("17.0").found);
    EXPECT_EQ(Find("17.0").path, rt::kRunTimeEngineLibrary)
        << "a failed search gives the bare name";
}

TEST_F(EngineSearchTest,
       OddRootsAndDirectoriesNamedLikeTheLibraryAreSkippedVersionlessSearchesStayNear) {
    fs::create_directories(root_ / "bin" / rt::kRunTimeEngineLibrary);
    EXPECT_FALSE(Find().found);

    // With ProgramFiles unset the root stays "%ProgramFiles%/...", which would name a folder
    // relative to the working directory; it must not be tried.
    PlaceLibrary("%ProgramFiles%/Quorvane/Shared/Wirebench Run-Time/16.0");
    const fs::path previous = fs::current_path();
    fs::current_path(root_);
    const bool foundUnexpanded = Find().found;
    fs::current_path(previous);
    EXPECT_FALSE(foundUnexpanded);

    const std::string longRoot = std::string(200, 'a') + "/" + std::string(100, 'b');
    PlaceLibrary(longRoot + "/Quorvane/Shared/Wirebench Run-Time/16.0");
    variables_["ProgramFiles"] = Path(longRoot);
    EXPECT_FALSE(Find().found) << "expanded roots longer than 259 characters are not tried";
    // Without a version only the profile and the executable's folder are searched.
    variables_["ProgramFiles"] = Path("pf");
    PlaceLibrary("pf/Quorvane/Shared/Wirebench Run-Time");
    EXPECT_FALSE(Find("").found);
}

TEST_F(EngineSearchTest, DirectoryWalkFromTheExecutableUpwardsComesFirst) {
    PlaceLibrary("bin");
    fs::create_directories(root_ / "bin/engines"); // a walk folder without the library
    const std::string walked = PlaceLibrary("engines");
    auto record = rt::EngineSearchRecord::ForKind(0, "16.0");
    record.directoryWalkName = "engines";
    const auto result = rt::FindRunTimeEngine(rt::kRunTimeEngineLibrary, record, env_);
    EXPECT_EQ(result.path, walked);
}

TEST(EngineSearchEnvironment, ProfileFileAndExpansion) {
    rt::EngineSearchEnvironment env;
    env.executablePath = "/opt/app/host.exe";
    EXPECT_EQ(env.ProfileFile(), "/opt/app/host.ini");
    env.executablePath = "/opt/app/host";
    EXPECT_EQ(env.ProfileFile(), "/opt/app/host.ini");
    env.executablePath.clear();
    EXPECT_EQ(env.ProfileFile(), "");

    env.variable = [](const std::string& name) -> std::optional<std::string> {
        return name == "A" ? std::optional<std::string>("alpha") : std::nullopt;
    };
    EXPECT_EQ(env.Expand("%A%/x"), "alpha/x");
    EXPECT_EQ(env.Expand("%B%%A%"), "%B%alpha") << "an unset name stays, the next one expands";
    EXPECT_EQ(env.Expand("100%"), "100%");
    EXPECT_EQ(env.Expand("%%"), "%%");
}

} // namespace
