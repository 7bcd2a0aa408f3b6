// Running the module's create-new wizard.
#include "session/NewItemWizard.h"

#include "com/TaskMem.h"
#include "framework/IqxBindable.h"
#include "framework/IqxCreateNewWizard.h"
#include "provider/TIOIdentifiers.h"

#include <variant>

namespace wbhost::session {

namespace {

using qv::com::ComPtr;

constexpr const char* kWizardBehaviour = "new-item-wizard";

// The display name of the first item type WIZARD describes for REQUEST; empty when none.
std::u16string Offered(IqxCreateNewWizard& wizard, const QxCreateNewRequest& request) {
    uint32_t count = 0;
    QxNewItemDescription* descriptions = nullptr;
    if (FAILED(wizard.GetNewItemDescriptions(&request, &count, &descriptions)))
        return {};
    std::u16string offered = count > 0 ? qv::com::BstrToString(descriptions[0].displayName) : u"";
    for (uint32_t i = 0; i < count; ++i)
        SysFreeString(descriptions[i].displayName);
    CoTaskMemFree(descriptions);
    return offered;
}

// Whether the last run of the wizard program answered "cancelled".
bool LastRunCancelled(const runner::ProgramSession& programs, size_t runsBefore) {
    const auto runs = programs.Runs();
    for (size_t i = runs.size(); i > runsBefore; --i) {
        if (runs[i - 1].behaviour != kWizardBehaviour)
            continue;
        const auto flag = runs[i - 1].outputs.find(0);
        const int32_t* value =
            flag == runs[i - 1].outputs.end() ? nullptr : std::get_if<int32_t>(&flag->second);
        return value != nullptr && *value != 0;
    }
    return false;
}

} // namespace

WizardOutcome RunNewItemWizard(HostSession& session, project::ProjectItem& parent) {
    WizardOutcome outcome;
    if (session.Provider() == nullptr || session.Project() == nullptr) {
        outcome.status = E_UNEXPECTED;
        return outcome;
    }
    ComPtr<IUnknown> object;
    outcome.status = session.Provider()->CreateItem(tio::kWizardType, nullptr, object.Put());
    const auto bindable = object.As<IqxBindable>();
    const auto wizard = object.As<IqxCreateNewWizard>();
    if (SUCCEEDED(outcome.status) && (!bindable || !wizard))
        outcome.status = E_NOINTERFACE;
    if (SUCCEEDED(outcome.status))
        outcome.status = bindable->Bind(&parent);
    if (FAILED(outcome.status))
        return outcome;
    QxCreateNewRequest request;
    request.parentItemId = parent.Id();
    outcome.offered = Offered(*wizard.Get(), request);
    const size_t runsBefore = session.Programs().Runs().size();
    outcome.status = wizard->Run(&request);
    outcome.cancelled = LastRunCancelled(session.Programs(), runsBefore);
    return outcome;
}

} // namespace wbhost::session
