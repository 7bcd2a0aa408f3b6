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

    const std::vector<std::string> withLeftover = FilesIn(scratch.Path());
    SetMark(project, u"second");
    ASSERT_TRUE(project.Save(path, &error)) << error;
    EXPECT_EQ(MarkOf(path, service), u"second");
    // The next save wrote a file of its own; the leftover is neither read nor renamed.
    EXPECT_EQ(FilesIn(scratch.Path()), withLeftover);
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

TEST(ProjectSave, LinksAreSavedThroughAndFailedSavesLeaveNothing) {
    ScratchFolder scratch;
    wbhost::resources::ResourceService service;
    Project project(service);
    std::string error;
    std::filesystem::create_directories(scratch.File("real"));
    const std::string real = scratch.File("real/p.wbproj");
    SetMark(project, u"first");
    ASSERT_TRUE(project.Save(real, &error)) << error;

    // A project reached through a link: the link stays a link and its file gets the change.
    const std::string link = scratch.File("p.wbproj");
    ASSERT_EQ(::symlink("real/p.wbproj", link.c_str()), 0);
    auto opened = Project::Open(link, service, &error);
    ASSERT_TRUE(opened) << error;
    SetMark(*opened, u"through the link");
    ASSERT_TRUE(opened->Save(link, &error)) << error;
    EXPECT_TRUE(std::filesystem::is_symlink(link));
    EXPECT_EQ(FilesIn(scratch.File("real")), std::vector<std::string>{"p.wbproj"});
    opened.reset();
    EXPECT_EQ(MarkOf(real, service), u"through the link");

    // The rename fails (a folder with contents is in the way): the temporary file goes too.
    const std::string blocked = scratch.File("blocked");
    std::filesystem::create_directories(blocked + "/inside");
    EXPECT_FALSE(project.Save(blocked, &error));
    EXPECT_NE(error.find("blocked"), std::string::npos) << error;
    EXPECT_EQ(FilesIn(scratch.Path()), (std::vector<std::string>{"blocked", "p.wbproj", "real"}));
}

} // namespace
