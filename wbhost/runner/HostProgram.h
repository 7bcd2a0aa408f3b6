// An opened host program: the IwbProgram the runner hands out for a program file.
#pragma once

#include "com/ComObject.h"
#include "host/contracts/IwbProgram.h"
#include "runner/ProgramFile.h"
#include "runner/ProgramSession.h"

#include <memory>
#include <mutex>
#include <optional>

namespace wbhost::runner {

class HostProgramImpl : public IwbProgram {
public:
    using Interfaces = qv::com::InterfaceList<IwbProgram>;
    static constexpr uint32_t kTerminalCount = runner::kTerminalCount;

    // The program in the file at PATH, read as FILE, running in SESSION.
    HostProgramImpl(std::shared_ptr<ProgramSession> session, std::string path, ProgramFile file);
    virtual ~HostProgramImpl() = default;

    HRESULT GetOutputInt32(uint32_t index, int32_t* value) override;
    HRESULT GetOutputStatus(uint32_t index, int32_t* status) override;
    HRESULT GetOutputString(uint32_t index, BSTR* value) override;
    HRESULT GetOutputStringList(uint32_t index, BSTR** array, uint32_t* count) override;
    HRESULT SetInputReference(uint32_t index, uint64_t value) override;
    HRESULT SetInputInt32(uint32_t index, int32_t value) override;
    HRESULT SetInputString(uint32_t index, const char16_t* value) override;
    HRESULT SetInputStringArray(uint32_t index, const char16_t* const* array,
                                uint32_t count) override;
    // Runs the behaviour with the inputs set so far and records the run in the session.
    HRESULT Run() override;

private:
    HRESULT SetInput(uint32_t index, ProgramValue value);
    // The output INDEX of the last run; null before a run or when there is none.
    const ProgramValue* Output(uint32_t index) const;

    std::shared_ptr<ProgramSession> session_;
    const std::string path_;
    const ProgramFile file_;
    mutable std::mutex lock_;
    Terminals inputs_;
    std::optional<Terminals> outputs_;
};
using HostProgram = CQVComObject<HostProgramImpl>;

} // namespace wbhost::runner
