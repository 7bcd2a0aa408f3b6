// The host program runner: opens program files, makes host references for objects, finds
// project items and loads icons for the module.
#pragma once

#include "com/ComObject.h"
#include "host/contracts/IwbProgramRunner.h"
#include "runner/ProgramSession.h"

#include <functional>
#include <memory>

namespace wbhost::runner {

// Finds the project item with an identifier: S_OK and the item (with a reference), or 1 and
// null when there is none. Set by whoever holds the project.
using ProjectItemFinder = std::function<HRESULT(const GUID& id, IwbProjectItem** item)>;

class HostProgramRunnerImpl : public IwbProgramRunner {
public:
    using Interfaces = qv::com::InterfaceList<IwbProgramRunner>;

    // A runner whose programs run in SESSION and whose item lookups go to FINDER (none: no
    // project, every lookup answers 1).
    HostProgramRunnerImpl(std::shared_ptr<ProgramSession> session, ProjectItemFinder finder);
    virtual ~HostProgramRunnerImpl() = default;

    // A refnum of the host's refnum table; E_POINTER for a null object or slot, E_OUTOFMEMORY
    // when the table has no number left.
    HRESULT MakeHostReference(IUnknown* object, uint64_t* reference) override;
    HRESULT FindProjectItem(const GUID& id, IwbProjectItem** item) override;
    // E_POINTER for a null path or slot; HRESULT_FROM_WIN32(ERROR_FILE_NOT_FOUND) when nothing
    // is at PATH; E_FAIL for a file that is not a program of a behaviour this host has.
    HRESULT OpenProgram(const char16_t* path, IwbProgram** program) override;
    HRESULT ReleaseHostReference(uint64_t reference) override;
    // Records NAME in the session and answers its icon handle; E_POINTER for a null name or slot.
    HRESULT LoadIcon(const char16_t* name, uint64_t* icon) override;

private:
    std::shared_ptr<ProgramSession> session_;
    ProjectItemFinder finder_;
};
using HostProgramRunner = CQVComObject<HostProgramRunnerImpl>;

} // namespace wbhost::runner
