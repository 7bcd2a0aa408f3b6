// The provider as the framework uses it: the module entry's current and private providers,
// item creation through the registry, type lists and names, and project attachment.
#include "provider/TIOProvider.h"

#include "com/ComInit.h"
#include "com/ComObject.h"
#include "com/TaskMem.h"
#include "framework/IqxBindable.h"
#include "framework/IqxCreateNewWizard.h"
#include "framework/IqxProjectItemValidator.h"
#include "items/TIOInstanceItemUI.h"
#include "items/TIOStrings.h"
#include "provider/ProviderEntry.h"
#include "provider/TIOIdentifiers.h"

#include <gtest/gtest.h>
#include <thread>

namespace {

using qv::com::ComPtr;
using qv::com::ParseGuid;

ComPtr<IqxProvider> GetProvider(int32_t mode) {
    IqxProvider* raw = nullptr;
    EXPECT_EQ(tio::GetProvider(mode, reinterpret_cast<void**>(&raw)), S_OK);
    return ComPtr<IqxProvider>::Adopt(raw);
}

IUnknown* Identity(IUnknown* p) {
    return qv::com::QueryAs<IUnknown>(p).Get();
}

TEST(ProviderEntry, SharesTheCurrentProviderAndMakesPrivateOnes) {
    const long before = qv::com::LiveObjectCount();
    {
        EXPECT_EQ(tio::GetProvider(0, nullptr), E_POINTER);
        EXPECT_EQ(qv::com::LiveObjectCount(), before); // nothing was created

        const auto first = GetProvider(0);
        const auto again = GetProvider(0);
        ASSERT_TRUE(first);
        EXPECT_EQ(Identity(first.Get()), Identity(again.Get()));

        const auto private1 = GetProvider(1);
        const auto private2 = GetProvider(7);
        EXPECT_NE(Identity(private1.Get()), Identity(first.Get()));
        EXPECT_NE(Identity(private1.Get()), Identity(private2.Get()));

        // A private instance leaves the module without a current provider.
        const auto next = GetProvider(0);
        EXPECT_NE(Identity(next.Get()), Identity(first.Get()));
        EXPECT_NE(Identity(next.Get()), Identity(private2.Get()));
        EXPECT_EQ(Identity(GetProvider(0).Get()), Identity(next.Get()));
    }
    EXPECT_EQ(qv::com::LiveObjectCount(), before);
}

TEST(ProviderEntry, ACurrentProviderReleasedMeanwhileIsNeverHandedOut) {
    // The last reference to the current provider goes on one thread while another asks for the
    // shared provider: the asker gets a live provider (the old one or a new one), never one
    // that is being destroyed.
    for (int round = 0; round < 300; ++round) {
        auto current = GetProvider(0);
        std::thread releaser([&current] { current.Reset(); });
        const auto got = GetProvider(0);
        releaser.join();
        ASSERT_TRUE(got);
        uint32_t count = 0;
        GUID* types = nullptr;
        EXPECT_EQ(got->GetItemTypes(&count, &types), S_OK);
        CoTaskMemFree(types);
    }
}

TEST(TIOProvider, ListsItsTypesInGuidOrderAndCreatesItemsAndWizardInTheirInitialState) {
    const auto provider = GetProvider(1);
    uint32_t count = 0;
    GUID* types = nullptr;
    ASSERT_EQ(provider->GetItemTypes(&count, &types), S_OK);
    ASSERT_EQ(count, 3u);
    EXPECT_TRUE(IsEqualGUID(types[0], tio::kGenericItemType));
    EXPECT_TRUE(IsEqualGUID(types[1], tio::kWizardType));
    EXPECT_TRUE(IsEqualGUID(types[2], tio::kIOItemType));
    CoTaskMemFree(types);
    ASSERT_EQ(provider->GetParentTypes(&count, &types), S_OK);
    EXPECT_EQ(count, 0u);
    EXPECT_EQ(types, nullptr);

    BSTR name = nullptr;
    ASSERT_EQ(provider->GetTypeName(tio::kIOItemType, &name), S_OK);
    EXPECT_EQ(qv::com::BstrToString(name), u"Tangent IO");
    SysFreeString(name);
    for (const GUID& other : {tio::kGenericItemType, tio::kWizardType, GUID_NULL}) {
        EXPECT_EQ(provider->GetTypeName(other, &name), E_FAIL);
        EXPECT_EQ(name, nullptr);
    }
    CLSID clsid{};
    ASSERT_EQ(provider->GetClassId(&clsid), S_OK);
    EXPECT_TRUE(IsEqualGUID(clsid, tio::kProviderClassId));
    const long before = qv::com::LiveObjectCount();
    {
        const auto provider = GetProvider(1);
        IUnknown* raw = nullptr;
        ASSERT_EQ(provider->CreateItem(tio::kIOItemType, nullptr, &raw), S_OK);
        const auto item = ComPtr<IUnknown>::Adopt(raw);
        const auto itemUI = item.As<IqxItemUI>();
        ASSERT_TRUE(itemUI);
        const auto* io = dynamic_cast<TIOInstanceItemUI*>(itemUI.Get());
        ASSERT_NE(io, nullptr);
        EXPECT_EQ(io->resourceStatus(), 1);
        EXPECT_EQ(io->attributeBag(), nullptr);

        // The wizard can be aggregated; before it is bound it offers nothing.
        ASSERT_EQ(provider->CreateItemFromState(tio::kWizardType, nullptr, nullptr, &raw), S_OK);
        const auto wizard = ComPtr<IUnknown>::Adopt(raw).As<IqxCreateNewWizard>();
        ASSERT_TRUE(wizard);
        const QxCreateNewRequest request;
        uint32_t count = 5;
        QxNewItemDescription* list = nullptr;
        EXPECT_EQ(wizard->GetNewItemDescriptions(&request, &count, &list), S_OK);
        EXPECT_EQ(count, 0u);

        // A request that names no type goes to the first registered type that takes it.
        ASSERT_EQ(provider->CreateItem(GUID_NULL, nullptr, &raw), S_OK);
        const auto generic = ComPtr<IUnknown>::Adopt(raw);
        EXPECT_TRUE(generic.As<IqxItemUI>());
        EXPECT_FALSE(generic.As<IqxCreateNewWizard>());

        EXPECT_EQ(
            provider->CreateItem(ParseGuid("01234567-89AB-CDEF-0123-456789ABCDEF"), nullptr, &raw),
            CLASS_E_CLASSNOTAVAILABLE);
        EXPECT_EQ(raw, nullptr);
        EXPECT_EQ(provider->CreateItem(tio::kIOItemType, nullptr, nullptr), E_POINTER);
    }
    EXPECT_EQ(qv::com::LiveObjectCount(), before);
}

// A host project object that counts its references.
class FakeProject : public IqxProjectItemValidator {
public:
    using Interfaces = qv::com::InterfaceList<IqxProjectItemValidator>;
    HRESULT ValidateAgainst(IUnknown*) override { return S_FALSE; }
};

TEST(TIOProvider, ValidatesOnlyItsCandidatesAndHoldsOneProjectAtATime) {
    const auto mine = GetProvider(1);
    const auto other = GetProvider(1);
    IUnknown* raw = nullptr;
    ASSERT_EQ(mine->CreateItem(tio::kIOItemType, nullptr, &raw), S_OK);
    const auto item = ComPtr<IUnknown>::Adopt(raw);
    EXPECT_EQ(mine->ValidateCandidate(item.Get()), S_OK);
    EXPECT_EQ(other->ValidateCandidate(item.Get()), S_FALSE);
    EXPECT_EQ(mine->ValidateCandidate(nullptr), S_FALSE);
    EXPECT_EQ(mine->ValidateCandidate(mine.Get()), S_FALSE); // not an item
    const long before = qv::com::LiveObjectCount();
    {
        const auto provider = GetProvider(1);
        const auto project = provider.As<IwbProjectProvider>();
        ASSERT_TRUE(project);
        CQVComObject<FakeProject>* first = nullptr;
        CQVComObject<FakeProject>* second = nullptr;
        ASSERT_EQ(CQVComObject<FakeProject>::CreateInstance(&first), S_OK);
        ASSERT_EQ(CQVComObject<FakeProject>::CreateInstance(&second), S_OK);
        const auto count = [](IUnknown* p) {
            p->AddRef();
            return p->Release();
        };
        const uint32_t initsBefore = qv::com::CoInitializeCount();
        EXPECT_EQ(project->Attach(first->GetUnknown()), S_OK);
        EXPECT_EQ(project->Attach(first->GetUnknown()), S_OK); // the same object again
        EXPECT_EQ(count(first->GetUnknown()), 2u);
        EXPECT_EQ(project->AttachReloaded(second->GetUnknown()), S_OK);
        EXPECT_EQ(count(first->GetUnknown()), 1u);
        EXPECT_EQ(count(second->GetUnknown()), 2u);
        EXPECT_EQ(project->ProjectReady(), S_OK);
        EXPECT_EQ(project->Detach(), S_OK);
        EXPECT_EQ(count(second->GetUnknown()), 1u);
        EXPECT_EQ(project->Detach(), S_OK); // detaching twice is harmless
        EXPECT_GE(qv::com::CoInitializeCount(), initsBefore);
        first->Release();
        // The provider still holds the second project until it is destroyed.
        EXPECT_EQ(project->Attach(second->GetUnknown()), S_OK);
        second->Release();
        while (qv::com::CoInitializeCount() > initsBefore) {
            CoUninitialize();
        }
    }
    EXPECT_EQ(qv::com::LiveObjectCount(), before);
}

TEST(TIOStrings, EveryMessageTheItemsUseExistsAndTheConflictNamesBothItems) {
    for (uint32_t id : {2u, 5u, 6u, 7u, 8u, 9u, 13u, 14u, 15u, 16u, 17u, 18u, 30u, 31u}) {
        EXPECT_FALSE(tio::ModuleString(id).empty()) << id;
    }
    const std::u16string conflict = tio::ModuleString(tio::kStrConflictMessage);
    EXPECT_NE(conflict.find(u"<SelfProjectItemName>"), std::u16string::npos);
    EXPECT_NE(conflict.find(u"<OffendingProjectItemName>"), std::u16string::npos);
    std::u16string text = u"unchanged";
    EXPECT_FALSE(tio::LoadModuleString(1, text));
    EXPECT_FALSE(tio::LoadModuleString(32, text));
    EXPECT_EQ(text, u"unchanged");
}

} // namespace
