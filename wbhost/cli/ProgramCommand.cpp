// The work behind `wbhost program`.
#include "cli/ProgramCommand.h"

#include "cli/Answers.h"
#include "cli/HostText.h"
#include "com/ComPtr.h"
#include "host/contracts/IwbProgram.h"
#include "host/contracts/IwbProgramRunner.h"
#include "host/contracts/IwbProgramRunnerService.h"
#include "project/HexStatus.h"

#include <filesystem>
#include <ostream>

namespace wbhost::cli {
namespace {

using qv::com::ComPtr;
namespace fs = std::filesystem;

HRESULT SetInput(IwbProgram& program, uint32_t index, const runner::ProgramValue& value) {
    if (const auto* number = std::get_if<int32_t>(&value))
        return program.SetInputInt32(index, *number);
    if (const auto* reference = std::get_if<runner::HostReference>(&value))
        return program.SetInputReference(index, reference->value);
    if (const auto* text = std::get_if<std::u16string>(&value))
        return program.SetInputString(index, text->c_str());
    const auto& list = std::get<std::vector<std::u16string>>(value);
    std::vector<const char16_t*> pointers;
    for (const std::u16string& item : list)
        pointers.push_back(item.c_str());
    return program.SetInputStringArray(index, pointers.data(),
                                       static_cast<uint32_t>(pointers.size()));
}

// The inputs INPUTS as terminals; false with the bad one on ERR.
bool ReadInputs(const std::vector<std::string>& inputs, runner::Terminals& terminals,
                std::ostream& err) {
    // Inputs are written as answers are ("index=value"); a session of their own reads them.
    runner::ProgramSession reader;
    for (const std::string& input : inputs) {
        if (!reader.SetAnswerFromText("input:" + input)) {
            err << "wbhost: input \"" << input
                << "\" is not index=value (a 32-bit number, text:... or list:a|b)\n";
            return false;
        }
    }
    terminals = reader.AnswersFor("input");
    return true;
}

} // namespace

std::string LocateProgram(const std::string& file, const std::string& modulePath) {
    if (fs::exists(file) || file.find('/') != std::string::npos)
        return file;
    const fs::path installed = fs::path(modulePath).parent_path() / "wbtio" / "private" / file;
    return fs::exists(installed) ? installed.string() : file;
}

int RunProgram(const HostOptions& options, const std::string& file,
               const std::vector<std::string>& inputs, std::ostream& out, std::ostream& err) {
    runner::Terminals terminals;
    if (!ReadInputs(inputs, terminals, err))
        return 1;
    session::HostSession session;
    if (!StartSession(options, session, err))
        return 1;
    ComPtr<IwbProgramRunnerService> service;
    ComPtr<IwbProgramRunner> runner;
    HRESULT status =
        session.RootObject()->QueryInterface(IwbProgramRunnerService::iid, service.PutVoid());
    if (SUCCEEDED(status))
        status = service->CreateInstance(wbproj::kProgramRunnerClass, IwbProgramRunner::iid,
                                         runner.PutVoid());
    if (FAILED(status)) {
        err << "wbhost: no program runner (status " << HexStatus(status) << ")\n";
        return 1;
    }
    const std::string path = LocateProgram(file, options.modulePath);
    ComPtr<IwbProgram> program;
    status = runner->OpenProgram(FromUtf8(path).c_str(), program.Put());
    if (FAILED(status)) {
        err << "wbhost: cannot open the program " << path << " (status " << HexStatus(status)
            << ")\n";
        return 1;
    }
    for (const auto& [index, value] : terminals) {
        if (status = SetInput(*program.Get(), index, value); FAILED(status)) {
            err << "wbhost: the program refuses input " << index << " (status " << HexStatus(status)
                << ")\n";
            return 1;
        }
    }
    if (status = program->Run(); FAILED(status)) {
        err << "wbhost: the program failed (status " << HexStatus(status) << ")\n";
        return 1;
    }
    const std::vector<runner::ProgramRun> runs = session.Programs().Runs();
    out << "ran " << fs::path(path).filename().string();
    if (!runs.empty()) {
        out << " (" << runs.back().behaviour << ")\noutputs:\n";
        for (const auto& [index, value] : runs.back().outputs)
            out << "  " << index << " = " << DescribeValue(value) << "\n";
    } else {
        out << "\n";
    }
    FinishSession(options, session, out);
    return 0;
}

} // namespace wbhost::cli
