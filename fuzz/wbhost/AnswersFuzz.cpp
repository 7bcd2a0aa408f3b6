// Answers as the command line takes them: one "--answer" text, or an answer file of any bytes.
// A refused answer says why, and an accepted one is there for its behaviour afterwards.
#include "FuzzCheck.h"
#include "cli/Answers.h"

#include <cstdint>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <string>
#include <string_view>

namespace {

using wbt::fuzz::Check;

const std::string& AnswerFile() {
    static const std::string path = [] {
        std::string pattern =
            (std::filesystem::temp_directory_path() / "answers-fuzz-XXXXXX").string();
        if (mkdtemp(pattern.data()) == nullptr)
            std::abort();
        return pattern + "/answers.txt";
    }();
    return path;
}

} // namespace

// The first byte chooses a single answer text or an answer file; the rest is its content.
extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    if (size == 0)
        return 0;
    const std::string_view rest(reinterpret_cast<const char*>(data) + 1, size - 1);
    wbhost::runner::ProgramSession session;
    std::string error;
    if ((data[0] & 1) == 0) {
        const bool set = wbhost::cli::AddAnswer(rest, session, error);
        Check(set == error.empty());
        if (set) {
            const std::string behaviour(rest.substr(0, rest.find(':')));
            const auto answers = session.AnswersFor(behaviour);
            Check(answers.size() == 1);
            Check(!wbhost::cli::DescribeValue(answers.begin()->second).empty());
        }
        return 0;
    }
    std::ofstream(AnswerFile(), std::ios::binary | std::ios::trunc) << rest;
    const bool loaded = wbhost::cli::LoadAnswerFile(AnswerFile(), session, error);
    Check(loaded == error.empty());
    // A bad line is named by its number, never quoted: the file may be any file of the machine.
    Check(loaded || error.rfind(AnswerFile() + ": line ", 0) == 0);
    return 0;
}
