// What `wbhost compare` prints.
#include "cli/CompareReport.h"

#include "cli/ExitStatus.h"
#include "cli/HostText.h"

#include <ostream>
#include <string>

namespace wbhost::cli {
namespace {

using wbhw::CompareFinding;
using wbhw::CompareReason;

// TEXT between double quotes, a quote or backslash inside it escaped, so that where a text
// ends (and that it is empty) shows.
std::string Quoted(std::u16string_view text) {
    std::string quoted = "\"";
    for (const char c : ToUtf8(text)) {
        if (c == '"' || c == '\\')
            quoted += '\\';
        quoted += c;
    }
    return quoted + "\"";
}

// Which texts of a finding say something: both for a difference of texts; the one that exists
// for an entry one side lacks or holds as another kind.
struct Shown {
    bool required;
    bool offered;
};

Shown TextsOf(const CompareFinding& finding) {
    switch (finding.reason) {
    case CompareReason::Missing:
        return {!finding.required.empty(), false};
    case CompareReason::OfferedExtra:
        return {false, !finding.offered.empty()};
    case CompareReason::KindDiffers:
        return {!finding.required.empty(), !finding.offered.empty()};
    case CompareReason::OfferedEmpty:
    case CompareReason::RequiredEmpty:
        return {false, false};
    default:
        return {true, true};
    }
}

const char* Reason(CompareReason reason) {
    switch (reason) {
    case CompareReason::Missing:
        return "the offered description lacks this entry";
    case CompareReason::TextDiffers:
        return "the texts differ";
    case CompareReason::ValueMissing:
        return "the offered list lacks a required value";
    case CompareReason::LatencyTooLarge:
        return "the offered latency is larger than the required one";
    case CompareReason::KindDiffers:
        return "one side holds a text, a node or a link where the other holds another kind";
    case CompareReason::OfferedEmpty:
        return "the offered description is empty";
    case CompareReason::OfferedExtra:
        return "only the offered description holds this entry";
    case CompareReason::ListLengthDiffers:
        return "the offered list has a different number of values, every required one among them";
    case CompareReason::SmallerLatency:
        return "the offered latency is smaller than the required one";
    case CompareReason::RequiredEmpty:
        return "the required description is empty";
    }
    return "unknown reason";
}

void WriteFinding(const CompareFinding& finding, std::ostream& out) {
    out << "  "
        << (finding.path.empty() ? std::string("(the whole description)") : ToUtf8(finding.path))
        << ": " << Reason(finding.reason);
    if (finding.reason == CompareReason::ValueMissing)
        out << " " << Quoted(finding.piece);
    const Shown shown = TextsOf(finding);
    if (shown.required)
        out << "; required " << Quoted(finding.required);
    if (shown.offered)
        out << (shown.required ? ", offered " : "; offered ") << Quoted(finding.offered);
    out << "\n";
}

} // namespace

const char* AnswerText(uint32_t answer) {
    switch (answer) {
    case 0:
        return "match";
    case 2:
        return "tolerated difference";
    default:
        return "not satisfied";
    }
}

int AnswerStatus(uint32_t answer) {
    switch (answer) {
    case 0:
        return kExitOk;
    case 2:
        return kExitTolerated;
    default:
        return kExitFailed;
    }
}

void WriteExplanation(const wbhw::CompareExplanation& why, std::ostream& out) {
    // A shortfall stops the walk, so what was tolerated before it did not decide anything.
    if (const CompareFinding* shortfall = why.Shortfall()) {
        WriteFinding(*shortfall, out);
        return;
    }
    if (why.result != 2)
        return;
    for (const CompareFinding& finding : why.findings)
        WriteFinding(finding, out);
}

} // namespace wbhost::cli
