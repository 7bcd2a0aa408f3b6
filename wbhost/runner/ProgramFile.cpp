// Reading host program files.
#include "runner/ProgramFile.h"

#include <filesystem>
#include <fstream>
#include <sstream>

namespace wbhost::runner {

namespace {

constexpr std::string_view kBlanks = " \t\r\n";
// Program files are a few lines; anything much larger is not one of ours.
constexpr std::uintmax_t kMaxProgramFileSize = 64 * 1024;

std::string_view Trim(std::string_view text) {
    const size_t first = text.find_first_not_of(kBlanks);
    if (first == std::string_view::npos) {
        return {};
    }
    const size_t last = text.find_last_not_of(kBlanks);
    return text.substr(first, last - first + 1);
}

} // namespace

std::optional<ProgramFile> ParseProgramFile(std::string_view text) {
    ProgramFile file;
    // Editors on other systems may start a UTF-8 text with a byte-order mark.
    if (text.starts_with("\xEF\xBB\xBF")) {
        text.remove_prefix(3);
    }
    while (!text.empty()) {
        const size_t end = text.find('\n');
        const std::string_view line = Trim(text.substr(0, end));
        text = end == std::string_view::npos ? std::string_view{} : text.substr(end + 1);
        if (line.empty() || line.front() == '#') {
            continue;
        }
        const size_t colon = line.find(':');
        if (colon == std::string_view::npos || Trim(line.substr(0, colon)).empty()) {
            return std::nullopt;
        }
        file.keys[std::string(Trim(line.substr(0, colon)))] =
            std::string(Trim(line.substr(colon + 1)));
    }
    const auto behaviour = file.keys.find("behaviour");
    if (behaviour == file.keys.end() || behaviour->second.empty()) {
        return std::nullopt;
    }
    file.behaviour = behaviour->second;
    return file;
}

std::optional<ProgramFile> LoadProgramFile(const std::string& path, bool* missing) {
    std::error_code error;
    const bool exists = !path.empty() && std::filesystem::exists(path, error);
    if (missing) {
        *missing = !exists;
    }
    if (!exists || !std::filesystem::is_regular_file(path, error) ||
        std::filesystem::file_size(path, error) > kMaxProgramFileSize || error) {
        return std::nullopt;
    }
    std::ifstream in(path, std::ios::binary);
    std::ostringstream text;
    text << in.rdbuf();
    if (!in) {
        return std::nullopt;
    }
    return ParseProgramFile(text.str());
}

} // namespace wbhost::runner
