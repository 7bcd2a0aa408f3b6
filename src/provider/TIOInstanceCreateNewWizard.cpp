// The create-new wizard: binding to a target, running the wizard program and describing the
// items it offers.
#include "provider/TIOInstanceCreateNewWizard.h"

#include "attribute_bag/ItemResourceContext.h"
#include "host/StatusError.h"
#include "host/runner/ProgramRunner.h"
#include "items/TIOItemProperties.h"
#include "items/TIOProgramCall.h"
#include "provider/TIOIdentifiers.h"
#include "provider/TIOItemCreation.h"

#include <atomic>
#include <vector>

using qv::com::ComPtr;

namespace {

constexpr std::u16string_view kTypeNameEntry = u"TIOItemTypeName";
constexpr std::u16string_view kIconNameEntry = u"TIOItemIconName";
constexpr std::u16string_view kWizardProgram = u"TIONewInstanceWizard.gx";

// Wizard program terminals.
constexpr uint32_t kCancelled = 0; // out: the user cancelled
constexpr uint32_t kChoice = 1;    // in and out: the choice the wizard opens with
constexpr uint32_t kItemTexts = 3; // out: one attribute-set text per item
constexpr uint32_t kTarget = 11;   // in: the target the items go to

// Starts at 1 and follows every run, so the wizard reopens where the user left it.
std::atomic<uint32_t> wizardChoice{1};

// The text entry NAME of ROOT; FIELD is left as it was when the node does not hold it or the
// read fails.
void ReadEntry(const qv::host::ResourceNode& root, std::u16string_view name,
               std::u16string& field) {
    try {
        if (auto value = root.Attribute(name))
            field = std::move(*value);
    } catch (const std::exception&) {
    }
}

} // namespace

ComPtr<IUnknown> TIOInstanceCreateNewWizard::RootObject() const {
    try {
        return tio::ProviderRoot(Provider());
    } catch (const qv::host::StatusError&) {
        return {};
    }
}

HRESULT TIOInstanceCreateNewWizard::OnBind(IwbProjectItem* parent) {
    ItemResourceContext context;
    const HRESULT filled = context.Fill(parent);
    if (filled == S_OK) {
        qv::host::ResourceNode root;
        try {
            root = context.Root();
        } catch (const std::exception&) {
        }
        if (root) {
            ReadEntry(root, kTypeNameEntry, typeName_);
            ReadEntry(root, kIconNameEntry, iconName_);
        }
    }
    if (iconName_.empty())
        iconName_ = tio::kDefaultIcon;
    return filled;
}

HRESULT TIOInstanceCreateNewWizard::OnRun(const QxCreateNewRequest& request) {
    const ComPtr<IUnknown> root = RootObject();
    ComPtr<IwbProgramRunner> runner;
    if (FAILED(qv::host::runner::GetProgramRunner(root.Get(), runner.Put())) || !runner)
        return E_FAIL;
    ComPtr<IwbProjectItem> parent;
    if (const HRESULT hr = runner->FindProjectItem(request.parentItemId, parent.Put()); FAILED(hr))
        return hr;
    if (!parent)
        return E_FAIL;
    ItemResourceContext context;
    if (const HRESULT hr = context.Fill(parent.Get()); FAILED(hr))
        return hr;
    std::vector<std::u16string> texts;
    {
        // The program and the reference it was handed are let go before any item is created.
        tio::ProgramCall wizard(root.Get(), kWizardProgram);
        wizard.SetReference(kTarget, context.Owner());
        wizard.SetInt32(kChoice, static_cast<int32_t>(wizardChoice.load()));
        wizard.Run();
        texts = wizard.Strings(kItemTexts);
        wizardChoice.store(static_cast<uint32_t>(wizard.Int32(kChoice)));
        if (wizard.Boolean(kCancelled))
            return S_OK;
    }
    return tio::CreateItemsFromTexts({parent.Get(), texts}, context.OwnerObject());
}

HRESULT TIOInstanceCreateNewWizard::OnDescribe(std::vector<CqxNewItemDescription>& list,
                                               const QxCreateNewRequest&) {
    if (typeName_.empty()) {
        return S_OK;
    }
    uint64_t icon = 0;
    ComPtr<IwbProgramRunner> runner;
    if (SUCCEEDED(qv::host::runner::GetProgramRunner(RootObject().Get(), runner.Put())) && runner &&
        FAILED(runner->LoadIcon(iconName_.c_str(), &icon))) {
        icon = 0;
    }
    list.push_back(CqxNewItemDescription{tio::kIOItemType, -1, typeName_, icon});
    return S_OK;
}
