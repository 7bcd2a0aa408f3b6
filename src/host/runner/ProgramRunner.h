// Running host programs (".gx" files) through the host program runner that the framework's
// root object provides.
#pragma once

#include "com/ComPtr.h"
#include "host/contracts/IwbProgram.h"
#include "host/contracts/IwbProgramRunner.h"

#include <cstdint>
#include <string_view>

namespace qv::host::runner {

// Creates the program runner through ROOT (the framework's root object kept by the provider):
// its runner service creates the runner class. E_POINTER for null arguments; the service's
// failure (E_NOINTERFACE when ROOT offers no service) otherwise.
HRESULT GetProgramRunner(IUnknown* root, IwbProgramRunner** runner);

// Opens the program at PATH: creates the runner into *RUNNER, checks that the file exists and
// opens it into *PROGRAM. E_POINTER for a null root or slot; E_FAIL, without asking the runner
// to open anything, when no file exists at PATH; E_OUTOFMEMORY when the check runs out of
// memory; otherwise the runner's status. The caller releases both slots (also on failure).
HRESULT OpenHostProgram(IUnknown* root, std::u16string_view path, IwbProgram** program,
                        IwbProgramRunner** runner);

// A host reference made by the runner for an object, released through the runner when the
// holder goes, on every path.
class RunnerReference {
public:
    RunnerReference() = default;
    // Makes a reference for OBJECT; status() tells whether it worked.
    RunnerReference(IwbProgramRunner* runner, IUnknown* object);
    ~RunnerReference();
    RunnerReference(const RunnerReference&) = delete;
    RunnerReference& operator=(const RunnerReference&) = delete;

    // The status of making the reference.
    HRESULT status() const { return status_; }
    // The reference to hand a program (0 when making it failed).
    uint64_t value() const { return value_; }

private:
    qv::com::ComPtr<IwbProgramRunner> runner_;
    uint64_t value_ = 0;
    HRESULT status_ = E_FAIL;
};

} // namespace qv::host::runner
