// The program session's answers and run log.
#include "runner/ProgramSession.h"

#include <charconv>
#include <unicode/ustring.h>

namespace wbhost::runner {

namespace {

// TEXT decoded as the terminal gives it (standard UTF-8, characters beyond the BMP included);
// nullopt when it is not well-formed UTF-8.
std::optional<std::u16string> DecodeUtf8(std::string_view text) {
    std::u16string wide(text.size(), u'\0');
    int32_t length = 0;
    UErrorCode status = U_ZERO_ERROR;
    u_strFromUTF8(wide.data(), static_cast<int32_t>(wide.size()), &length, text.data(),
                  static_cast<int32_t>(text.size()), &status);
    if (U_FAILURE(status)) {
        return std::nullopt;
    }
    wide.resize(static_cast<size_t>(length));
    return wide;
}

std::optional<ProgramValue> ParseValue(std::string_view text) {
    if (text.starts_with("text:")) {
        auto decoded = DecodeUtf8(text.substr(5));
        return decoded ? std::optional<ProgramValue>(std::move(*decoded)) : std::nullopt;
    }
    if (text.starts_with("list:")) {
        std::vector<std::u16string> items;
        text.remove_prefix(5);
        while (!text.empty()) {
            const size_t bar = text.find('|');
            auto item = DecodeUtf8(text.substr(0, bar));
            if (!item) {
                return std::nullopt;
            }
            items.push_back(std::move(*item));
            text = bar == std::string_view::npos ? std::string_view{} : text.substr(bar + 1);
        }
        return ProgramValue(std::move(items));
    }
    int32_t number = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
    if (error != std::errc() || end != text.data() + text.size() || text.empty()) {
        return std::nullopt;
    }
    return ProgramValue(number);
}

} // namespace

void ProgramSession::SetAnswer(const std::string& behaviour, uint32_t index, ProgramValue value) {
    const std::lock_guard hold(lock_);
    answers_[behaviour][index] = std::move(value);
}

bool ProgramSession::SetAnswerFromText(std::string_view text) {
    const size_t colon = text.find(':');
    const size_t equals = text.find('=');
    if (colon == std::string_view::npos || equals == std::string_view::npos || equals < colon ||
        colon == 0) {
        return false;
    }
    const std::string_view indexText = text.substr(colon + 1, equals - colon - 1);
    uint32_t index = 0;
    const auto [end, error] =
        std::from_chars(indexText.data(), indexText.data() + indexText.size(), index);
    if (error != std::errc() || end != indexText.data() + indexText.size() || indexText.empty() ||
        index >= kTerminalCount) {
        return false;
    }
    auto value = ParseValue(text.substr(equals + 1));
    if (!value) {
        return false;
    }
    SetAnswer(std::string(text.substr(0, colon)), index, std::move(*value));
    return true;
}

void ProgramSession::ClearAnswers() {
    const std::lock_guard hold(lock_);
    answers_.clear();
}

Terminals ProgramSession::AnswersFor(const std::string& behaviour) const {
    const std::lock_guard hold(lock_);
    const auto found = answers_.find(behaviour);
    return found == answers_.end() ? Terminals{} : found->second;
}

void ProgramSession::Record(ProgramRun run) {
    const std::lock_guard hold(lock_);
    runs_.push_back(std::move(run));
}

std::vector<ProgramRun> ProgramSession::Runs() const {
    const std::lock_guard hold(lock_);
    return runs_;
}

uint64_t ProgramSession::RecordIcon(std::u16string name) {
    const std::lock_guard hold(lock_);
    icons_.push_back(std::move(name));
    return icons_.size();
}

std::vector<std::u16string> ProgramSession::Icons() const {
    const std::lock_guard hold(lock_);
    return icons_;
}

} // namespace wbhost::runner
