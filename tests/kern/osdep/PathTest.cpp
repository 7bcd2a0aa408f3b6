// Module and executable paths from the dynamic linker, and the file search.
#include "kern/osdep/Path.h"

#include "kern/osdep/OSException.h"
#include "support/ScratchFolder.h"

#include <dlfcn.h>
#include <filesystem>
#include <fstream>
#include <gtest/gtest.h>
#include <unicode/ucol.h>

namespace fs = std::filesystem;
using qv::kern::osdep::FindFiles;
using qv::kern::osdep::GetExePath;
using qv::kern::osdep::GetModuleDirectory;
using qv::kern::osdep::GetModuleDirectoryOf;
using qv::kern::osdep::WinError;

TEST(OsPath, DirectoryOfTheExecutableAndOfASharedLibrary) {
    const std::string exe = GetExePath();
    EXPECT_EQ(fs::path(exe).filename(), "kern_tests");
    EXPECT_TRUE(fs::path(exe).is_absolute());
    const std::string dir = fs::path(exe).parent_path().string() + "/";
    EXPECT_EQ(GetModuleDirectory(nullptr), dir);
    EXPECT_EQ(GetModuleDirectory(dlopen(nullptr, RTLD_NOW)), dir);
    EXPECT_EQ(GetModuleDirectoryOf(reinterpret_cast<const void*>(&GetExePath)), dir);
    Dl_info info{};
    ASSERT_NE(dladdr(reinterpret_cast<const void*>(&ucol_open), &info), 0);
    const std::string expected =
        fs::absolute(info.dli_fname).lexically_normal().parent_path().string() + "/";
    EXPECT_EQ(GetModuleDirectoryOf(reinterpret_cast<const void*>(&ucol_open)), expected);
    EXPECT_THROW(GetModuleDirectoryOf(nullptr), WinError);
}

TEST(OsPath, ClosedModuleHasNoDirectory) {
    void* handle = dlopen("libexpat.so.1", RTLD_NOW | RTLD_LOCAL);
    if (handle == nullptr)
        GTEST_SKIP() << "no libexpat.so.1 to load";
    EXPECT_EQ(GetModuleDirectory(handle).back(), '/');
    const bool unloaded = dlclose(handle) == 0 && dlopen("libexpat.so.1", RTLD_NOLOAD) == nullptr;
    if (!unloaded)
        GTEST_SKIP() << "libexpat.so.1 stays loaded in this process";
    try {
        GetModuleDirectory(handle);
        FAIL() << "a closed handle must raise";
    } catch (const WinError& e) {
        EXPECT_EQ(e.GetOSErrorCode(), 126u);
    }
}

class FindFilesTest : public ::testing::Test {
protected:
    void SetUp() override {
        fs::create_directories(dir_ / "sub.gx");
        for (const char* name : {"a.gx", "b.GX", "c.txt", "[x].gx", ".hidden.gx", "noext"})
            std::ofstream(dir_ / name) << "x";
    }
    std::string In(const char* pattern) const { return (dir_ / pattern).string(); }
    std::string Dir() const { return dir_.string() + "/"; }

    const test::ScratchFolder scratch_;
    const fs::path dir_ = scratch_.Path();
};

TEST_F(FindFilesTest, WildcardsMatchTheLastComponentAndNothingFoundIsAnEmptyList) {
    EXPECT_EQ(FindFiles(In("*.gx")),
              (std::vector<std::string>{Dir() + ".hidden.gx", Dir() + "[x].gx", Dir() + "a.gx",
                                        Dir() + "sub.gx"}));
    EXPECT_EQ(FindFiles(In("?.gx")), (std::vector<std::string>{Dir() + "a.gx"}));
    EXPECT_EQ(FindFiles(In("[x].gx")), (std::vector<std::string>{Dir() + "[x].gx"}));
    EXPECT_EQ(FindFiles(In("*.*")).size(), 7u);
    EXPECT_EQ(FindFiles(In("noext")), (std::vector<std::string>{Dir() + "noext"}));
    EXPECT_TRUE(FindFiles(In("*.none")).empty());
    EXPECT_TRUE(FindFiles(In("missing/*.gx")).empty());
    EXPECT_TRUE(FindFiles(In("a.gx/*")).empty());
    EXPECT_TRUE(FindFiles("").empty());
    EXPECT_TRUE(FindFiles(Dir()).empty());
}
