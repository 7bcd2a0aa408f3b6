// A host program file (".gx"): a short text naming the host behaviour the program stands for.
//
//   # comment lines start with '#'
//   behaviour: unique-name
//   title: Unique name
//
// Lines are "key: value"; keys compare exactly, values are trimmed. Only "behaviour" is
// required; other keys are kept for whoever reads the file (the run log names the file itself).
#pragma once

#include <map>
#include <optional>
#include <string>
#include <string_view>

namespace wbhost::runner {

struct ProgramFile {
    std::string behaviour;                   // the host behaviour the program stands for
    std::map<std::string, std::string> keys; // every key of the file, "behaviour" included
};

// Reads program TEXT; nullopt when it names no behaviour or a line is not "key: value".
std::optional<ProgramFile> ParseProgramFile(std::string_view text);

// Reads the program file at PATH (UTF-8 file-system path); nullopt when it cannot be read or
// parsed. *MISSING tells whether nothing exists at PATH (MISSING may be null).
std::optional<ProgramFile> LoadProgramFile(const std::string& path, bool* missing = nullptr);

} // namespace wbhost::runner
