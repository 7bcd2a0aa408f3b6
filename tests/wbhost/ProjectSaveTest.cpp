// Saving a project replaces its file atomically: an interrupted save keeps the old file.
#include "ProjectTestSupport.h"
#include "project/AtomicFile.h"
#include "project/Project.h"

#include <algorithm>
#include <gtest/gtest.h>
#include <sys/stat.h>

using namespace projecttest;
using wbhost::project::Project;

namespace {

std::vector<std::string> FilesIn(const std::string& folder) {
    std::vector<std::string> names;
    for (const auto& entry : std::filesystem::directory_iterator(folder))
        names.push_back(entry.path().filename().string());
    std::sort(names.begin(), names.end());
    return names;
}

void SetMark(Project& project, const char16_t* value) {
    IwbProjectPropertyBag* bag = nullptr;
    project.Root().GetPropertyBag(&bag);
    bag->SetString(u"mark", value, 0);
    bag->Release();
}

std::u16string MarkOf(const std::string& path, wbhost::resources::ResourceService& service) {
    std::string error;
    auto project = Project::Open(path, service, &error);
    EXPECT_TRUE(project) << error;
    if (!project)
        return {};
    IwbProjectPropertyBag* bag = nullptr;
    project->Root().GetPropertyBag(&bag);
    BSTR text = nullptr;
    bag->GetString(u"mark", &text);
    std::u16string mark = qv::com::BstrToString(text);
    SysFreeString(text);
    bag->Release();
    return mark;
}

TEST(ProjectSave, AnInterruptedSaveLeavesThePreviousFileIntact) {
    ScratchFolder scratch;
    wbhost::resources::ResourceService service;
    Project project(service);
    const std::string path = scratch.File("p.wbproj");
    std::string error;
    SetMark(project, u"first");
    ASSERT_TRUE(project.Save(path, &error)) << error;
    std::string previous;
    ASSERT_TRUE(wbhost::project::ReadWholeFile(path, previous, nullptr));

    // The process dies after the new text is on disk, before it replaces the old file.
    SetMark(project, std::u16string(200000, u'n').c_str());
    bool stopped = false;
    EXPECT_FALSE(project.Save(path, &error, [&] {
        stopped = true;
        return false;
    }));
    EXPECT_TRUE(stopped);
    EXPECT_NE(error.find("p.wbproj"), std::string::npos);
    std::string now;
    ASSERT_TRUE(wbhost::project::ReadWholeFile(path, now, nullptr));
    EXPECT_EQ(now, previous);
    EXPECT_EQ(MarkOf(path, service), u"first");
    // The abandoned temporary file sits beside it, complete; it never shadows the project.
    EXPECT_EQ(FilesIn(scratch.Path()).size(), 2u);

    SetMark(project, u"second");
    ASSERT_TRUE(project.Save(path, &error)) << error;
    EXPECT_EQ(MarkOf(path, service), u"second");
    // The next save wrote through the abandoned file and renamed it: nothing is left over.
    EXPECT_EQ(FilesIn(scratch.Path()), std::vector<std::string>{"p.wbproj"});
}

TEST(ProjectSave, FailuresAreReportedAndKeepTheFileMode) {
    ScratchFolder scratch;
    wbhost::resources::ResourceService service;
    Project project(service);
    std::string error;
    EXPECT_FALSE(project.Save(scratch.File("no/such/folder/p.wbproj"), &error));
    EXPECT_NE(error.find("no/such/folder"), std::string::npos) << error;
    EXPECT_TRUE(FilesIn(scratch.Path()).empty());

    const std::string path = scratch.File("p.wbproj");
    ASSERT_TRUE(project.Save(path, &error));
    ::chmod(path.c_str(), 0640);
    ASSERT_TRUE(project.Save(path, &error));
    struct stat info {};
    ASSERT_EQ(::stat(path.c_str(), &info), 0);
    EXPECT_EQ(info.st_mode & 0777, 0640u); // a save does not make the file private
}

TEST(ProjectSave, LeftoversOfEarlierSavesAreReplacedAndFailedSavesLeaveNone) {
    ScratchFolder scratch;
    wbhost::resources::ResourceService service;
    Project project(service);
    const std::string path = scratch.File("p.wbproj");
    const std::string temporary = wbhost::project::TemporaryFileFor(path);
    std::string error;
    SetMark(project, u"first");
    ASSERT_TRUE(project.Save(path, &error)) << error;

    // A killed save left a longer, read-only file; it never shadows the project, and the next
    // save writes a fresh one instead of appending to it or failing on it.
    scratch.Write("p.wbproj.tmp", std::string(100000, 'x'));
    ::chmod(temporary.c_str(), 0400);
    EXPECT_EQ(MarkOf(path, service), u"first");
    SetMark(project, u"second");
    ASSERT_TRUE(project.Save(path, &error)) << error;
    EXPECT_EQ(MarkOf(path, service), u"second");
    EXPECT_EQ(FilesIn(scratch.Path()), std::vector<std::string>{"p.wbproj"});

    // A link planted under the temporary name is removed, not written through.
    const std::string victim = scratch.Write("victim", "keep");
    ASSERT_EQ(::symlink(victim.c_str(), temporary.c_str()), 0);
    ASSERT_TRUE(project.Save(path, &error)) << error;
    std::string kept;
    ASSERT_TRUE(wbhost::project::ReadWholeFile(victim, kept, nullptr));
    EXPECT_EQ(kept, "keep");
    EXPECT_FALSE(std::filesystem::is_symlink(path));

    // The rename fails (a folder with contents is in the way): the temporary file goes too.
    const std::string blocked = scratch.File("blocked");
    std::filesystem::create_directories(blocked + "/inside");
    EXPECT_FALSE(project.Save(blocked, &error));
    EXPECT_NE(error.find("blocked"), std::string::npos) << error;
    EXPECT_FALSE(std::filesystem::exists(wbhost::project::TemporaryFileFor(blocked)));
}

} // namespace
