// Answers for the dialog programs of a non-interactive session, as the command line gives them:
// repeated "--answer behaviour:index=value" texts and answer files with one such text a line.
#pragma once

#include "runner/ProgramSession.h"

#include <iosfwd>
#include <string>
#include <string_view>
#include <vector>

namespace wbhost::cli {

// Sets the answer TEXT ("behaviour:index=value"; a value is a 32-bit number, "text:..." or
// "list:a|b|c") in SESSION. False with a message in ERROR when the text is malformed or names a
// behaviour this host does not have (a misspelt behaviour would otherwise be ignored silently).
bool AddAnswer(std::string_view text, runner::ProgramSession& session, std::string& error);

// Reads the answer file PATH into SESSION: one answer a line, blank lines and lines starting
// with '#' skipped, surrounding blanks and a trailing carriage return ignored. False with
// "PATH: line N: reason" in ERROR at the first bad line; answers of earlier lines stay set.
bool LoadAnswerFile(const std::string& path, runner::ProgramSession& session, std::string& error);

// Applies the files FILES, then the single answers TEXTS (so a command-line answer overrides a
// file's). False with the first problem in ERROR.
bool ApplyAnswers(const std::vector<std::string>& files, const std::vector<std::string>& texts,
                  runner::ProgramSession& session, std::string& error);

// Writes every recorded run of SESSION to OUT, one block per run: the program's file name and
// behaviour, then its inputs and outputs by terminal index ("no programs ran" when none did),
// then how many host references the runners made and how many are still open.
void PrintRuns(const runner::ProgramSession& session, std::ostream& out);

// The text of VALUE as the run log shows it: numbers as they are, texts quoted, lists in
// brackets, references as "ref N".
std::string DescribeValue(const runner::ProgramValue& value);

} // namespace wbhost::cli
