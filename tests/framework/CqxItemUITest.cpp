// The item, project item and wizard bases: provider identity, overlays, names and descriptions
// handed across the interface. Menus are checked on the module's own entries in ItemCommandsTest.
#include "com/ComObject.h"
#include "com/TaskMem.h"
#include "framework/CqxCreateNewWizard.h"
#include "framework/CqxProjectItemUI.h"
#include "framework/CqxProvider.h"

#include <gtest/gtest.h>

namespace {

using qv::com::ComPtr;

class PlainProvider : public CqxProvider {};

class SampleItem : public CqxProjectItemUI {
public:
    void Show(bool invalid) {
        HandOverlay({u"wbhw/InvalidConfig.png", invalid});
        HandOverlay({u"other.png", true});
    }
    void ForbidBar() { SetInvalidNameChars(u"|\\"); }
};

class SampleWizard : public CqxCreateNewWizard {
protected:
    HRESULT OnDescribe(std::vector<CqxNewItemDescription>& list,
                       const QxCreateNewRequest&) override {
        list.push_back({IUnknown::iid, -1, u"Tangent IO", 7});
        return S_OK;
    }
};

template <class T> ComPtr<CQVComObject<T>> Make() {
    CQVComObject<T>* raw = nullptr;
    EXPECT_EQ(CQVComObject<T>::CreateInstance(&raw), S_OK);
    return ComPtr<CQVComObject<T>>::Adopt(raw);
}

TEST(CqxItemUI, AgreesOnlyWithTheProviderThatCreatedIt) {
    const long before = qv::com::LiveObjectCount();
    {
        auto mine = Make<PlainProvider>();
        auto other = Make<PlainProvider>();
        auto item = Make<SampleItem>();
        EXPECT_EQ(item->ValidateAgainst(mine.Get()), S_FALSE); // no provider yet
        item->AttachProvider(mine.Get());
        EXPECT_EQ(item->ValidateAgainst(mine.As<IUnknown>().Get()), S_OK);
        EXPECT_EQ(item->ValidateAgainst(other.Get()), S_FALSE);
        EXPECT_EQ(item->ValidateAgainst(nullptr), S_FALSE);
    }
    EXPECT_EQ(qv::com::LiveObjectCount(), before); // the item's provider reference was released
}

TEST(CqxProjectItemUI, OverlaysFollowTheRecordsHandedOverAndRenamesRefuseInvalidCharacters) {
    auto item = Make<SampleItem>();
    const auto shown = [&] {
        uint32_t count = 0;
        BSTR* images = nullptr;
        EXPECT_EQ(item->GetOverlays(&count, &images), S_OK);
        std::vector<std::u16string> result;
        for (uint32_t i = 0; i < count; ++i) {
            result.push_back(qv::com::BstrToString(images[i]));
            SysFreeString(images[i]);
        }
        CoTaskMemFree(images);
        return result;
    };
    item->Show(true);
    EXPECT_TRUE(shown().empty()); // nothing changes before the framework's update
    ASSERT_EQ(item->UpdateOverlays(), S_OK);
    EXPECT_EQ(shown(), (std::vector<std::u16string>{u"wbhw/InvalidConfig.png", u"other.png"}));
    item->Show(true); // adding again does not duplicate
    item->UpdateOverlays();
    EXPECT_EQ(shown().size(), 2u);
    item->Show(false);
    item->UpdateOverlays();
    EXPECT_EQ(shown(), (std::vector<std::u16string>{u"other.png"}));
    item = Make<SampleItem>();
    EXPECT_EQ(item->ValidateNewName(u"a|b"), S_OK); // no characters installed yet
    item->ForbidBar();
    EXPECT_EQ(item->ValidateNewName(u"a|b"), S_FALSE);
    EXPECT_EQ(item->ValidateNewName(u"DIO0"), S_OK);
    EXPECT_EQ(item->ValidateNewName(nullptr), S_FALSE);
}

TEST(CqxCreateNewWizard, DescriptionsCrossWithNamesAndAreRebuiltEachTime) {
    CQVComPolyObject<SampleWizard>* raw = nullptr;
    ASSERT_EQ(CQVComPolyObject<SampleWizard>::CreateInstance(nullptr, &raw), S_OK);
    auto holder = ComPtr<IUnknown>::Adopt(raw);
    auto wizard = holder.As<IqxCreateNewWizard>();
    ASSERT_TRUE(wizard);
    const QxCreateNewRequest request;
    for (int round = 0; round < 2; ++round) {
        uint32_t count = 0;
        QxNewItemDescription* list = nullptr;
        ASSERT_EQ(wizard->GetNewItemDescriptions(&request, &count, &list), S_OK);
        ASSERT_EQ(count, 1u);
        EXPECT_EQ(list[0].position, -1);
        EXPECT_EQ(list[0].icon, 7u);
        EXPECT_EQ(qv::com::BstrToString(list[0].displayName), u"Tangent IO");
        SysFreeString(list[0].displayName);
        CoTaskMemFree(list);
    }
}

} // namespace
