// Path texts. The long-path form follows the way Windows makes a path absolute: drive paths,
// drive-relative and root-relative paths, network shares, "." and "..".
#include "kern/Path.h"

#include "kern/exception/Exception.h"

#include <vector>

namespace qv::kern {
namespace {

constexpr std::u16string_view kLongPrefix = u"\\\\?\\";
constexpr std::u16string_view kDevicePrefix = u"\\\\.\\";

// A path split into its root ("X:" or "\\server\share") and the components below it.
struct WindowsPath {
    std::u16string root;
    std::u16string rest;
};

bool IsLetter(char16_t c) {
    return (c >= u'A' && c <= u'Z') || (c >= u'a' && c <= u'z');
}
bool HasDrive(std::u16string_view p) {
    return p.size() >= 2 && IsLetter(p[0]) && p[1] == u':';
}
bool IsUnc(std::u16string_view p) {
    return p.size() >= 2 && p[0] == u'\\' && p[1] == u'\\';
}

bool SameDrive(char16_t a, char16_t b) {
    return (a | 0x20) == (b | 0x20);
}

std::u16string ToBackslashes(std::u16string_view path) {
    std::u16string out(path);
    for (char16_t& c : out) {
        if (c == u'/')
            c = u'\\';
    }
    return out;
}

// Splits an absolute path; the root of a network path is "\\server\share".
bool SplitAbsolute(std::u16string_view p, WindowsPath& out) {
    if (HasDrive(p) && p.size() >= 3 && p[2] == u'\\') {
        out = {std::u16string(p.substr(0, 2)), std::u16string(p.substr(2))};
        return true;
    }
    if (!IsUnc(p))
        return false;
    size_t end = p.find(u'\\', 2);
    if (end != std::u16string_view::npos)
        end = p.find(u'\\', end + 1);
    if (end == std::u16string_view::npos)
        end = p.size();
    out = {std::u16string(p.substr(0, end)), std::u16string(p.substr(end))};
    return true;
}

// dir + "\" + name, appended piece by piece.
std::u16string Below(std::u16string dir, std::u16string_view name) {
    dir += u'\\';
    dir += name;
    return dir;
}

// Resolves the path against the current directory into root and rest.
WindowsPath MakeAbsolute(const std::u16string& p, const std::u16string& current) {
    WindowsPath result;
    if (SplitAbsolute(p, result))
        return result;
    WindowsPath base;
    if (!SplitAbsolute(current, base))
        QV_THROW(exception::InvalidArgument());
    if (HasDrive(p)) {
        // "X:name": relative to the current directory when it is on drive X, else to X's root.
        const std::u16string tail = p.substr(2);
        if (HasDrive(base.root) && SameDrive(base.root[0], p[0]))
            return tail.empty() ? base : WindowsPath{base.root, Below(base.rest, tail)};
        return {p.substr(0, 2), Below(std::u16string(), tail)};
    }
    if (!p.empty() && p[0] == u'\\')
        return {base.root, p};
    return {base.root, Below(base.rest, p)};
}

// Resolves "." and ".." and drops empty components; ".." at the root stays at the root.
std::u16string Normalise(const WindowsPath& path) {
    std::vector<std::u16string_view> parts;
    const std::u16string_view rest = path.rest;
    size_t start = 0;
    while (start <= rest.size()) {
        size_t end = rest.find(u'\\', start);
        if (end == std::u16string_view::npos)
            end = rest.size();
        const std::u16string_view part = rest.substr(start, end - start);
        if (part == u"..") {
            if (!parts.empty())
                parts.pop_back();
        } else if (!part.empty() && part != u".") {
            parts.push_back(part);
        }
        start = end + 1;
    }
    const bool trailing = !rest.empty() && rest.back() == u'\\';
    std::u16string out = path.root;
    const bool isDrive = HasDrive(path.root);
    if (parts.empty())
        return isDrive || trailing ? out + u"\\" : out;
    for (const std::u16string_view part : parts) {
        out += u'\\';
        out += part;
    }
    if (trailing)
        out += u'\\';
    return out;
}

} // namespace

std::string JoinPath(std::string_view dir, std::string_view name) {
    if (dir.empty() || (!name.empty() && name.front() == '/'))
        return std::string(name);
    std::string out(dir);
    if (name.empty())
        return out;
    if (out.back() != '/')
        out += '/';
    out += name;
    return out;
}

std::string AddTrailingSeparator(std::string_view path) {
    if (path.empty())
        QV_THROW(exception::InvalidArgument());
    std::string out(path);
    if (out.back() != '/')
        out += '/';
    return out;
}

std::u16string ToLongPathForm(std::u16string_view path, std::u16string_view currentDirectory) {
    if (path.substr(0, kLongPrefix.size()) == kLongPrefix)
        return std::u16string(path);
    if (path.empty())
        return std::u16string();
    const std::u16string p = ToBackslashes(path);
    // Device paths name no file; prefixing them would make a different, wrong path.
    if (p.substr(0, kDevicePrefix.size()) == kDevicePrefix ||
        p.substr(0, kLongPrefix.size()) == kLongPrefix)
        return p;
    const std::u16string full = Normalise(MakeAbsolute(p, ToBackslashes(currentDirectory)));
    if (full.empty())
        return full;
    if (full[0] == u'\\')
        return std::u16string(kLongPrefix) + u"UNC" + full.substr(1);
    return std::u16string(kLongPrefix) + full;
}

} // namespace qv::kern
