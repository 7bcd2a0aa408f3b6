// The loader's "XMLParseErrors" texts as compilers and XML checkers print problems: one line
// each, "FILE:LINE:COLUMN: error: MESSAGE", which editors and scripts know how to follow.
#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace wbhost::cli {

// One problem the loader recorded.
struct ProblemLine {
    std::string file;    // the file the loader named, else the file that was loaded
    std::string line;    // the line and column, "LINE:COLUMN"; empty when the loader had none
    std::string message; // what went wrong, without the input around it
    std::string context; // the input around the position, as the loader quoted it
};

// The problems of one "XMLParseErrors" TEXT (UTF-8) of a load of FILE, oldest first.
std::vector<ProblemLine> SplitProblems(std::string_view text, const std::string& file);

// PROBLEM as one line (ending in a line feed); with CONTEXT, the input around it follows,
// each of its lines indented by four blanks.
std::string FormatProblem(const ProblemLine& problem, bool context);

} // namespace wbhost::cli
