// The runtime's path functions as modules call them: objects they create, split, test, turn
// into host strings and hand back, and the file operations behind them.
#include "runtime/HandleTable.h"
#include "runtime/HostStrings.h"
#include "runtime/PathTable.h"
#include "runtime/Runtime.h"
#include "support/ScratchFolder.h"

#include <cstring>
#include <dlfcn.h>
#include <filesystem>
#include <fstream>
#include <gtest/gtest.h>

namespace {

namespace fs = std::filesystem;
using wbhost::runtime::PathTable;

// A path made from TEXT and destroyed with the holder.
struct HeldPath {
    explicit HeldPath(const std::string& text) {
        EXPECT_EQ(FFileSystemCStrToPath(text.c_str(), &path), kWBNoErr);
    }
    ~HeldPath() { EXPECT_EQ(FDestroyPath(&path), kWBNoErr); }
    WBPath path = nullptr;
};

std::string Text(WBPath path) {
    WBHandle text = nullptr;
    EXPECT_EQ(FPathToDSString(path, &text), kWBNoErr);
    std::string result = wbhost::runtime::ReadHostString(text).value_or("<bad>");
    DSDisposeHandle(text);
    return result;
}

class RuntimePath : public ::testing::Test {
protected:
    void SetUp() override { live = PathTable::Instance().LiveCount(); }
    void TearDown() override {
        EXPECT_EQ(PathTable::Instance().LiveCount(), live) << "a path was not released";
    }
    const test::ScratchFolder scratch;
    const fs::path dir = scratch.Path();
    size_t live = 0;
};

TEST_F(RuntimePath, TextsAreNormalisedAndSplitBadStaleAndForeignPathsGetHostErrors) {
    WBPath path = nullptr;
    ASSERT_EQ(FTextToPath("/a//b/c.gx/", 11, &path), kWBNoErr);
    EXPECT_EQ(Text(path), "/a/b/c.gx");
    const char* name = nullptr;
    ASSERT_EQ(FNamePtr(path, &name), kWBNoErr);
    EXPECT_STREQ(name, "c.gx");

    // The directory goes into a live slot in place, and up to the root, which has none above.
    WBPath up = FEmptyPath(nullptr);
    ASSERT_NE(up, nullptr);
    const WBPath slot = up;
    ASSERT_EQ(FDirName(path, &up), kWBNoErr);
    EXPECT_EQ(up, slot);
    EXPECT_EQ(Text(up), "/a/b");
    ASSERT_EQ(FDirName(up, &up), kWBNoErr);
    ASSERT_EQ(FDirName(up, &up), kWBNoErr);
    EXPECT_EQ(Text(up), "/");
    EXPECT_EQ(FNamePtr(up, &name), kWBNoErr);
    EXPECT_STREQ(name, "");
    EXPECT_EQ(FDirName(up, &up), kWBArgErr);
    EXPECT_TRUE(FIsAPathOfType(up, kWBAbsolutePath));

    // A relative one-part path has the empty path above it.
    ASSERT_EQ(FTextToPath("file", 4, &path), kWBNoErr);
    EXPECT_TRUE(FIsAPathOfType(path, kWBRelativePath));
    ASSERT_EQ(FDirName(path, &up), kWBNoErr);
    EXPECT_TRUE(FIsAPathOfType(up, kWBEmptyPath));
    EXPECT_EQ(FDirName(up, &up), kWBArgErr);

    WBPath copy = nullptr;
    ASSERT_EQ(FPathToPath(path, &copy), kWBNoErr);
    EXPECT_NE(copy, path);
    EXPECT_EQ(Text(copy), "file");
    EXPECT_EQ(FEmptyPath(copy), copy);
    EXPECT_EQ(Text(copy), "");
    for (WBPath* held : {&path, &up, &copy}) {
        EXPECT_EQ(FDestroyPath(held), kWBNoErr);
        EXPECT_EQ(*held, nullptr);
    }
    // Bad texts, stale and foreign paths get host errors.
    path = nullptr;
    EXPECT_EQ(FTextToPath("abc", -1, &path), kWBArgErr);
    EXPECT_EQ(FTextToPath("a\0b", 3, &path), kWBArgErr);
    EXPECT_EQ(path, nullptr);

    // A stale path, and a slot holding something that is not a path, are never followed.
    WBPath stale = FEmptyPath(nullptr);
    WBPath kept = stale;
    ASSERT_EQ(FDestroyPath(&stale), kWBNoErr);
    EXPECT_EQ(FDestroyPath(&kept), kWBArgErr);
    int notAPath = 0;
    WBPath foreign = reinterpret_cast<WBPath>(&notAPath);
    EXPECT_EQ(FTextToPath("x", 1, &foreign), kWBArgErr);
    EXPECT_EQ(notAPath, 0);
    name = nullptr;
    EXPECT_EQ(FNamePtr(kept, &name), kWBArgErr);
    EXPECT_EQ(FDirName(kept, &path), kWBArgErr);
    EXPECT_EQ(FPathToPath(kept, &path), kWBArgErr);
    EXPECT_EQ(FExists(kept), kWBPathAbsent);
    EXPECT_EQ(FIsAPathOfType(kept, kWBEmptyPath), 0);
    EXPECT_EQ(FEmptyPath(kept), nullptr);
    WBHandle text = nullptr;
    EXPECT_EQ(FPathToDSString(kept, &text), kWBArgErr);
    EXPECT_EQ(text, nullptr);
    EXPECT_EQ(FRemove(kept), kWBArgErr);
    EXPECT_EQ(FGetSpecialDir(3, &path), kWBArgErr);
}

TEST_F(RuntimePath, HostFolderIsTheExecutablesAndCopyMoveRemoveRefuseToOverwriteOrMiss) {
    WBPath folder = nullptr;
    ASSERT_EQ(FGetSpecialDir(kWBHostFolder, &folder), kWBNoErr);
    EXPECT_EQ(fs::path(Text(folder)), fs::canonical("/proc/self/exe").parent_path());
    EXPECT_EQ(FExists(folder), kWBPathIsDirectory);
    // The host string in a slot that already holds one is resized in place.
    WBHandle text = nullptr;
    ASSERT_EQ(FPathToFileSystemDSString(folder, &text), kWBNoErr);
    WBHandle same = text;
    ASSERT_EQ(FPathToDSString(folder, &same), kWBNoErr);
    EXPECT_EQ(same, text);
    DSDisposeHandle(text);
    FDestroyPath(&folder);

    // Modules find the path functions in the executable.
    void* self = dlopen(nullptr, RTLD_NOW);
    for (const char* name : {"FGetSpecialDir", "FTextToPath", "FRemove", "WbVariantDestroy",
                             "ControlOnlineHelp", "TargetItemFromAppRef"}) {
        EXPECT_NE(dlsym(self, name), nullptr) << name;
    }
    dlclose(self);
    // Copy, move and remove refuse to overwrite or miss files.
    fs::create_directories(dir / "sub");
    std::ofstream(dir / "a.txt") << "alpha";
    const HeldPath a((dir / "a.txt").string());
    const HeldPath b((dir / "b.txt").string());
    const HeldPath c((dir / "sub" / "c.txt").string());
    const HeldPath sub((dir / "sub").string());
    const HeldPath missing((dir / "none.txt").string());

    EXPECT_EQ(FExists(a.path), kWBPathIsFile);
    EXPECT_EQ(FExists(missing.path), kWBPathAbsent);
    ASSERT_EQ(FCopy(a.path, b.path), kWBNoErr);
    EXPECT_EQ(FCopy(a.path, b.path), kWBFileExists);
    EXPECT_EQ(FCopy(missing.path, c.path), kWBFileNotFound);
    ASSERT_EQ(FMove(b.path, c.path), kWBNoErr);
    EXPECT_EQ(FExists(b.path), kWBPathAbsent);
    std::ifstream moved(dir / "sub" / "c.txt");
    std::string content;
    moved >> content;
    EXPECT_EQ(content, "alpha");
    EXPECT_EQ(FMove(a.path, c.path), kWBFileExists);
    EXPECT_EQ(FExists(a.path), kWBPathIsFile);

    // A folder with something in it is not removed, and nothing inside it is lost.
    EXPECT_EQ(FRemove(sub.path), kWBFileExists);
    EXPECT_EQ(FExists(c.path), kWBPathIsFile);
    EXPECT_EQ(FRemove(c.path), kWBNoErr);
    EXPECT_EQ(FRemove(c.path), kWBFileNotFound);
    EXPECT_EQ(FRemove(sub.path), kWBNoErr);
}

} // namespace
