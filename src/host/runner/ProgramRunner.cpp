// The runner path of host programs.
#include "host/runner/ProgramRunner.h"

#include "com/CallGuard.h"
#include "host/contracts/IwbProgramRunnerService.h"
#include "kern/Utf8.h"

#include <filesystem>
#include <string>

namespace qv::host::runner {

HRESULT GetProgramRunner(IUnknown* root, IwbProgramRunner** runner) {
    if (!root || !runner) {
        return E_POINTER;
    }
    *runner = nullptr;
    const auto service = qv::com::QueryAs<IwbProgramRunnerService>(root);
    if (!service) {
        return E_NOINTERFACE;
    }
    return service->CreateInstance(wbproj::kProgramRunnerClass, IwbProgramRunner::iid,
                                   reinterpret_cast<void**>(runner));
}

// S_OK when something exists at PATH, E_FAIL when nothing does.
static HRESULT CheckProgramFile(std::u16string_view path) {
    const std::string utf8 = qv::kern::WideToUtf8(std::u16string(path));
    std::error_code error;
    const bool found = !utf8.empty() && std::filesystem::exists(utf8, error);
    return found ? S_OK : E_FAIL;
}

HRESULT OpenHostProgram(IUnknown* root, std::u16string_view path, IwbProgram** program,
                        IwbProgramRunner** runner) {
    if (!root || !program || !runner) {
        return E_POINTER;
    }
    *program = nullptr;
    HRESULT hr = GetProgramRunner(root, runner);
    if (FAILED(hr)) {
        return hr;
    }
    hr = qv::com::GuardCall([&] { return CheckProgramFile(path); });
    if (FAILED(hr)) {
        return hr;
    }
    const std::u16string text(path); // the runner takes a zero-terminated text
    return (*runner)->OpenProgram(text.c_str(), program);
}

RunnerReference::RunnerReference(IwbProgramRunner* runner, IUnknown* object) {
    if (!runner || !object) {
        status_ = E_POINTER;
        return;
    }
    status_ = runner->MakeHostReference(object, &value_);
    if (SUCCEEDED(status_)) {
        runner_ = qv::com::ComPtr<IwbProgramRunner>::Share(runner);
    }
}

RunnerReference::~RunnerReference() {
    if (runner_) {
        runner_->ReleaseHostReference(value_);
    }
}

} // namespace qv::host::runner
