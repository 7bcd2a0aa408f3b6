// Program files run through the engine function table.
#include "runner/EngineHostProgram.h"

#include "runner/Behaviours.h"

namespace wbhost::runner {
namespace {

// Every terminal is a signed 32-bit integer (byte 1 of a descriptor is its type code).
constexpr std::array<uint8_t, 2> kInt32Type{0, kWBTypeI32};

} // namespace

EngineHostProgram::EngineHostProgram(std::shared_ptr<ProgramSession> session, std::string path,
                                     ProgramFile file)
    : session_(std::move(session)), path_(std::move(path)), file_(std::move(file)) {
    for (size_t i = 0; i < terminals_.size(); ++i)
        terminals_[i] = WBTerminal{&values_[i], 0, 0, kInt32Type.data()};
}

WBErr EngineHostProgram::Prepare(int32_t* count, WBTerminal** terminals) {
    *count = static_cast<int32_t>(terminals_.size());
    *terminals = terminals_.data();
    return kWBNoErr;
}

WBErr EngineHostProgram::Run() {
    Terminals inputs;
    for (uint32_t i = 0; i < kTerminalCount; ++i)
        inputs[i] = values_[i];
    const auto outputs =
        RunBehaviour(file_.behaviour, inputs, session_->AnswersFor(file_.behaviour));
    if (!outputs)
        return kWBGenericErr;
    for (const auto& [index, value] : *outputs) {
        if (const int32_t* number = std::get_if<int32_t>(&value); number && index < kTerminalCount)
            values_[index] = *number;
    }
    session_->Record({path_, file_.behaviour, std::move(inputs), *outputs});
    return kWBNoErr;
}

runtime::EngineProgramOpener EngineProgramOpenerFor(std::shared_ptr<ProgramSession> session) {
    return [session](const std::string& path, std::unique_ptr<runtime::EngineProgram>& program) {
        bool missing = false;
        std::optional<ProgramFile> file = LoadProgramFile(path, &missing);
        if (!file)
            return missing ? kWBFileNotFound : kWBGenericErr;
        if (!IsKnownBehaviour(file->behaviour))
            return kWBGenericErr;
        program = std::make_unique<EngineHostProgram>(session, path, std::move(*file));
        return kWBNoErr;
    };
}

} // namespace wbhost::runner
