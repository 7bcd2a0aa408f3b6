// The I/O name control as the host drives it: the provider's name list on a real target, the
// control's programs through the runner, and the upgrade export running the host's library
// program through the engine table this host exports.
#include "ProjectTestSupport.h"
#include "VariantText.h"
#include "com/TaskMem.h"
#include "host/contracts/IwbProjectNameProvider.h"
#include "runtime/FailureInjection.h"
#include "runtime/HostStrings.h"
#include "runtime/Runtime.h"

#include <cstring>
#include <gtest/gtest.h>

using namespace projecttest;
using qv::com::ComPtr;

namespace {

using varianttext::Name;

void SetText(WBVariant variant, std::string_view name, std::string_view text) {
    ASSERT_EQ(varianttext::SetText(variant, name, text), kWBNoErr);
}

// A variant destroyed with its holder.
struct Variant {
    Variant() : v(WbVariantCreate()) {}
    ~Variant() { WbVariantDestroy(v); }
    WBVariant v;
};

// The data of a control whose I/O interface is IOINTERFACE, as a host keeps it.
void ControlData(Variant& data, std::string_view ioInterface) {
    Variant tdData;
    SetText(tdData.v, "IOInterface", ioInterface);
    ASSERT_EQ(WbVariantPStrSetWbVariantAttr(data.v, Name("tdData").get(), tdData.v), kWBNoErr);
}

// One entry of a name list: its "n", and whether it carries "f" = 1.
struct Entry {
    std::string name;
    bool flagged;
    bool operator==(const Entry&) const = default;
};
std::ostream& operator<<(std::ostream& out, const Entry& e) {
    return out << e.name << (e.flagged ? " (f)" : "");
}

// Reads a name list the provider made, and gives it back to the host.
std::vector<Entry> TakeList(WBHandle list) {
    std::vector<Entry> entries;
    if (list == nullptr)
        return entries;
    int32_t count = 0;
    std::memcpy(&count, *list, sizeof count);
    for (int32_t i = 0; i < count; ++i) {
        auto* slot = reinterpret_cast<WBVariant>(static_cast<char*>(*list) + 8 + 8 * i);
        WBHandle text = nullptr;
        WbVariantPStrGetStringAttr(slot, Name("n").get(), &text);
        uint32_t flag = 0;
        WbVariantPStrGetUI32Attr(slot, Name("f").get(), &flag);
        entries.push_back({wbhost::runtime::ReadHostString(text).value_or("<none>"), flag == 1});
        DSDisposeHandle(text);
        WbVariantDestroy(slot);
    }
    DSDisposeHandle(list);
    return entries;
}

class NameControlTest : public ModuleProjectTest {
protected:
    void SetUp() override {
        Open(kDescription);
        appRef = Target().Target().refnum;
        names = qv::com::QueryAs<IwbProjectNameProvider>(session.Provider());
        ASSERT_TRUE(names);
    }
    size_t RunsOf(const std::string& behaviour) {
        size_t runs = 0;
        for (const auto& run : session.Programs().Runs())
            runs += run.behaviour == behaviour ? 1 : 0;
        return runs;
    }
    // The list for a control of IOINTERFACE on the target behind REF, and the status.
    std::vector<Entry> List(std::string_view ioInterface, int32_t* status, WBRefNum ref = 0) {
        Variant data;
        ControlData(data, ioInterface);
        uint32_t count = 9;
        BSTR* array = reinterpret_cast<BSTR*>(8);
        WBHandle list = nullptr;
        const HRESULT hr =
            names->ListNames(ref != 0 ? ref : appRef, data.v, &count, &array, &list, status);
        // Only a missing target is answered as the result too.
        EXPECT_EQ(hr, *status == kNameControlNoTarget ? kNameControlNoTarget : S_OK);
        EXPECT_EQ(count, 0u);
        EXPECT_EQ(array, nullptr);
        return TakeList(list);
    }

    WBRefNum appRef = 0;
    ComPtr<IwbProjectNameProvider> names;
    wbhost::runtime::FailureScope failures;
};

TEST_F(NameControlTest, ListsTheResourcesThatFitOrAPlaceholderAndQueriesCheckTargetsAndInterfaces) {
    uint32_t count = 0;
    BSTR* categories = nullptr;
    ASSERT_EQ(names->ListCategories(&count, &categories), S_OK);
    ASSERT_EQ(count, 1u);
    EXPECT_EQ(TakeText(categories[0]), u"FPGA IO");
    CoTaskMemFree(categories);

    int32_t status = -1;
    EXPECT_EQ(List("DigitalLine", &status), (std::vector<Entry>{{"/DIO0", false}}));
    EXPECT_EQ(status, 0);
    // No interface named: every I/O resource fits.
    EXPECT_EQ(List("", &status), (std::vector<Entry>{{"/DIO0", false}, {"/AI0", false}}));
    // None fits: one entry, flagged, that names nothing to choose.
    EXPECT_EQ(List("Counter", &status),
              (std::vector<Entry>{{"<No matching I/O resources>", true}}));
    EXPECT_EQ(status, 0);
    // An application behind which there is no target.
    EXPECT_EQ(List("DigitalLine", &status, 0xFFFFFF00u), std::vector<Entry>{});
    EXPECT_EQ(status, kNameControlNoTarget);

    // The host out of memory for a name: status 6 and the list as far as it got.
    wbhost::runtime::FailNthCall(wbhost::runtime::FailingCall::DSNewHandle, 2);
    EXPECT_EQ(List("", &status), (std::vector<Entry>{{"/DIO0", false}}));
    EXPECT_EQ(status, kNameControlNoMemory);

    // The target check: flagged only when there is no target to offer resources.
    WBHandle list = nullptr;
    ASSERT_EQ(names->CheckTarget(appRef, &list, &status), S_OK);
    EXPECT_EQ(TakeList(list), (std::vector<Entry>{{"FPGA I/O resources of this target", false}}));
    ASSERT_EQ(names->CheckTarget(0xFFFFFF00u, &list, &status), S_OK);
    EXPECT_EQ(TakeList(list), (std::vector<Entry>{{"FPGA I/O resources of this target", true}}));
    // Queries check the target and compare two controls' interfaces.
    status = -1;
    EXPECT_EQ(names->Query(1, appRef, nullptr, nullptr, &status), 0);
    EXPECT_EQ(status, 0);
    EXPECT_EQ(names->Query(1, 0xFFFFFF00u, nullptr, nullptr, &status), kNameControlNoTarget);
    EXPECT_EQ(status, kNameControlNoTarget);
    EXPECT_EQ(names->Query(3, 0xFFFFFF00u, nullptr, nullptr, &status), 0);
    EXPECT_EQ(status, 0);

    // Two controls: the second's interface lacks an entry the first requires.
    Variant input, output, first, second;
    SetText(first.v, "IOInterface", "<Line><Width>1</Width></Line>");
    SetText(second.v, "IOInterface", "<Line/>");
    ASSERT_EQ(WbVariantPStrSetWbVariantAttr(input.v, Name("userData1").get(), first.v), kWBNoErr);
    ASSERT_EQ(WbVariantPStrSetWbVariantAttr(input.v, Name("userData2").get(), second.v), kWBNoErr);
    ASSERT_EQ(names->Query(2, 0, input.v, output.v, &status), 0);
    uint32_t result = 9;
    ASSERT_EQ(WbVariantPStrGetUI32Attr(output.v, Name("result").get(), &result), kWBNoErr);
    EXPECT_EQ(result, 1u);
    ASSERT_EQ(WbVariantPStrSetWbVariantAttr(input.v, Name("userData2").get(), first.v), kWBNoErr);
    ASSERT_EQ(names->Query(2, 0, input.v, output.v, &status), 0);
    ASSERT_EQ(WbVariantPStrGetUI32Attr(output.v, Name("result").get(), &result), kWBNoErr);
    EXPECT_EQ(result, 0u);
}

TEST_F(NameControlTest, TheControlsProgramsRunUnlessTheControlHadAValue) {
    int32_t status = -1;
    EXPECT_EQ(names->Configure(42, &status), S_OK);
    EXPECT_EQ(status, 1);
    EXPECT_EQ(RunsOf("name-control-config"), 1u);
    session.Programs().SetAnswer("name-control-config", 4, int32_t{1});
    EXPECT_EQ(names->Configure(42, &status), E_FAIL);

    Variant data;
    WbNameControlEvent event{2, data.v, &status};
    EXPECT_EQ(names->OnSelect(&event), kNameControlNotHandled);
    EXPECT_EQ(status, kNameControlNotHandled);
    event.kind = 1;
    EXPECT_EQ(names->OnSelect(&event), S_OK);
    EXPECT_EQ(status, 0);
    EXPECT_EQ(RunsOf("name-control-on-select"), 1u);
    // A control that had a value is left alone.
    SetText(data.v, "oldValue", "/DIO0");
    EXPECT_EQ(names->OnSelect(&event), S_OK);
    EXPECT_EQ(status, 0);
    EXPECT_EQ(RunsOf("name-control-on-select"), 1u);
}

TEST_F(NameControlTest, OldControlDataIsUpgradedByTheHostsLibraryProgram) {
    using MutationFn = int32_t(void*, uint32_t, void*, int32_t);
    auto* mutate = Export<MutationFn>("IONameControlOnMutation");
    auto* getNames = Export<int32_t()>("GetIOControlNames");
    ASSERT_NE(mutate, nullptr);
    ASSERT_NE(getNames, nullptr);
    EXPECT_EQ(getNames(), 0);

    // Data saved by a newer host is current: nothing is opened.
    EXPECT_EQ(mutate(nullptr, 1234, nullptr, 0x10008001), 0);
    EXPECT_EQ(RunsOf("name-control-on-mutation"), 0u);
    // Older data goes through the library program with its value and version.
    EXPECT_EQ(mutate(nullptr, 1234, nullptr, 0x10008000), 1234);
    ASSERT_EQ(RunsOf("name-control-on-mutation"), 1u);
    const auto run = session.Programs().Runs().back();
    EXPECT_NE(run.path.find("/gxlib/rgx/tio/nameControl/qvFpgaIONameControlOnMutation.gx"),
              std::string::npos);
    EXPECT_EQ(std::get<int32_t>(run.inputs.at(5)), 0x10008000);
    session.Programs().SetAnswer("name-control-on-mutation", 4, int32_t{77});
    EXPECT_EQ(mutate(nullptr, 1, nullptr, -5), 77);
}

} // namespace
