// Escaping control characters on the way to the terminal.
#include "cli/ControlEscaper.h"

#include <cstdio>

namespace wbhost::cli {
namespace {

// Whether BYTE goes through as it is, with nothing to wait for.
bool Plain(char byte) {
    const auto value = static_cast<unsigned char>(byte);
    return (value >= 0x20 && value != 0x7F && value != 0xC2) || byte == '\n' || byte == '\t';
}

} // namespace

ControlEscaper::ControlEscaper(std::ostream& stream) : stream_(stream), target_(stream.rdbuf()) {
    stream_.rdbuf(this);
}

ControlEscaper::~ControlEscaper() {
    if (leadC2_)
        Put("\xC2", 1);
    stream_.rdbuf(target_);
    target_->pubsync();
}

bool ControlEscaper::Put(const char* text, std::streamsize count) {
    return target_->sputn(text, count) == count;
}

ControlEscaper::int_type ControlEscaper::overflow(int_type c) {
    if (traits_type::eq_int_type(c, traits_type::eof()))
        return traits_type::not_eof(c);
    const auto byte = static_cast<unsigned char>(traits_type::to_char_type(c));
    char escaped[8];
    if (leadC2_) {
        leadC2_ = false;
        if (byte >= 0x80 && byte <= 0x9F) {
            std::snprintf(escaped, sizeof escaped, "\\u%04X", byte);
            return Put(escaped, 6) ? c : traits_type::eof();
        }
        if (!Put("\xC2", 1))
            return traits_type::eof();
    }
    if (byte == 0xC2) {
        leadC2_ = true;
        return c;
    }
    if ((byte < 0x20 && byte != '\n' && byte != '\t') || byte == 0x7F) {
        std::snprintf(escaped, sizeof escaped, "\\x%02X", byte);
        return Put(escaped, 4) ? c : traits_type::eof();
    }
    const char plain = static_cast<char>(byte);
    return Put(&plain, 1) ? c : traits_type::eof();
}

std::streamsize ControlEscaper::xsputn(const char* text, std::streamsize count) {
    std::streamsize done = 0;
    while (done < count) {
        // Runs of plain bytes go out in one piece; the others one at a time.
        std::streamsize run = done;
        while (!leadC2_ && run < count && Plain(text[run]))
            ++run;
        if (run > done) {
            if (!Put(text + done, run - done))
                return done;
            done = run;
            continue;
        }
        if (traits_type::eq_int_type(overflow(traits_type::to_int_type(text[done])),
                                     traits_type::eof()))
            return done;
        ++done;
    }
    return count;
}

int ControlEscaper::sync() {
    // A lone 0xC2 waits for its next byte; what came before it is flushed.
    return target_->pubsync();
}

} // namespace wbhost::cli
