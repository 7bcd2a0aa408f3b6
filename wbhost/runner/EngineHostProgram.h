// A program file run through the engine function table (the way modules run the host's library
// programs): its terminals are 32-bit integers that the caller sets and reads in place, and its
// runs go to the program session like every other program's.
#pragma once

#include "runner/ProgramFile.h"
#include "runner/ProgramSession.h"
#include "runtime/EngineTable.h"

#include <array>
#include <memory>
#include <string>

namespace wbhost::runner {

class EngineHostProgram : public runtime::EngineProgram {
public:
    EngineHostProgram(std::shared_ptr<ProgramSession> session, std::string path, ProgramFile file);

    WBErr Prepare(int32_t* count, WBTerminal** terminals) override;
    WBErr Run() override;

private:
    std::shared_ptr<ProgramSession> session_;
    std::string path_;
    ProgramFile file_;
    std::array<int32_t, kTerminalCount> values_{};
    std::array<WBTerminal, kTerminalCount> terminals_{};
};

// The opener that SetEngineProgramOpener takes: program files run in SESSION.
runtime::EngineProgramOpener EngineProgramOpenerFor(std::shared_ptr<ProgramSession> session);

} // namespace wbhost::runner
