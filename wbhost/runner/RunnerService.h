// The runner service of the framework's root object: creates program runners for the module.
#pragma once

#include "com/ComObject.h"
#include "com/ComPtr.h"
#include "host/contracts/IwbProgramRunnerService.h"
#include "runner/HostProgramRunner.h"

namespace wbhost::runner {

class RunnerServiceImpl : public IwbProgramRunnerService {
public:
    using Interfaces = qv::com::InterfaceList<IwbProgramRunnerService>;

    // A service whose runners share SESSION and FINDER (see HostProgramRunnerImpl).
    RunnerServiceImpl(std::shared_ptr<ProgramSession> session, ProjectItemFinder finder);
    virtual ~RunnerServiceImpl() = default;

    // Makes a runner for the runner class (asked for as IwbProgramRunner or IUnknown);
    // E_NOINTERFACE for other classes or interfaces, E_POINTER for a null slot.
    HRESULT CreateInstance(const CLSID& clsid, const IID& iid, void** object) override;
    // Lets the holder of a project answer item lookups from now on (null FINDER: none).
    void SetItemFinder(ProjectItemFinder finder);

private:
    std::shared_ptr<ProgramSession> session_;
    ProjectItemFinder finder_;
};
using RunnerService = CQVComObject<RunnerServiceImpl>;

// A new service over SESSION (a new session when null), without a project.
qv::com::ComPtr<RunnerService> NewRunnerService(std::shared_ptr<ProgramSession> session = nullptr);

} // namespace wbhost::runner
