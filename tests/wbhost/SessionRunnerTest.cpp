// What runners made through the session's root object find of the project's items, and what the
// runtime answers about targets, while a project is open and after.
#include "ProjectTestSupport.h"
#include "host/contracts/IwbProgramRunnerService.h"
#include "kern/Guid.h"
#include "runtime/RefnumTable.h"
#include "runtime/Runtime.h"
#include "session/HostSession.h"

#include <gtest/gtest.h>

using namespace projecttest;
using qv::com::ComPtr;
using wbhost::runtime::RefnumTable;
using wbhost::session::HostSession;

namespace {

// A runner made as the module makes one: the root object asked for the runner service.
ComPtr<IwbProgramRunner> RunnerThrough(IUnknown* root) {
    ComPtr<IwbProgramRunner> runner;
    const auto service = qv::com::QueryAs<IwbProgramRunnerService>(root);
    EXPECT_TRUE(service);
    if (service) {
        EXPECT_EQ(service->CreateInstance(wbproj::kProgramRunnerClass, IwbProgramRunner::iid,
                                          runner.PutVoid()),
                  S_OK);
    }
    return runner;
}

// The item that TargetItemFromAppRef answers for REFNUM (null on error), and its error.
std::pair<ComPtr<IwbProjectItem>, WBErr> TargetOf(WBRefNum refnum) {
    void* item = nullptr;
    const WBErr err = TargetItemFromAppRef(refnum, &item);
    return {ComPtr<IwbProjectItem>::Adopt(static_cast<IwbProjectItem*>(item)), err};
}

// Refnums made by a test, given back at its end.
struct Refnums {
    ~Refnums() {
        for (WBRefNum each : made)
            RefnumTable::Instance().Remove(each);
    }
    WBRefNum Add(IUnknown* object) {
        return made.emplace_back(RefnumTable::Instance().Add(object));
    }
    std::vector<WBRefNum> made;
};

TEST(SessionRunner, RunnersFindItemsOnlyWhileTheirProjectIsOpen) {
    ScratchFolder scratch;
    HostSession session;
    auto early = RunnerThrough(session.RootObject()); // made before any project
    std::string error;
    ASSERT_TRUE(session.NewProject(u"P", &error)) << error;
    auto runner = RunnerThrough(session.RootObject());
    ComPtr<IwbProjectItem> folder;
    ASSERT_EQ(session.Project()->Root().CreateChild(wbproj::kFolderType, u"F", folder.Put()), S_OK);
    const GUID id = static_cast<wbhost::project::ProjectItem*>(folder.Get())->Id();
    for (auto* each : {early.Get(), runner.Get()}) {
        ComPtr<IwbProjectItem> found;
        ASSERT_EQ(each->FindProjectItem(id, found.Put()), S_OK);
        EXPECT_EQ(found.Get(), folder.Get());
        EXPECT_EQ(each->FindProjectItem(qv::kern::MakeGUID(), found.Put()), S_FALSE);
        EXPECT_FALSE(found);
    }
    const std::string path = scratch.File("p.wbproj");
    ASSERT_TRUE(session.Save(path, &error)) << error;
    folder.Reset();

    // The project is gone: runners still held answer "none" instead of reaching its items.
    session.Close();
    const auto late = RunnerThrough(session.RootObject());
    for (auto* each : {early.Get(), runner.Get(), late.Get()}) {
        IwbProjectItem* found = reinterpret_cast<IwbProjectItem*>(1);
        EXPECT_EQ(each->FindProjectItem(id, &found), S_FALSE);
        EXPECT_EQ(found, nullptr);
    }
    // Reopened, the item keeps its identifier and is found again, also by the old runner.
    ASSERT_TRUE(session.OpenProject(path, &error)) << error;
    ComPtr<IwbProjectItem> found;
    ASSERT_EQ(runner->FindProjectItem(id, found.Put()), S_OK);
    EXPECT_EQ(NameOf(found.Get()), u"F");
}

TEST(SessionRunner, TheRuntimeFindsTheTargetBehindAReferenceWhileTheProjectIsOpen) {
    ScratchFolder scratch;
    Refnums refnums;
    WBRefNum treeRefnum = 0;
    WBRefNum insideRefnum = 0;
    WBRefNum outsideRefnum = 0;
    {
        HostSession session;
        std::string error;
        ASSERT_TRUE(session.NewProject(u"P", &error)) << error;
        auto& project = *session.Project();
        auto first = project.AddTarget(u"A", scratch.Write("a.xml", kDescription), &error);
        auto second = project.AddTarget(u"B", scratch.Write("b.xml", kDescription), &error);
        ASSERT_TRUE(first && second) << error;
        ComPtr<IwbProjectItem> folder;
        ComPtr<IwbProjectItem> inside;
        ComPtr<IwbProjectItem> outside;
        ASSERT_EQ(second->CreateChild(wbproj::kFolderType, u"F", folder.Put()), S_OK);
        ASSERT_EQ(folder->CreateChild(wbproj::kFolderType, u"G", inside.Put()), S_OK);
        ASSERT_EQ(project.Root().CreateChild(wbproj::kFolderType, u"H", outside.Put()), S_OK);
        treeRefnum = project.TargetOf(*second.Get())->Target().refnum;
        insideRefnum = refnums.Add(inside.Get());
        outsideRefnum = refnums.Add(outside.Get());

        EXPECT_EQ(TargetOf(treeRefnum).first.Get(), second.Get());
        EXPECT_EQ(TargetOf(insideRefnum).first.Get(), second.Get());
        EXPECT_EQ(TargetOf(refnums.Add(first.Get())).first.Get(), first.Get());
        const auto [none, err] = TargetOf(outsideRefnum);
        EXPECT_FALSE(none);
        EXPECT_EQ(err, kWBGenericErr);
        EXPECT_EQ(TargetOf(0xFFFFFFF0u).second, kWBArgErr);

        session.Close();
        EXPECT_EQ(TargetOf(insideRefnum).second, kWBGenericErr);
        ASSERT_TRUE(session.NewProject(u"Q", &error)) << error;
        // Items of a closed project are nobody's: the new project does not claim them.
        EXPECT_EQ(TargetOf(insideRefnum).second, kWBGenericErr);
    }
    // The session is gone too; the runtime no longer asks it.
    EXPECT_EQ(TargetOf(treeRefnum).second, kWBGenericErr);
}

} // namespace
