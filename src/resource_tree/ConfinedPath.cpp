// Confined file names: real paths compared piece by piece.
#include "resource_tree/ConfinedPath.h"

#include "resource_tree/LoaderText.h"

#include <cstdlib>
#include <memory>

namespace wbhw {
namespace {

// The real path of PATH (links, "." and ".." resolved); empty when it does not exist.
std::string RealPath(const std::string& path) {
    const std::unique_ptr<char, decltype(&std::free)> real(realpath(path.c_str(), nullptr),
                                                           &std::free);
    return real ? std::string(real.get()) : std::string();
}

bool IsInside(const std::string& directory, const std::string& path) {
    if (directory == "/")
        return true;
    return path.size() > directory.size() && path.compare(0, directory.size(), directory) == 0 &&
           path[directory.size()] == '/';
}

} // namespace

ConfinedFile ResolveConfined(const std::string& directory, std::string_view relative) {
    ConfinedFile found;
    const std::u16string shown = FromUtf8Lenient(relative);
    if (!relative.empty() && relative.front() == '/') {
        found.refusal = u"Absolute paths are not read; files are named relative to their "
                        u"directory: " +
                        shown;
        return found;
    }
    const std::string base = RealPath(directory.empty() ? std::string(".") : directory);
    const std::string real = RealPath(JoinFilePath(directory, std::string(relative)));
    if (base.empty() || real.empty())
        return found;
    if (!IsInside(base, real)) {
        found.refusal = u"The file lies outside the directory " + FromUtf8Lenient(base) +
                        u" and is not read: " + shown;
        return found;
    }
    found.path = real;
    return found;
}

} // namespace wbhw
