// Keeps control characters that came from descriptions, projects or files from reaching the
// terminal: an ESC in an item's name or a loader message would otherwise be a terminal command.
#pragma once

#include <ostream>
#include <streambuf>

namespace wbhost::cli {

// While it lives, everything written to its stream passes through it: C0 controls other than
// line feed and tab, DEL and the C1 controls (U+0080 to U+009F in UTF-8) are written as
// "\xHH" (C1 as "\u0080" and so on); every other byte goes through unchanged.
class ControlEscaper : public std::streambuf {
public:
    explicit ControlEscaper(std::ostream& stream);
    ~ControlEscaper() override;
    ControlEscaper(const ControlEscaper&) = delete;
    ControlEscaper& operator=(const ControlEscaper&) = delete;

protected:
    int_type overflow(int_type c) override;
    std::streamsize xsputn(const char* text, std::streamsize count) override;
    int sync() override;

private:
    bool Put(const char* text, std::streamsize count);
    std::ostream& stream_;
    std::streambuf* const target_;
    bool leadC2_ = false; // the last byte was 0xC2, which may start a C1 control
};

} // namespace wbhost::cli
