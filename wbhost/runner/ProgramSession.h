// The session the host programs run in: the answers that stand in for a user in a
// non-interactive session, and the log of every run with its inputs.
#pragma once

#include "runner/RunnerLedger.h"

#include <cstdint>
#include <map>
#include <mutex>
#include <optional>
#include <string>
#include <string_view>
#include <variant>
#include <vector>

namespace wbhost::runner {

// Terminal indices a program may have (0 to 15).
inline constexpr uint32_t kTerminalCount = 16;

// A terminal value: a 32-bit value (also Booleans and statuses), a host reference, a text or a
// list of texts.
struct HostReference {
    uint64_t value = 0;
    bool operator==(const HostReference&) const = default;
};
using ProgramValue =
    std::variant<int32_t, HostReference, std::u16string, std::vector<std::u16string>>;
using Terminals = std::map<uint32_t, ProgramValue>;

// One run: which file, which behaviour, the inputs it was given and the outputs it left.
struct ProgramRun {
    std::string path;
    std::string behaviour;
    Terminals inputs;
    Terminals outputs;
};

class ProgramSession {
public:
    // Makes the next runs of BEHAVIOUR answer VALUE at output INDEX (kept until cleared).
    void SetAnswer(const std::string& behaviour, uint32_t index, ProgramValue value);
    // Reads an answer of the form "behaviour:index=value" (a list as "a|b|c" after "list:",
    // a text after "text:", else a 32-bit number), as the command line gives it. False, and
    // nothing set, when the text does not have that form or the index is no terminal's.
    bool SetAnswerFromText(std::string_view text);
    // Forgets every answer.
    void ClearAnswers();
    // The answers for BEHAVIOUR (empty when none were set).
    Terminals AnswersFor(const std::string& behaviour) const;

    // Appends RUN to the log.
    void Record(ProgramRun run);
    // The runs so far, oldest first.
    std::vector<ProgramRun> Runs() const;
    // The icon files asked for, in order (a host icon handle is its position + 1).
    uint64_t RecordIcon(std::u16string name);
    // The icon names asked for so far.
    std::vector<std::u16string> Icons() const;

    // The references the runners made and the failures they are made to give.
    RunnerLedger& Ledger() { return ledger_; }
    const RunnerLedger& Ledger() const { return ledger_; }

private:
    mutable std::mutex lock_;
    std::map<std::string, Terminals> answers_;
    std::vector<ProgramRun> runs_;
    std::vector<std::u16string> icons_;
    RunnerLedger ledger_;
};

} // namespace wbhost::runner
