// The embedded host started in-process through its session, with the real module loaded: the
// provider started and attached, its items saved and reopened, and saves announced to providers.
#include "ProjectTestSupport.h"
#include "cli/HostedModule.h"
#include "host/contracts/IwbProjectProvider.h"
#include "project/AtomicFile.h"
#include "provider/TIOIdentifiers.h"
#include "session/HostSession.h"

#include <gtest/gtest.h>

using namespace projecttest;
using qv::com::ComPtr;
using wbhost::session::HostSession;

namespace {

// The references OBJECT has now.
uint32_t References(IUnknown* object) {
    object->AddRef();
    return object->Release();
}

ComPtr<IwbProjectPropertyBag> BagOf(IwbProjectItem* item) {
    ComPtr<IwbProjectPropertyBag> bag;
    item->GetPropertyBag(bag.Put());
    return bag;
}

// A second provider of the project, which writes down what it is told and whether the project
// file existed at that moment.
class RecordingProviderImpl : public IwbProjectProvider {
public:
    using Interfaces = qv::com::InterfaceList<IwbProjectProvider>;
    explicit RecordingProviderImpl(std::string file) : file_(std::move(file)) {}
    virtual ~RecordingProviderImpl() = default;
    HRESULT Attach(IUnknown*) override { return Note("attach"); }
    HRESULT AttachReloaded(IUnknown*) override { return Note("attach reloaded"); }
    HRESULT ProjectReady() override { return Note("ready"); }
    HRESULT Detach() override { return Note("detach"); }
    HRESULT ProjectSaving() override {
        Note(std::filesystem::exists(file_) ? "saving (file there)" : "saving (no file)");
        return savingAnswer;
    }
    HRESULT ProjectSaved() override {
        std::string text;
        wbhost::project::ReadWholeFile(file_, text, nullptr);
        return Note("saved (" + std::to_string(text.size()) + " bytes)");
    }
    std::vector<std::string> heard;
    HRESULT savingAnswer = S_OK;

private:
    HRESULT Note(std::string what) {
        heard.push_back(std::move(what));
        return S_OK;
    }
    std::string file_;
};

class SessionTest : public ::testing::Test {
protected:
    void SetUp() override {
        std::string error;
        ASSERT_TRUE(session.Open(WBT_MODULE_PATH, &error)) << error;
        description = scratch.Write("t.xml", kDescription);
    }

    // A new project with target "T" holding the module's item "IO1".
    ComPtr<IwbProjectItem> ProjectWithItem() {
        std::string error;
        EXPECT_TRUE(session.NewProject(u"Bench", &error)) << error;
        auto target = session.Project()->AddTarget(u"T", description, &error);
        EXPECT_TRUE(target) << error;
        ComPtr<IwbProjectItem> item;
        if (target) {
            EXPECT_EQ(target->CreateChild(tio::kIOItemType, u"IO1", item.Put()), S_OK);
        }
        return item;
    }

    std::string Text() { return wbhost::project::FormatProject(session.Project()->Snapshot()); }

    ScratchFolder scratch;
    HostSession session;
    std::string description;
};

TEST_F(SessionTest, TheModuleLoadsOnceItsProviderStartsAndHoldsEachProjectUntilItCloses) {
    // The provider keeps the root object it was started with.
    EXPECT_EQ(References(session.RootObject()), 2u);
    std::string error;
    EXPECT_FALSE(session.Open(WBT_MODULE_PATH, &error));
    EXPECT_NE(error.find("already"), std::string::npos);

    // The provider answers through its interface across the module boundary.
    BSTR name = nullptr;
    ASSERT_EQ(session.Provider()->GetTypeName(tio::kIOItemType, &name), S_OK);
    EXPECT_EQ(TakeText(name), u"Tangent IO");
    // The provider is attached to each project and lets it go on close.
    ASSERT_TRUE(session.NewProject(u"", &error)) << error;
    EXPECT_EQ(session.Project()->Root().Name(), u"Project");
    auto root = ComPtr<IwbProjectItem>::Share(&session.Project()->Root());
    EXPECT_EQ(References(root.Get()), 3u); // the project, this test and the attached provider
    // A second project replaces the first, which the provider no longer holds.
    ASSERT_TRUE(session.NewProject(u"Second", &error)) << error;
    EXPECT_EQ(References(root.Get()), 1u);
    auto second = ComPtr<IwbProjectItem>::Share(&session.Project()->Root());
    session.Close();
    EXPECT_EQ(session.Project(), nullptr);
    EXPECT_EQ(References(second.Get()), 1u);
    session.Close(); // nothing open: nothing happens
    EXPECT_FALSE(session.Save(scratch.File("p.wbproj"), &error));
    EXPECT_EQ(error, "no project is open");
}

TEST(Session, AModuleThatDoesNotLoadIsReportedAndOneLoadedLaterServesTheOpenProject) {
    ScratchFolder scratch;
    HostSession session;
    std::string error;
    EXPECT_FALSE(session.Open(scratch.Write("bad.qxx", "not a module"), &error));
    EXPECT_FALSE(error.empty());
    EXPECT_EQ(session.Provider(), nullptr);
    EXPECT_EQ(session.Module(), nullptr);

    // Without a module the host's own items still work; the module's types get no object.
    ASSERT_TRUE(session.NewProject(u"P", &error)) << error;
    auto target = session.Project()->AddTarget(u"T", scratch.Write("t.xml", kDescription), &error);
    ASSERT_TRUE(target) << error;
    ComPtr<IwbProjectItem> early;
    ASSERT_EQ(target->CreateChild(tio::kIOItemType, u"Early", early.Put()), S_OK);
    ComPtr<IUnknown> object;
    EXPECT_EQ(early->GetObject(object.Put()), S_FALSE);
    EXPECT_FALSE(object);

    ASSERT_TRUE(session.Open(WBT_MODULE_PATH, &error)) << error;
    ComPtr<IwbProjectItem> late;
    ASSERT_EQ(target->CreateChild(tio::kIOItemType, u"Late", late.Put()), S_OK);
    ASSERT_EQ(late->GetObject(object.Put()), S_OK);
    EXPECT_EQ(session.Provider()->ValidateCandidate(object.Get()), S_OK);
    EXPECT_EQ(References(&session.Project()->Root()), 2u); // the project and the provider
}

TEST_F(SessionTest, AProjectWithItemsAndPropertiesReadsBackUnchangedWhenReopened) {
    auto item = ProjectWithItem();
    ASSERT_TRUE(item);
    std::string error;
    auto folder = ComPtr<IwbProjectItem>();
    ASSERT_EQ(
        session.Project()->Root().CreateChild(wbproj::kFolderType, u"Notes \u00e9", folder.Put()),
        S_OK);
    // Every kind of property reads back as ProjectFormatTest shows; here one goes through the
    // session.
    ASSERT_EQ(BagOf(item.Get())->SetString(u"text", u"two\nlines \u00e9\u4e2d", 0), S_OK);
    item.Reset();
    folder.Reset();

    const std::string path = scratch.File("bench.wbproj");
    EXPECT_FALSE(session.Save("", &error)); // a new project has no file yet
    EXPECT_NE(error.find("no file"), std::string::npos);
    ASSERT_TRUE(session.Save(path, &error)) << error;
    EXPECT_EQ(session.ProjectPath(), path);
    const std::string saved = Text();
    session.Close();
    EXPECT_TRUE(session.ProjectPath().empty());

    ASSERT_TRUE(session.OpenProject(path, &error)) << error;
    EXPECT_EQ(session.ProjectPath(), path);
    EXPECT_EQ(Text(), saved);
    ComPtr<IwbProjectItem> reopened;
    ASSERT_EQ(session.Project()->Targets().at(0)->FindChild(u"io1", reopened.Put()), S_OK);
    ComPtr<IUnknown> object;
    ASSERT_EQ(reopened->GetObject(object.Put()), S_OK);
    EXPECT_EQ(session.Provider()->ValidateCandidate(object.Get()), S_OK);
    // Saving again without a name writes back to where it came from, unchanged.
    ASSERT_TRUE(session.Save("", &error)) << error;
    std::string again;
    ASSERT_TRUE(wbhost::project::ReadWholeFile(path, again, nullptr));
    EXPECT_EQ(again, saved);

    // A file that does not open says why and leaves the open project as it was.
    ASSERT_EQ(BagOf(&session.Project()->Root())->SetInt(u"unsaved", 1, 0), S_OK);
    const std::string before = Text();
    EXPECT_FALSE(session.OpenProject(scratch.Write("bad.wbproj", "wbhost-project 1\n"), &error));
    EXPECT_NE(error.find("bad.wbproj"), std::string::npos);
    ASSERT_NE(session.Project(), nullptr);
    EXPECT_EQ(Text(), before);
    EXPECT_EQ(session.ProjectPath(), path);
}

TEST_F(SessionTest, ProvidersHearOfTheSaveAroundTheWriteAndOneThatRefusesStopsIt) {
    ASSERT_TRUE(ProjectWithItem());
    const std::string path = scratch.File("p.wbproj");
    auto recorder = Make<RecordingProviderImpl>(path);
    ASSERT_EQ(
        session.Project()->AttachProvider(ComPtr<IwbProjectProvider>::Share(recorder.Get()), false),
        S_OK);
    std::string error;
    ASSERT_TRUE(session.Save(path, &error)) << error;
    std::string first;
    ASSERT_TRUE(wbhost::project::ReadWholeFile(path, first, nullptr));
    EXPECT_EQ(recorder->heard,
              (std::vector<std::string>{"attach", "saving (no file)",
                                        "saved (" + std::to_string(first.size()) + " bytes)"}));

    recorder->heard.clear();
    recorder->savingAnswer = E_FAIL;
    ASSERT_EQ(BagOf(&session.Project()->Root())->SetInt(u"changed", 1, 0), S_OK);
    EXPECT_FALSE(session.Save(path, &error));
    EXPECT_NE(error.find("refused"), std::string::npos) << error;
    EXPECT_NE(error.find("0x80004005"), std::string::npos) << error;
    EXPECT_EQ(recorder->heard, std::vector<std::string>{"saving (file there)"});
    std::string now;
    ASSERT_TRUE(wbhost::project::ReadWholeFile(path, now, nullptr));
    EXPECT_EQ(now, first);
    for (const auto& entry :
         std::filesystem::directory_iterator(std::filesystem::path(path).parent_path()))
        EXPECT_EQ(entry.path().string().find(".tmp"), std::string::npos) << entry.path();

    session.Close();
    EXPECT_EQ(recorder->heard.back(), "detach");
}

} // namespace
