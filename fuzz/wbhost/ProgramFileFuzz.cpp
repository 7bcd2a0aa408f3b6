// The host's program-file (".gx") reader on arbitrary text: a file it accepts names a behaviour,
// which is also among its keys, and every key and value is trimmed.
#include "FuzzCheck.h"
#include "runner/ProgramFile.h"

#include <cstdint>
#include <cstdlib>
#include <string_view>

namespace {

using wbt::fuzz::Check;

bool Trimmed(std::string_view text) {
    const auto blank = [](char c) { return c == ' ' || c == '\t' || c == '\r'; };
    return text.empty() || (!blank(text.front()) && !blank(text.back()));
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    const std::string_view text(reinterpret_cast<const char*>(data), size);
    const auto file = wbhost::runner::ParseProgramFile(text);
    if (!file)
        return 0;
    Check(!file->behaviour.empty());
    Check(file->keys.at("behaviour") == file->behaviour);
    for (const auto& [key, value] : file->keys) {
        Check(!key.empty() && Trimmed(key) && Trimmed(value));
        Check(key.find('\n') == std::string::npos && value.find('\n') == std::string::npos);
    }
    return 0;
}
