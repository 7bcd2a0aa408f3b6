// The loader's problem texts, one line each.
#include "cli/ProblemLines.h"

namespace wbhost::cli {
namespace {

constexpr std::string_view kLineHeader = "Error on line ";
constexpr std::string_view kNoPosition = "unable to parse line and/or column info";
constexpr std::string_view kOfFile = " of file ";
constexpr std::string_view kIndent = "   ";

bool StartsProblem(std::string_view line) {
    return line.starts_with(kLineHeader) || line.starts_with(kNoPosition);
}

// The lines of TEXT, without their line feeds.
std::vector<std::string_view> Lines(std::string_view text) {
    std::vector<std::string_view> lines;
    while (!text.empty()) {
        const size_t end = text.find('\n');
        lines.push_back(text.substr(0, end));
        text = end == std::string_view::npos ? std::string_view() : text.substr(end + 1);
    }
    return lines;
}

std::string_view Unindented(std::string_view line) {
    return line.starts_with(kIndent) ? line.substr(kIndent.size()) : line;
}

// The header "Error on line L at column C[ of file F]" into PROBLEM.
void ReadHeader(std::string_view header, ProblemLine& problem) {
    if (const size_t of = header.find(kOfFile); of != std::string_view::npos) {
        problem.file = std::string(header.substr(of + kOfFile.size()));
        header = header.substr(0, of);
    }
    if (!header.starts_with(kLineHeader))
        return;
    header.remove_prefix(kLineHeader.size());
    const size_t at = header.find(" at column ");
    if (at == std::string_view::npos)
        return;
    problem.line = std::string(header.substr(0, at)) + ":" +
                   std::string(header.substr(at + std::string_view(" at column ").size()));
}

} // namespace

std::vector<ProblemLine> SplitProblems(std::string_view text, const std::string& file) {
    std::vector<ProblemLine> problems;
    const std::vector<std::string_view> lines = Lines(text);
    for (size_t i = 0; i < lines.size(); ++i) {
        if (!StartsProblem(lines[i])) {
            // A line that starts no problem belongs to the quoted input of the one before.
            if (!problems.empty())
                problems.back().context += std::string(lines[i]) + "\n";
            continue;
        }
        ProblemLine problem{file, {}, {}, {}};
        ReadHeader(lines[i], problem);
        if (i + 1 < lines.size() && !StartsProblem(lines[i + 1]))
            problem.message = std::string(Unindented(lines[++i]));
        if (i + 1 < lines.size() && !StartsProblem(lines[i + 1]))
            problem.context = std::string(Unindented(lines[++i])) + "\n";
        problems.push_back(std::move(problem));
    }
    // The quoted input ends with the line feed that closes the message.
    for (ProblemLine& problem : problems) {
        while (problem.context.ends_with("\n\n"))
            problem.context.pop_back();
        problem.context.erase(0, problem.context.find_first_not_of('\n'));
        if (problem.context.find_first_not_of(" \t\n") == std::string::npos)
            problem.context.clear();
    }
    return problems;
}

std::string FormatProblem(const ProblemLine& problem, bool context) {
    std::string text = problem.file + ":" + (problem.line.empty() ? "" : problem.line + ":") +
                       " error: " + problem.message + "\n";
    if (!context)
        return text;
    for (const std::string_view line : Lines(problem.context))
        text += "    " + std::string(line) + "\n";
    return text;
}

} // namespace wbhost::cli
