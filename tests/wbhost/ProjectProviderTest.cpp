// The loaded module's provider attached to a host project: its items made, saved and remade.
#include "ProjectTestSupport.h"
#include "cli/HostedModule.h"
#include "framework/IqxProvider.h"
#include "host/contracts/IwbProjectProvider.h"
#include "project/Project.h"
#include "project/ProviderFactory.h"
#include "provider/TIOIdentifiers.h"
#include "runner/RunnerService.h"
#include "session/RootObject.h"

#include <gtest/gtest.h>

using namespace projecttest;
using qv::com::ComPtr;
using wbhost::project::Project;

namespace {

using GetProviderFn = HRESULT(int32_t, void**);

TEST(ProjectProvider, AttachesMakesItemsAndRemakesThemOnReopen) {
    wbhost::cli::HostedModule module(WBT_MODULE_PATH);
    ASSERT_TRUE(module.Loaded()) << module.Error();
    auto* getProvider = module.Find<GetProviderFn>("qxGetProvider");
    ASSERT_NE(getProvider, nullptr);
    void* raw = nullptr;
    ASSERT_EQ(getProvider(0, &raw), S_OK);
    auto provider = ComPtr<IqxProvider>::Adopt(static_cast<IqxProvider*>(raw));
    auto attachable = provider.As<IwbProjectProvider>();
    ASSERT_TRUE(attachable);

    ScratchFolder scratch;
    wbhost::resources::ResourceService service;
    const std::string path = scratch.File("p.wbproj");
    std::string error;
    // The provider starts with the framework's root object, as the session gives it.
    wbhost::session::RootObject* root = nullptr;
    ASSERT_EQ(wbhost::session::RootObject::CreateInstance(
                  &root,
                  ComPtr<IwbProgramRunnerService>::Share(wbhost::runner::NewRunnerService().Get())),
              S_OK);
    const auto rootObject = ComPtr<IUnknown>::Adopt(root->GetUnknown());
    ASSERT_EQ(provider->Initialize(rootObject.Get()), S_OK);
    {
        Project project(service);
        ASSERT_EQ(attachable->Attach(&project.Root()), S_OK);
        EXPECT_EQ(attachable->ProjectReady(), S_OK);
        project.SetObjectFactory(wbhost::project::ProviderFactory(provider));
        auto target = project.AddTarget(u"T", scratch.Write("t.xml", kDescription), &error);
        ASSERT_TRUE(target) << error;
        IwbProjectItem* item = nullptr;
        ASSERT_EQ(target->CreateChild(tio::kIOItemType, u"IO1", &item), S_OK);
        IUnknown* object = nullptr;
        ASSERT_EQ(item->GetObject(&object), S_OK);
        EXPECT_EQ(provider->ValidateCandidate(object), S_OK);
        object->Release();
        IwbProjectPropertyBag* bag = nullptr;
        item->GetPropertyBag(&bag);
        bag->SetInt(u"probe", 7, 0);
        bag->Release();
        item->Release();
        // A folder is the host's own: the provider is not asked for it.
        ASSERT_EQ(target->CreateChild(wbproj::kFolderType, u"F", nullptr), S_OK);

        EXPECT_EQ(attachable->ProjectSaving(), S_OK);
        ASSERT_TRUE(project.Save(path, &error)) << error;
        EXPECT_EQ(attachable->ProjectSaved(), S_OK);
        EXPECT_EQ(attachable->Detach(), S_OK);
    }

    auto reopened =
        Project::Open(path, service, &error, wbhost::project::ProviderFactory(provider));
    ASSERT_TRUE(reopened) << error;
    ASSERT_EQ(attachable->AttachReloaded(&reopened->Root()), S_OK);
    auto& target = *reopened->Targets().at(0).Get();
    IwbProjectItem* item = nullptr;
    ASSERT_EQ(target.FindChild(u"io1", &item), S_OK);
    IUnknown* object = nullptr;
    ASSERT_EQ(item->GetObject(&object), S_OK);
    EXPECT_EQ(provider->ValidateCandidate(object), S_OK);
    object->Release();
    IwbProjectPropertyBag* bag = nullptr;
    item->GetPropertyBag(&bag);
    int32_t probe = 0;
    EXPECT_EQ(bag->GetInt(u"probe", &probe), S_OK);
    EXPECT_EQ(probe, 7);
    bag->Release();
    item->Release();
    EXPECT_EQ(attachable->Detach(), S_OK);
    reopened.reset();
}

} // namespace
