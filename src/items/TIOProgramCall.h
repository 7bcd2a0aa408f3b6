// One run of a program the module ships ("wbtio/private" beside the module) through the host's
// program runner: inputs set by terminal index, host references made for project objects and
// closed again on every path, outputs read after the run.
#pragma once

#include "com/ComPtr.h"
#include "host/contracts/IwbProgram.h"
#include "host/contracts/IwbProgramRunner.h"
#include "host/runner/ProgramRunner.h"

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

struct IqxProvider;

namespace tio {

// The path of FILE in the module's program folder: the module's folder joined with "wbtio",
// "private" and FILE. Throws StatusError(E_FAIL) when the module's folder cannot be found.
std::u16string ProgramPath(std::u16string_view file);

// The framework's root object that PROVIDER was initialised with. Throws StatusError: E_UNEXPECTED
// without a provider (or one that keeps no root), its own failure otherwise.
qv::com::ComPtr<IUnknown> ProviderRoot(IqxProvider* provider);

// Every step throws StatusError with the failing status; whatever was obtained is released when
// the call goes, references first, whichever path it takes.
class ProgramCall {
public:
    // Opens FILE of the program folder through the runner that ROOT's runner service makes.
    ProgramCall(IUnknown* root, std::u16string_view file);
    ~ProgramCall();
    ProgramCall(const ProgramCall&) = delete;
    ProgramCall& operator=(const ProgramCall&) = delete;

    // Makes a host reference for OBJECT (kept until the call goes) and sets input INDEX to it.
    void SetReference(uint32_t index, IUnknown* object);
    void SetString(uint32_t index, std::u16string_view text);
    void SetStrings(uint32_t index, const std::vector<std::u16string>& texts);
    void SetInt32(uint32_t index, int32_t value);
    void Run();

    int32_t Int32(uint32_t index);
    // A Boolean output: true when the 32-bit value is not zero.
    bool Boolean(uint32_t index) { return Int32(index) != 0; }
    std::u16string String(uint32_t index);
    std::vector<std::u16string> Strings(uint32_t index);

private:
    qv::com::ComPtr<IwbProgramRunner> runner_;
    qv::com::ComPtr<IwbProgram> program_;
    std::vector<std::unique_ptr<qv::host::runner::RunnerReference>> references_;
};

} // namespace tio
