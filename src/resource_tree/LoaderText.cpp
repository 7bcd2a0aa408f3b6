// Text rules of the resource-tree loader: booleans, names ranges, variables, localized texts,
// platform paths and the UTF-8 form handed to Expat.
#include "resource_tree/LoaderText.h"

#include "host/HostFolder.h"
#include "resource_tree/ExPatHandler.h"
#include "resource_tree/ListText.h"

#include <array>
#include <unistd.h>

namespace wbhw {
namespace {

bool IsDigits(std::u16string_view text) noexcept {
    if (text.empty())
        return false;
    for (const char16_t c : text) {
        if (c < u'0' || c > u'9')
            return false;
    }
    return true;
}

// True when the "document-root" VALUE just put in ends in "/" and TEXT goes on, at AFTER, with
// the separator of a path below it.
bool IsRootPathJoin(std::u16string_view name, std::u16string_view value, std::u16string_view text,
                    size_t after) noexcept {
    return qv::kern::EqualsNoCase(name, u"document-root") && !value.empty() &&
           value.back() == u'/' && after < text.size() && text[after] == u'/';
}

// Decimal digits as a number; values beyond 64 bits stay at the largest value, which no range
// can reach anyway since expansion is capped.
uint64_t ParseDecimal(std::u16string_view digits) noexcept {
    uint64_t value = 0;
    for (const char16_t c : digits) {
        const uint64_t digit = static_cast<uint64_t>(c - u'0');
        if (value > (UINT64_MAX - digit) / 10)
            return UINT64_MAX;
        value = value * 10 + digit;
    }
    return value;
}

// A piece prefix[var=first..last]suffix, split into its parts.
struct Range {
    std::u16string_view prefix, variable, suffix;
    uint64_t first = 0, last = 0;
};

bool ParseRange(std::u16string_view piece, Range& range) {
    const size_t open = piece.find(u'[');
    if (open == std::u16string_view::npos)
        return false;
    const size_t equals = piece.find(u'=', open + 1);
    if (equals == std::u16string_view::npos)
        return false;
    const size_t dots = piece.find(u"..", equals + 1);
    if (dots == std::u16string_view::npos)
        return false;
    const size_t close = piece.find(u']', dots + 2);
    if (close == std::u16string_view::npos)
        return false;
    const std::u16string_view first = piece.substr(equals + 1, dots - equals - 1);
    const std::u16string_view last = piece.substr(dots + 2, close - dots - 2);
    if (!IsDigits(first) || !IsDigits(last))
        return false;
    range.prefix = piece.substr(0, open);
    range.variable = piece.substr(open + 1, equals - open - 1);
    range.suffix = piece.substr(close + 1);
    range.first = ParseDecimal(first);
    range.last = ParseDecimal(last);
    return true;
}

std::string DirectoryOf(const std::string& path) {
    const size_t slash = path.find_last_of('/');
    if (slash == std::string::npos)
        return ".";
    return slash == 0 ? std::string("/") : path.substr(0, slash);
}

std::string ExecutablePath() {
    std::array<char, 4096> buffer{};
    const ssize_t n = readlink("/proc/self/exe", buffer.data(), buffer.size() - 1);
    return n > 0 ? std::string(buffer.data(), static_cast<size_t>(n)) : std::string();
}

bool HasHostExecutable(const std::string& directory) {
    for (const char* name : {"Wirebench.exe", "wbre.exe", "wbde.exe"}) {
        if (access(JoinFilePath(directory, name).c_str(), F_OK) == 0)
            return true;
    }
    return false;
}

std::string FindHostDirectory() {
    const std::string exe = ExecutablePath();
    std::string directory = DirectoryOf(exe);
    if (exe.substr(exe.find_last_of('/') + 1) != "wbfpga_make_resource_cache") {
        // A host installed in one folder answers its executable's folder here; one whose shared
        // files live elsewhere (an embedded host told so on its command line) answers that.
        return qv::host::AskHostFolder().value_or(directory);
    }
    // The cache builder runs from a tool folder below the host; the host is the nearest
    // directory above it that holds one of the host executables.
    for (std::string at = directory;;) {
        if (HasHostExecutable(at))
            return at;
        if (at == "/" || at == ".")
            return directory;
        at = DirectoryOf(at);
    }
}

} // namespace

bool IsTrueWord(std::u16string_view text) noexcept {
    for (const std::u16string_view word : {u"true", u"yes", u"1", u"on", u"enable"}) {
        if (qv::kern::EqualsNoCase(text, word))
            return true;
    }
    return false;
}

std::vector<ExpandedName> ExpandNames(std::u16string_view value, size_t limit, bool& truncated,
                                      size_t maxUnits) {
    truncated = false;
    std::vector<ExpandedName> names;
    size_t units = 0;
    // A few bytes of "names" can ask for many long names; what is made is counted as it grows.
    const auto add = [&](ExpandedName&& made) {
        units += made.name.size() + made.variable.size();
        names.push_back(std::move(made));
        return units <= maxUnits;
    };
    for (const std::u16string& piece : SplitListText(value, u',', true)) {
        Range range;
        if (!ParseRange(piece, range)) {
            if (names.size() >= limit) {
                truncated = true;
                break;
            }
            if (!add({piece, {}, 0}))
                return names;
            continue;
        }
        for (uint64_t i = range.first; i <= range.last; ++i) {
            if (names.size() >= limit) {
                truncated = true;
                return names;
            }
            std::u16string name(range.prefix);
            name += DecimalText(i);
            name += range.suffix;
            if (!add({std::move(name), std::u16string(range.variable), i}))
                return names;
            if (i == UINT64_MAX)
                break;
        }
    }
    return names;
}

size_t TextUnits(const std::vector<ExpandedName>& names) noexcept {
    size_t units = 0;
    for (const ExpandedName& name : names)
        units += name.name.size() + name.variable.size();
    return units;
}

bool SubstituteVariables(std::u16string& text, const VariableMap& variables) {
    if (variables.empty() || text.find(u"#{") == std::u16string::npos)
        return false;
    std::u16string out;
    bool changed = false;
    size_t at = 0;
    for (;;) {
        const size_t open = text.find(u"#{", at);
        const size_t close = open == std::u16string::npos ? open : text.find(u'}', open + 2);
        if (close == std::u16string::npos) {
            out.append(text, at, std::u16string::npos);
            break;
        }
        const std::u16string_view name =
            TrimBlanks(std::u16string_view(text).substr(open + 2, close - open - 2));
        const auto found = variables.find(name);
        if (found != variables.end()) {
            out.append(text, at, open - at);
            out += found->second;
            changed = true;
        } else {
            out.append(text, at, close + 1 - at);
        }
        at = close + 1;
        // The document root's path is "/" when the document is the tree's root: followed by the
        // usual separator it would give "//a", whose empty piece resolves to nothing.
        if (found != variables.end() && IsRootPathJoin(found->first, found->second, text, at))
            ++at;
    }
    if (changed)
        text = std::move(out);
    return changed;
}

std::u16string LocalizeText(std::u16string_view value, std::u16string_view language) {
    const std::vector<std::u16string> entries = SplitListText(value, u',', true);
    auto choose = [&entries](std::u16string_view wanted) -> const std::u16string* {
        for (const std::u16string& entry : entries) {
            const size_t equals = entry.find(u'=');
            if (equals == std::u16string::npos)
                continue;
            if (qv::kern::EqualsNoCase(std::u16string_view(entry).substr(0, equals), wanted))
                return &entry;
        }
        return nullptr;
    };
    const std::u16string* chosen = choose(language);
    if (chosen == nullptr)
        chosen = choose(u"eng");
    if (chosen == nullptr)
        return std::u16string(value);
    std::u16string stored = chosen->substr(chosen->find(u'=') + 1);
    stored.push_back(u'\0');
    stored += value;
    return stored;
}

bool IsPlatformPathText(std::u16string_view text) noexcept {
    return text.find(u'\\') == std::u16string_view::npos &&
           text.find(u"//") == std::u16string_view::npos && (text.empty() || text.back() != u'/');
}

std::u16string PlatformPathText(std::u16string_view text) {
    // Most paths are already in the platform's form: no escapes, no empty pieces.
    if (IsPlatformPathText(text))
        return std::u16string(text);
    std::u16string out;
    // A leading separator keeps the path absolute; other empty pieces join to nothing.
    if (!text.empty() && text.front() == u'/')
        out.push_back(u'/');
    for (const std::u16string& piece : SplitListText(text, u'/', false)) {
        if (piece.empty())
            continue;
        if (!out.empty() && out.back() != u'/')
            out.push_back(u'/');
        out += piece;
    }
    return out;
}

std::string JoinFilePath(const std::string& base, const std::string& relative) {
    if (base.empty() || (!relative.empty() && relative.front() == '/'))
        return relative;
    if (relative.empty())
        return base;
    return base.back() == '/' ? base + relative : base + "/" + relative;
}

std::u16string DecimalText(uint64_t value) {
    std::u16string text;
    do {
        text.insert(text.begin(), static_cast<char16_t>(u'0' + value % 10));
        value /= 10;
    } while (value != 0);
    return text;
}

std::u16string FromUtf8Lenient(std::string_view bytes) {
    std::u16string out;
    AppendUtf8AsUtf16(bytes, out);
    return out;
}

const std::string& HostDirectory() {
    static const std::string directory = FindHostDirectory();
    return directory;
}

const std::string& DeferredDirectory() {
    static const std::string directory =
        qv::host::AskHostFolder().value_or(DirectoryOf(ExecutablePath()));
    return directory;
}

} // namespace wbhw
