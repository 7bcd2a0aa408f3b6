// The I/O name control's operations.
#include "provider/TIONameControl.h"

#include "com/BstrArray.h"
#include "com/CallGuard.h"
#include "com/ComPtr.h"
#include "com/TaskMem.h"
#include "host/HostVariant.h"
#include "host/binding/HostFunctions.h"
#include "host/contracts/IwbProjectItem.h"
#include "host/contracts/IwbhwTargetResources.h"
#include "host/runner/ProgramRunner.h"
#include "items/TIOProgramCall.h"
#include "items/TIOStrings.h"
#include "kern/CodePage.h"
#include "provider/TIONameList.h"
#include "resource_tree/ResourceCompare.h"

#include <string>

namespace tio::namecontrol {
namespace {

using qv::com::ComPtr;

constexpr std::u16string_view kCategory = u"FPGA IO";
constexpr std::u16string_view kProtocolFilter = u"include_protocols=IOResource,exclude_protocols=";
constexpr std::u16string_view kConfigProgram = u"TIOIONameControlConfigDialog.gx";
constexpr std::u16string_view kOnSelectProgram = u"TIOIONameControlOnSelect.gx";
constexpr uint32_t kValueInput = 0;
constexpr uint32_t kFailureOutput = 4;
constexpr int32_t kSelected = 1;

// The resource interface of the target behind APPREF; empty when the host names no target or
// the target's object offers none.
ComPtr<IwbhwTargetResources> TargetResources(WBRefNum appRef) {
    ComPtr<IwbProjectItem> target;
    if (qv::host::rt::TargetItemFromAppRef(appRef, target.PutVoid()) != kWBNoErr || !target)
        return {};
    ComPtr<IUnknown> object;
    if (FAILED(target->GetObject(object.Put())) || !object)
        return {};
    return qv::com::QueryAs<IwbhwTargetResources>(object.Get());
}

// The I/O interface a control's data names (its "tdData" variant's "IOInterface"); empty when
// it names none. The whole text is read: an interface may be a resource description, and a
// cut one would select other resources.
std::u16string InterfaceOf(WBVariant data, std::string_view holder) {
    qv::host::OwnedVariant held;
    if (!qv::host::VariantAttribute(data, holder, held))
        return {};
    const auto text = qv::host::VariantStringAttribute(held.get(), "IOInterface");
    return text ? qv::kern::AnsiToWide(*text) : std::u16string();
}

// Runs the program FILE of the module's program folder with VALUE (the control's value as the
// host handed it) as its input and answers S_OK when it reports no failure on its output.
HRESULT RunProgram(IUnknown* root, std::u16string_view file, uint64_t value) {
    const std::u16string path = ProgramPath(file); // E_FAIL when the module's folder is unknown
    ComPtr<IwbProgram> program;
    ComPtr<IwbProgramRunner> runner;
    HRESULT hr = qv::host::runner::OpenHostProgram(root, path, program.Put(), runner.Put());
    if (FAILED(hr))
        return hr;
    if (FAILED(hr = program->SetInputReference(kValueInput, value)) || FAILED(hr = program->Run()))
        return hr;
    int32_t failed = 0;
    if (FAILED(hr = program->GetOutputInt32(kFailureOutput, &failed)))
        return hr;
    return failed == 0 ? S_OK : E_FAIL;
}

} // namespace

HRESULT ListCategories(uint32_t* count, BSTR** categories) {
    if (count == nullptr || categories == nullptr)
        return E_POINTER;
    *count = 0;
    *categories = nullptr;
    qv::com::UniqueBstr category(qv::com::AllocBstr(kCategory));
    if (!category)
        return E_OUTOFMEMORY;
    const HRESULT hr = qv::com::CopyToTaskMem(std::vector<BSTR>{category.get()}, categories, count);
    if (SUCCEEDED(hr))
        (void)category.release(); // the caller's array owns it now
    return hr;
}

HRESULT ListNames(WBRefNum appRef, WBVariant data, uint32_t* count, BSTR** names,
                  WBHandle* nameList, int32_t* status) {
    if (count == nullptr || names == nullptr || nameList == nullptr || status == nullptr)
        return E_POINTER;
    *count = 0;
    *names = nullptr;
    *status = kNameControlOK;
    return qv::com::GuardCall([&]() -> HRESULT {
        const ComPtr<IwbhwTargetResources> resources = TargetResources(appRef);
        if (!resources) {
            *status = kNameControlNoTarget;
            return kNameControlNoTarget;
        }
        const std::u16string ioInterface = InterfaceOf(data, "tdData");
        qv::com::BstrArray found;
        const HRESULT hr = resources->ListResourceNames(ioInterface.c_str(), kProtocolFilter.data(),
                                                        found.PutTexts(), found.PutCount());
        if (FAILED(hr))
            return hr;
        NameList list(nameList, found.Count() > 0 ? found.Count() : 1, status);
        for (const std::u16string& name : found.Texts())
            list.Append(name, false);
        if (list.Count() == 0)
            list.Append(ModuleString(kStrNoResourcesEntry), true);
        return S_OK;
    });
}

HRESULT CheckTarget(WBRefNum appRef, WBHandle* nameList, int32_t* status) {
    if (nameList == nullptr || status == nullptr)
        return E_POINTER;
    *status = kNameControlOK;
    return qv::com::GuardCall([&]() -> HRESULT {
        NameList list(nameList, 1, status);
        const bool offered = static_cast<bool>(TargetResources(appRef));
        list.Append(ModuleString(kStrCheckTargetEntry), !offered);
        return S_OK;
    });
}

HRESULT Configure(IUnknown* root, uint64_t value, int32_t* status) {
    if (status != nullptr)
        *status = 1;
    return qv::com::GuardCall([&] { return RunProgram(root, kConfigProgram, value); });
}

HRESULT Query(uint32_t mode, WBRefNum appRef, WBVariant input, WBVariant output, int32_t* status) {
    if (status == nullptr)
        return E_POINTER;
    *status = kNameControlOK;
    return qv::com::GuardCall([&]() -> HRESULT {
        if (mode == 1) {
            *status = TargetResources(appRef) ? kNameControlOK : kNameControlNoTarget;
            return *status;
        }
        if (mode != 2)
            return S_OK;
        const std::string first = qv::kern::WideToAnsi(InterfaceOf(input, "userData1"));
        const std::string second = qv::kern::WideToAnsi(InterfaceOf(input, "userData2"));
        const uint32_t answer = wbhw::CompareResourceTexts(first, second);
        if (qv::host::rt::WbVariantPStrSetUI32Attr(output, qv::host::PascalName("result").get(),
                                                   answer) != kWBNoErr)
            return E_FAIL;
        return *status;
    });
}

HRESULT OnSelect(IUnknown* root, WbNameControlEvent* event) {
    if (event == nullptr || event->status == nullptr)
        return E_POINTER;
    if (event->kind != kSelected) {
        *event->status = kNameControlNotHandled;
        return kNameControlNotHandled;
    }
    *event->status = kNameControlOK;
    return qv::com::GuardCall([&]() -> HRESULT {
        // A control that already had a value keeps it: selecting is only for a new control.
        if (qv::host::VariantStringAttribute(event->data, "oldValue"))
            return S_OK;
        return RunProgram(root, kOnSelectProgram, reinterpret_cast<uintptr_t>(event->data));
    });
}

} // namespace tio::namecontrol
