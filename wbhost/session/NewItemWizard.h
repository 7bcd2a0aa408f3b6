// Adding items as the project tree does: through the create-new wizard of the module's provider.
#pragma once

#include "project/ProjectItem.h"
#include "session/HostSession.h"

#include <string>

namespace wbhost::session {

// What a wizard run came to.
struct WizardOutcome {
    HRESULT status = S_OK;  // the wizard's answer (or why it could not run)
    std::u16string offered; // the item type it described for the parent ("" when none)
    bool cancelled = false; // the wizard program answered "cancelled"
};

// Asks SESSION's provider for its create-new wizard, binds it to PARENT (a target or a folder
// of one), asks what it offers there and runs it for PARENT: the wizard program's answer says
// which items the module creates. E_UNEXPECTED without provider or project; the provider's or
// the wizard's failure otherwise.
WizardOutcome RunNewItemWizard(HostSession& session, project::ProjectItem& parent);

} // namespace wbhost::session
