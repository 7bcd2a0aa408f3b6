// The runner service.
#include "runner/RunnerService.h"

#include "com/CallGuard.h"

namespace wbhost::runner {

RunnerServiceImpl::RunnerServiceImpl(std::shared_ptr<ProgramSession> session,
                                     ProjectItemFinder finder)
    : session_(std::move(session)), finder_(std::move(finder)) {}

HRESULT RunnerServiceImpl::CreateInstance(const CLSID& clsid, const IID& iid, void** object) {
    if (!object) {
        return E_POINTER;
    }
    *object = nullptr;
    if (clsid != wbproj::kProgramRunnerClass) {
        return E_NOINTERFACE;
    }
    return qv::com::GuardCall([&] {
        HostProgramRunner* made = nullptr;
        HRESULT hr = HostProgramRunner::CreateInstance(&made, session_, finder_);
        if (FAILED(hr)) {
            return hr;
        }
        hr = made->QueryInterface(iid, object);
        made->Release();
        return hr;
    });
}

void RunnerServiceImpl::SetItemFinder(ProjectItemFinder finder) {
    finder_ = std::move(finder);
}

qv::com::ComPtr<RunnerService> NewRunnerService(std::shared_ptr<ProgramSession> session) {
    if (!session) {
        session = std::make_shared<ProgramSession>();
    }
    RunnerService* made = nullptr;
    RunnerService::CreateInstance(&made, std::move(session), ProjectItemFinder{});
    return qv::com::ComPtr<RunnerService>::Adopt(made);
}

} // namespace wbhost::runner
