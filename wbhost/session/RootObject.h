// The framework's root object: what a provider is given at its initialisation and asks for the
// host's services.
#pragma once

#include "com/ComObject.h"
#include "com/ComPtr.h"
#include "host/contracts/IwbProgramRunnerService.h"

namespace wbhost::session {

// Offers the program runner service as one of its own interfaces and hands its requests to the
// host's runner service, so the object keeps one identity however it is asked.
class RootObjectImpl : public IwbProgramRunnerService {
public:
    using Interfaces = qv::com::InterfaceList<IwbProgramRunnerService>;

    // A root object whose runner requests go to SERVICE (null: every request is E_UNEXPECTED).
    explicit RootObjectImpl(qv::com::ComPtr<IwbProgramRunnerService> service)
        : service_(std::move(service)) {}
    virtual ~RootObjectImpl() = default;

    // The runner service's answer for CLSID and IID (E_POINTER for a null slot).
    HRESULT CreateInstance(const CLSID& clsid, const IID& iid, void** object) override;

private:
    qv::com::ComPtr<IwbProgramRunnerService> service_;
};
using RootObject = CQVComObject<RootObjectImpl>;

} // namespace wbhost::session
