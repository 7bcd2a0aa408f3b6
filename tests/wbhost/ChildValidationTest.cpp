// Child validation through the module's provider, with the host's own objects: where items may
// be moved, and whether a target may be placed below an FPGA host, decided from the hosts its
// tree describes and the hosts its class supports.
#include "ProjectTestSupport.h"
#include "framework/IwbChildValidator.h"
#include "host/contracts/IwbChildPlacement.h"

#include <gtest/gtest.h>

using qv::com::ComPtr;

namespace {

constexpr GUID kRack = qv::com::ParseGuid("11111111-0000-4000-8000-000000000001");
constexpr GUID kDesk = qv::com::ParseGuid("22222222-0000-4000-8000-00000000000A");
constexpr GUID kAnyOs = qv::com::ParseGuid("33333333-0000-4000-8000-000000000003");
constexpr GUID kUnknown = qv::com::ParseGuid("44444444-0000-4000-8000-000000000004");
constexpr GUID kChassis = qv::com::ParseGuid("55555555-0000-4000-8000-000000000005");

// The hosts the project knows (the desk's GUID in small letters), and the class of this board
// with the hosts it works with: a Linux or Mac machine on PCIe, or a Windows one in slot 3.
constexpr const char* kBoard = R"(<Target>
  <TargetClass>Classes/K40</TargetClass>
  <Line name="DIO0"/>
  <FPGAHostSet>
    <FPGAHost name="Rack"><GUID>{11111111-0000-4000-8000-000000000001}</GUID>
      <OS>RT, Linux</OS><Bus>PCIe</Bus></FPGAHost>
    <FPGAHost name="Desk"><GUID>{22222222-0000-4000-8000-00000000000a}</GUID>
      <OS>Windows</OS><Bus>All</Bus></FPGAHost>
    <FPGAHost name="AnyOs"><GUID>{33333333-0000-4000-8000-000000000003}</GUID>
      <OS>All</OS><Bus>PCIe</Bus></FPGAHost>
  </FPGAHostSet>
  <Classes>
    <K40><SupportedFPGAHostList>
      <FPGAHost name="A"><OS>Linux,Mac</OS><Bus>PCIe</Bus></FPGAHost>
      <FPGAHost name="B"><OS>Windows</OS><Slot>3</Slot></FPGAHost>
    </SupportedFPGAHostList></K40>
  </Classes>
</Target>
)";

// The object of a host item that holds a sub-scope of children and lets targets in.
class HostSlotImpl : public IwbSubScopeContainer, public IwbTargetPlacementValidator {
public:
    using Interfaces = qv::com::InterfaceList<IwbSubScopeContainer, IwbTargetPlacementValidator>;
    virtual ~HostSlotImpl() = default;
    HRESULT AcceptsChildren() override { return S_OK; }
    HRESULT AllowsTargetType(const GUID&) override { return S_OK; }
};

class ChildValidationTest : public projecttest::ModuleProjectTest {
protected:
    void SetUp() override {
        Open(kBoard);
        validator = qv::com::QueryAs<IwbChildValidator>(session.Provider());
        ASSERT_TRUE(validator);
        chassis = Slot(Project().Root(), kChassis);
    }

    // A new item of TYPE below PARENT whose object is a host slot.
    ComPtr<ProjectItem> Slot(ProjectItem& parent, const GUID& type) {
        auto item = parent.AddChild(type, qv::kern::MakeGUID(), u"Slot");
        CQVComObject<HostSlotImpl>* made = nullptr;
        CQVComObject<HostSlotImpl>::CreateInstance(&made);
        item->SetObject(ComPtr<IUnknown>::Adopt(static_cast<IwbSubScopeContainer*>(made)));
        return item;
    }
    // How the provider answers placing the target below a host of type HOST.
    HRESULT Place(const GUID& host, int32_t* allowed) {
        return validator->CheckPlacement(Slot(*chassis.Get(), host).Get(), target->Object(),
                                         allowed);
    }

    ComPtr<ProjectItem> chassis;
    ComPtr<IwbChildValidator> validator;
};

TEST_F(ChildValidationTest, ATargetGoesBelowTheHostsItsClassSupports) {
    int32_t allowed = 7;
    EXPECT_EQ(Place(kRack, &allowed), S_FALSE);  // Linux on PCIe, as entry A asks
    EXPECT_EQ(Place(kAnyOs, &allowed), S_FALSE); // "All" never blocks an attribute
    // Found in any case of its GUID, but no entry matches: A wants Linux or Mac, B a slot the
    // desk does not name.
    EXPECT_EQ(Place(kDesk, &allowed), E_FAIL);
    EXPECT_EQ(allowed, 7); // only a parent that takes no children clears it
    // A host the project does not describe is not looked into.
    EXPECT_EQ(Place(kUnknown, &allowed), S_FALSE);

    // Below a parent whose own parent holds no sub-scope, nothing is placed.
    const auto loose = Slot(Project().Root(), kRack);
    EXPECT_EQ(validator->CheckPlacement(loose.Get(), target->Object(), &allowed), E_FAIL);
    EXPECT_EQ(allowed, 0);
}

TEST_F(ChildValidationTest, ItemsMoveOnlyWhereATargetTakesThem) {
    wbhost::project::Project& project = Project();
    ProjectItem* folder = AddFolder(u"F");
    // Folders pass the question up to their target, which takes items of every type.
    EXPECT_EQ(validator->ValidateChild(folder, tio::kIOItemType), S_OK);
    EXPECT_EQ(validator->CheckItem(folder), S_OK);
    // The project root has no resource tree above it: no place for a hardware item.
    EXPECT_EQ(validator->ValidateChild(&project.Root(), tio::kIOItemType), S_FALSE);
    EXPECT_EQ(validator->CheckItem(&project.Root()), S_FALSE);
    EXPECT_EQ(project.MoveItem(*folder, project.Root()), E_ACCESSDENIED);
    EXPECT_EQ(folder->Parent(), target.Get());
}

} // namespace
