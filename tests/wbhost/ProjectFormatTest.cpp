// The project file: what a save keeps, what a reopen gives back, files it must refuse, and saves
// that replace the file atomically (an interrupted save keeps the old file).
#include "ProjectTestSupport.h"
#include "project/AtomicFile.h"
#include "project/Project.h"

#include <algorithm>
#include <gtest/gtest.h>
#include <sys/stat.h>

using namespace projecttest;
using qv::com::ComPtr;
using wbhost::project::Project;
using wbhost::project::ProjectItem;
using wbhost::project::Property;

namespace {

constexpr GUID kItemType = qv::com::ParseGuid("11111111-2222-3333-4444-555555555555");

// Texts that a line-oriented file could easily damage.
std::vector<std::u16string> AwkwardTexts() {
    return {u"",
            u" ",
            u"  leading and trailing  ",
            u"line one\nline two\r\nline three\n",
            u"\ttab \"quoted\" 'single' <xml attr=\"v\"/> &amp;",
            u"back\\slash \\e \\s \\x41 \\",
            u"\\e",
            u"end",
            u"Gr\u00FC\u00DFe \u65E5\u672C \U0001F600 \u007F \u0001",
            std::u16string(1, u'\xD800') + u"lone surrogate",
            std::u16string(100000, u'x') + u"\n" + std::u16string(1000, u'\u00E9')};
}

std::vector<std::string> FilesIn(const std::string& folder) {
    std::vector<std::string> names;
    for (const auto& entry : std::filesystem::directory_iterator(folder))
        names.push_back(entry.path().filename().string());
    std::sort(names.begin(), names.end());
    return names;
}

void SetMark(Project& project, const char16_t* value) {
    project.Root().Bag().SetString(u"mark", value, 0);
}

std::u16string MarkOf(const std::string& path, wbhost::resources::ResourceService& service) {
    std::string error;
    auto project = Project::Open(path, service, &error);
    EXPECT_TRUE(project) << error;
    return project ? StringOf(project->Root().Bag(), u"mark") : u"";
}

class ProjectFormatTest : public ::testing::Test {
protected:
    ScratchFolder scratch;
    wbhost::resources::ResourceService service;
};

TEST_F(ProjectFormatTest, EverythingReadsBackUnchangedWithEachFieldKeptToOneField) {
    Project project(service, u"My Project");
    std::string error;
    // A file name that is not valid UTF-16 material: kept as bytes.
    auto target = project.AddTarget(
        u"Target A", scratch.Write("t \xF0\x9F\x98\x80\xFF.xml", kDescription), &error);
    ASSERT_TRUE(target) << error;
    IwbProjectItem* folder = nullptr;
    ASSERT_EQ(target->CreateChild(wbproj::kFolderType, u"Folder with spaces", &folder), S_OK);
    IwbProjectItem* item = nullptr;
    ASSERT_EQ(folder->CreateChild(kItemType, u"I/O \u00E9\n1", &item), S_OK);
    item->SetFlags(0xFFFFFFEFu);
    IwbProjectPropertyBag* bag = nullptr;
    item->GetPropertyBag(&bag);
    const auto texts = AwkwardTexts();
    for (size_t i = 0; i < texts.size(); ++i) {
        const std::u16string name = u"text " + std::u16string(1, char16_t(u'a' + i));
        EXPECT_EQ(bag->SetString(name.c_str(), texts[i].c_str(), 0), S_OK);
    }
    bag->SetInt(u"min", INT32_MIN, 0);
    bag->SetInt(u"max", INT32_MAX, 0);
    bag->SetBool(u"yes", 1, 0);
    bag->SetBool(u"no", 0, 0);
    bag->SetString(u"name with spaces \u00E9", u"v", 0);
    bag->Release();
    folder->Release();
    item->Release();

    const std::string path = scratch.File("p.wbproj");
    ASSERT_TRUE(project.Save(path, &error)) << error;

    // The reopened project recreates provider items with their properties already in place.
    std::vector<std::u16string> seenAtCreation;
    auto reopened = Project::Open(
        path, service, &error,
        [&](IwbProjectItem& made, const GUID& type, IUnknown* state,
            ComPtr<IUnknown>& object) -> HRESULT {
            EXPECT_TRUE(qv::com::QueryAs<IwbProjectPropertyBag>(state)); // reloaded, not new
            EXPECT_TRUE(IsEqualGUID(type, kItemType));
            ComPtr<IwbProjectPropertyBag> madeBag;
            made.GetPropertyBag(madeBag.Put());
            seenAtCreation.push_back(StringOf(*madeBag.Get(), u"text h"));
            object = ComPtr<IUnknown>::Share(Make<ScopeObjectImpl>()->GetUnknown());
            return S_OK;
        });
    ASSERT_TRUE(reopened) << error;
    EXPECT_EQ(seenAtCreation, std::vector<std::u16string>{u"end"});
    // Same items, identifiers, types, flags and properties, in the same places.
    const auto before = project.Snapshot();
    const auto after = reopened->Snapshot();
    ASSERT_EQ(after.items.size(), before.items.size());
    for (size_t i = 0; i < before.items.size(); ++i) {
        const auto& a = before.items[i];
        const auto& b = after.items[i];
        EXPECT_TRUE(IsEqualGUID(a.id, b.id) && IsEqualGUID(a.type, b.type)) << i;
        EXPECT_EQ(a.flags, b.flags);
        EXPECT_EQ(a.name, b.name);
        EXPECT_EQ(a.parent, b.parent);
        EXPECT_EQ(a.descriptionFile, b.descriptionFile);
        EXPECT_TRUE(a.properties == b.properties) << i;
    }
    // And through the interfaces the module uses.
    ASSERT_EQ(reopened->Targets().size(), 1u);
    IwbhwResourceTreeNode* root = nullptr;
    EXPECT_EQ(reopened->TargetOf(*reopened->Targets()[0].Get())->GetResourceTreeRoot(&root), S_OK);
    if (root)
        root->Release();
    const ProjectItem& reItem = *reopened->Targets()[0]->Children()[0]->Children()[0].Get();
    EXPECT_NE(reItem.Object(), nullptr);
    IwbProjectPropertyBag* reBag = nullptr;
    const_cast<ProjectItem&>(reItem).GetPropertyBag(&reBag);
    for (size_t i = 0; i < texts.size(); ++i)
        EXPECT_EQ(StringOf(*reBag, (u"text " + std::u16string(1, char16_t(u'a' + i))).c_str()),
                  texts[i])
            << i;
    int32_t value = 0;
    EXPECT_EQ(reBag->GetBool(u"no", &value), S_OK); // a false Boolean is still present
    EXPECT_EQ(value, 0);
    reBag->Release();

    // A second save of the reopened project writes the same file.
    std::string first, second;
    ASSERT_TRUE(wbhost::project::ReadWholeFile(path, first, nullptr));
    ASSERT_TRUE(reopened->Save(path, &error)) << error;
    ASSERT_TRUE(wbhost::project::ReadWholeFile(path, second, nullptr));
    EXPECT_EQ(first, second);
    // Each escaped field keeps to one field of the line.
    for (const auto& text : texts) {
        const std::string field = wbhost::project::EscapeField(text);
        EXPECT_FALSE(field.empty());
        EXPECT_EQ(field.find_first_of(" \n\r"), std::string::npos);
        std::u16string back;
        EXPECT_TRUE(wbhost::project::UnescapeField(field, back));
        EXPECT_EQ(back, text);
    }
}

TEST_F(ProjectFormatTest, MalformedOrCutFilesAreRefusedWithTheLine) {
    const std::string root = "item {00000000-0000-0000-0000-000000000001} - "
                             "{CD645BF2-83EE-4D8F-9768-1ACEEB221DF0} 00000010 P\n";
    const std::string head = "wbhost-project 1\n" + root;
    const std::string id = "{00000000-0000-0000-0000-000000000001}";
    const std::vector<std::pair<std::string, std::string>> cases = {
        {"", "line 0"},
        {"wbhost-project 2\n" + root + "end\n", "line 1"},
        {head, "cut short"},
        {head + "en\n", "line 3"},
        {head + "colour " + id + " x\nend\n", "line 3"},
        {head + "string " + id + " a b c\nend\n", "line 3"},
        {head + "string " + id + " a \\q\nend\n", "line 3"},
        {head + "string " + id + " a x\\\nend\n", "line 3"},
        {head + "string " + id + " a \\xZZ\nend\n", "line 3"},
        {head + "string " + id + " a \xC3\nend\n", "line 3"},
        {head + "string {00000000-0000-0000-0000-000000000009} a b\nend\n", "line 3"},
        {head + "string " + id + " a b\nint " + id + " a 1\nend\n", "line 4"},
        {head + "int " + id + " a 2147483648\nend\n", "line 3"},
        {head + "int " + id + " a 0x10\nend\n", "line 3"},
        {head + "bool " + id + " a 2\nend\n", "line 3"},
        {head + root + "end\n", "line 3"},
        {head + "item {00000000-0000-0000-0000-000000000002} {00000000-0000-0000-0000-00000000"
                "0003} {CD645BF2-83EE-4D8F-9768-1ACEEB221DF0} 00000000 C\nend\n",
         "line 3"},
        {head + "item {00000000-0000-0000-0000-000000000002} " + id +
             " {CD645BF2-83EE-4D8F-9768-1ACEEB221DF0} 0000000G C\nend\n",
         "line 3"},
        {head + "item {00000000-0000-0000-0000-000000000002} " + id + " {bad} 00000000 C\nend\n",
         "line 3"},
        {head + "end\nitem x\n", "line 4"},
        {"wbhost-project 1\nend\n", "no root"},
    };
    for (const auto& [text, where] : cases) {
        wbhost::project::SavedProject saved;
        saved.items.resize(3); // must stay as it was
        std::string error;
        EXPECT_FALSE(wbhost::project::ParseProject(text, saved, &error)) << text;
        EXPECT_NE(error.find(where), std::string::npos) << text << " -> " << error;
        EXPECT_EQ(saved.items.size(), 3u);
    }
    wbhost::project::SavedProject saved;
    EXPECT_TRUE(wbhost::project::ParseProject(head + "end", saved, nullptr));
    // A file that went through a line-ending conversion still reads.
    EXPECT_TRUE(wbhost::project::ParseProject(
        "wbhost-project 1\r\n" + root.substr(0, root.size() - 1) + "\r\nend\r\n", saved, nullptr));
    // Every cut of a file is refused.
    Project project(service);
    IwbProjectItem* folder = nullptr;
    project.Root().CreateChild(wbproj::kFolderType, u"F", &folder);
    IwbProjectPropertyBag* bag = nullptr;
    folder->GetPropertyBag(&bag);
    bag->SetString(u"s", u"two\nlines", 0);
    bag->SetInt(u"i", 12345, 0);
    bag->Release();
    folder->Release();
    const std::string text = FormatProject(project.Snapshot());
    // Only the closing newline may go missing.
    for (size_t length = 0; length + 1 < text.size(); ++length) {
        wbhost::project::SavedProject saved;
        EXPECT_FALSE(wbhost::project::ParseProject(text.substr(0, length), saved, nullptr))
            << length;
    }
}

TEST_F(ProjectFormatTest, AFailedOpenLeavesTheOpenProjectAlone) {
    Project project(service);
    IwbProjectPropertyBag* bag = nullptr;
    project.Root().GetPropertyBag(&bag);
    bag->SetInt(u"kept", 1, 0);
    const std::string path = scratch.File("p.wbproj");
    std::string error;
    ASSERT_TRUE(project.Save(path, &error));

    scratch.Write("bad.wbproj", "wbhost-project 1\nnonsense\nend\n");
    EXPECT_FALSE(Project::Open(scratch.File("bad.wbproj"), service, &error));
    EXPECT_NE(error.find("bad.wbproj: line 2"), std::string::npos) << error;
    EXPECT_FALSE(Project::Open(scratch.File("missing.wbproj"), service, &error));
    EXPECT_NE(error.find("missing.wbproj"), std::string::npos);

    // A target whose description went away refuses the project; an item whose object is refused
    // stays, with the refusal recorded.
    auto target = project.AddTarget(u"T", scratch.Write("t.xml", kDescription), &error);
    project.Root().CreateChild(kItemType, u"Item", nullptr);
    ASSERT_TRUE(project.Save(path, &error));
    std::filesystem::remove(scratch.File("t.xml"));
    EXPECT_FALSE(Project::Open(path, service, &error));
    EXPECT_NE(error.find("t.xml"), std::string::npos) << error;
    scratch.Write("t.xml", kDescription);
    const auto reopened = Project::Open(
        path, service, &error,
        [](IwbProjectItem&, const GUID&, IUnknown*, ComPtr<IUnknown>&) { return E_ACCESSDENIED; });
    ASSERT_TRUE(reopened) << error;
    const auto& kept = reopened->Root().Children();
    ASSERT_EQ(kept.size(), 2u);
    EXPECT_EQ(kept[1]->BindStatus(), E_ACCESSDENIED);

    int32_t value = 0;
    EXPECT_EQ(bag->GetInt(u"kept", &value), S_OK);
    EXPECT_EQ(value, 1);
    EXPECT_EQ(project.Root().Children().size(), 2u);
    bag->Release();
}

TEST_F(ProjectFormatTest, AnInterruptedSaveLeavesThePreviousFileIntact) {
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

TEST_F(ProjectFormatTest, FailuresAreReportedAndKeepTheFileMode) {
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

TEST_F(ProjectFormatTest, LinksAreSavedThroughAndFailedSavesLeaveNothing) {
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
