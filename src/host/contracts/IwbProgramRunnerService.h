// The service of the framework's root object that creates the host program runner.
#pragma once

#include "com/IUnknown.h"

namespace wbproj {
// Class and interface identifier with which the runner is created from the service.
inline constexpr CLSID kProgramRunnerClass =
    qv::com::ParseGuid("6D596886-022C-4D3A-A995-F9C7E9D8468D");
} // namespace wbproj

struct IwbProgramRunnerService : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("132C798C-C2A7-4845-BB55-CE3A764C141E");

    // Creates an object of class CLSID and answers its interface IID in OBJECT (with a
    // reference); E_NOINTERFACE for a class the service does not make.
    virtual HRESULT CreateInstance(const CLSID& clsid, const IID& iid, void** object) = 0;
};
