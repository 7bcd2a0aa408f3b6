// Answers for the dialog programs and the printed run log.
#include "cli/Answers.h"

#include "cli/HostText.h"
#include "project/AtomicFile.h"
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

} // namespace

bool AddAnswer(std::string_view text, runner::ProgramSession& session, std::string& error) {
    const size_t colon = text.find(':');
    const std::string behaviour(text.substr(0, colon));
    if (colon == std::string_view::npos || text.find('=', colon) == std::string_view::npos) {
        error = "answer \"" + std::string(text) + "\" is not of the form behaviour:index=value";
        return false;
    }
    if (!runner::IsKnownBehaviour(behaviour)) {
        error = "answer \"" + std::string(text) + "\": no program behaviour is called \"" +
                behaviour + "\"";
        return false;
    }
    if (!session.SetAnswerFromText(text)) {
        error = "answer \"" + std::string(text) +
                "\": the index must be a number and the value a 32-bit number, text:... or "
                "list:a|b";
        return false;
    }
    return true;
}

bool LoadAnswerFile(const std::string& path, runner::ProgramSession& session, std::string& error) {
    std::string content;
    if (std::filesystem::is_directory(path)) {
        error = "cannot read the answer file " + path + ": it is a folder";
        return false;
    }
    if (!project::ReadWholeFile(path, content, &error)) {
        error = "cannot read the answer file " + path + ": " + error;
        return false;
    }
    std::istringstream lines(content);
    std::string line;
    for (int number = 1; std::getline(lines, line); ++number) {
        const std::string_view text = Trim(line);
        if (text.empty() || text.front() == '#')
            continue;
        if (!AddAnswer(text, session, error)) {
            error = path + ": line " + std::to_string(number) + ": " + error;
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
        return;
    }
    for (const runner::ProgramRun& run : runs) {
        out << std::filesystem::path(run.path).filename().string() << " (" << run.behaviour
            << ")\n";
        PrintTerminals("inputs", run.inputs, out);
        PrintTerminals("outputs", run.outputs, out);
    }
}

} // namespace wbhost::cli
