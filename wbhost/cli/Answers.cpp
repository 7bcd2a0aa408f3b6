// Answers for the dialog programs and the printed run log.
#include "cli/Answers.h"

#include "cli/HostText.h"
#include "project/AtomicFile.h"
#include "resources/InputFile.h"
#include "runner/Behaviours.h"

#include <filesystem>
#include <ostream>
#include <sstream>

namespace wbhost::cli {
namespace {

std::string_view Trim(std::string_view text) {
    const size_t first = text.find_first_not_of(" \t\r");
    if (first == std::string_view::npos)
        return {};
    const size_t last = text.find_last_not_of(" \t\r");
    return text.substr(first, last - first + 1);
}

std::string Quoted(std::u16string_view text) {
    std::string quoted = "\"";
    for (const char c : ToUtf8(text)) {
        if (c == '"' || c == '\\')
            quoted += '\\';
        if (c == '\n') {
            quoted += "\\n";
            continue;
        }
        quoted += c;
    }
    return quoted + "\"";
}

void PrintTerminals(const char* label, const runner::Terminals& terminals, std::ostream& out) {
    out << "  " << label << ":";
    if (terminals.empty())
        out << " none";
    out << "\n";
    for (const auto& [index, value] : terminals)
        out << "    " << index << " = " << DescribeValue(value) << "\n";
}

// Why the answer TEXT cannot be set in SESSION; empty once it is set. The reason never repeats
// the text: an answer file's lines may come from any file the user named.
std::string SetAnswer(std::string_view text, runner::ProgramSession& session) {
    const size_t colon = text.find(':');
    if (colon == std::string_view::npos || text.find('=', colon) == std::string_view::npos)
        return "not of the form behaviour:index=value";
    if (!runner::IsKnownBehaviour(std::string(text.substr(0, colon))))
        return "no program behaviour has that name";
    if (!session.SetAnswerFromText(text))
        return "the index must be a terminal number (0 to 15) and the value a 32-bit number, "
               "text:... or list:a|b in UTF-8";
    return {};
}

} // namespace

bool AddAnswer(std::string_view text, runner::ProgramSession& session, std::string& error) {
    const std::string why = SetAnswer(text, session);
    if (why.empty())
        return true;
    error = "answer \"" + std::string(text) + "\": " + why;
    return false;
}

bool LoadAnswerFile(const std::string& path, runner::ProgramSession& session, std::string& error) {
    std::string content;
    if (!project::ReadWholeFile(path, content, &error)) {
        error = "cannot read the answer file " + error;
        return false;
    }
    std::istringstream lines{std::string(resources::WithoutByteOrderMark(content))};
    std::string line;
    for (int number = 1; std::getline(lines, line); ++number) {
        const std::string_view text = Trim(line);
        if (text.empty() || text.front() == '#')
            continue;
        if (const std::string why = SetAnswer(text, session); !why.empty()) {
            error = path + ": line " + std::to_string(number) + ": " + why;
            return false;
        }
    }
    return true;
}

bool ApplyAnswers(const std::vector<std::string>& files, const std::vector<std::string>& texts,
                  runner::ProgramSession& session, std::string& error) {
    for (const std::string& file : files) {
        if (!LoadAnswerFile(file, session, error))
            return false;
    }
    for (const std::string& text : texts) {
        if (!AddAnswer(text, session, error))
            return false;
    }
    return true;
}

std::string DescribeValue(const runner::ProgramValue& value) {
    if (const auto* number = std::get_if<int32_t>(&value))
        return std::to_string(*number);
    if (const auto* reference = std::get_if<runner::HostReference>(&value))
        return "ref " + std::to_string(reference->value);
    if (const auto* text = std::get_if<std::u16string>(&value))
        return Quoted(*text);
    std::string list = "[";
    for (const std::u16string& item : std::get<std::vector<std::u16string>>(value)) {
        if (list.size() > 1)
            list += ", ";
        list += Quoted(item);
    }
    return list + "]";
}

void PrintRuns(const runner::ProgramSession& session, std::ostream& out) {
    const std::vector<runner::ProgramRun> runs = session.Runs();
    if (runs.empty()) {
        out << "no programs ran\n";
    }
    for (const runner::ProgramRun& run : runs) {
        out << std::filesystem::path(run.path).filename().string() << " (" << run.behaviour
            << ")\n";
        PrintTerminals("inputs", run.inputs, out);
        PrintTerminals("outputs", run.outputs, out);
    }
    // A reference left open would keep a project object alive behind the project's back.
    const auto references = session.Ledger().Counts();
    out << "host references: " << references.made << " made, " << references.open
        << " still open\n";
}

} // namespace wbhost::cli
